#include "Capture/DlfFile.h"
#include "Tests/Capture/ContainerReading.h"

namespace ventrik
{

namespace
{

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

const Bytes versionReport = logRecord(0x1FFD, 0, Bytes(149, 1));
const Bytes first = logRecord(0xB193, stampIn2025(), {1, 2, 3});
const Bytes second = logRecord(0xB17F, stampIn2025(1), Bytes(30, 5));
const Bytes third = logRecord(0xB0C0, stampIn2025(2), {});

Bytes packetOf(const Bytes& record, std::uint8_t type = 1)
{
    return ByteRow().number(1, type).bytes(record);
}

Bytes prefixed(const Bytes& packet)
{
    return joined({{0x81, 7}, packet});
}

ContainerReading read(const Bytes& bytes)
{
    return readAll<DlfFile>(bytes);
}

// A property list that no length of 16 bits can tell.
Bytes longRecord()
{
    const std::string begin = "<?xml version=\"1.0\"?>";
    Bytes payload(begin.begin(), begin.end());
    payload.resize(150000, 'x');
    return logRecord(0x1234, stampIn2025(1), payload);
}

Bytes mixedFile()
{
    return joined({versionReport, first, packetOf(second, 255), prefixed(packetOf(third)),
                   Bytes(50, 0xEE), first, second, versionReport, third});
}

std::string at(std::size_t offset)
{
    return ", the first at offset " + std::to_string(offset);
}

} // namespace

TEST(DlfFile, GivesItsRecordsAsPacketsOfTypeOne)
{
    const auto reading = read(joined({first, second, third}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third)));
    EXPECT_EQ(reading.error, "");
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(DlfFile, TimesAPacketByItsTimestamp)
{
    const auto reading = read(joined({first, second}));
    ASSERT_EQ(reading.messages.size(), 2U);
    EXPECT_EQ(reading.messages[1].time, timeAt(stampIn2025(1)));
}

TEST(DlfFile, SkipsVersionReports)
{
    const auto reading = read(joined({versionReport, first, versionReport, second}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second)));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(DlfFile, TakesAVersionReportForARecordWhateverItsTime)
{
    const auto reading = read(joined({first, third, versionReport, Bytes(40, 0xEE)}));
    EXPECT_THAT(reading.notes, ElementsAre("x: 40 bytes that are no record, in 1 place" +
                                           at(first.size() + third.size() + versionReport.size())));
}

TEST(DlfFile, HoldsNothingWithAVersionReportAlone)
{
    const auto reading = read(versionReport);
    EXPECT_EQ(reading, ContainerReading());
}

TEST(DlfFile, ReadsPacketsThatKeptTheirTypeByte)
{
    const auto reading =
        read(joined({versionReport, first, packetOf(second), packetOf(third, 255), first}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second),
                                               packetOf(third, 255), packetOf(first)));
    EXPECT_EQ(reading.error, "");
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 2 records behind a type byte" + at(161 + first.size())));
}

TEST(DlfFile, ReadsPacketsThatKeptTheirTransportPrefix)
{
    const auto reading = read(joined({first, prefixed(packetOf(second)), third}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third)));
    EXPECT_THAT(reading.notes, ElementsAre("x: 1 record behind a type byte" + at(first.size())));
}

TEST(DlfFile, ReadsAPeriodWhosePrefixLostItsFirstByte)
{
    const auto reading = read(joined({first, {7}, packetOf(second), third}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third)));
    EXPECT_THAT(reading.notes, ElementsAre("x: 1 record behind a type byte" + at(first.size())));
}

// The times of the first days after the phone's epoch are plausible with a byte more in front.
TEST(DlfFile, TellsATypeByteFromALengthByWhatFollows)
{
    const Bytes early = logRecord(0xB193, 5, Bytes(300, 0));
    const Bytes next = logRecord(0xB193, 7, {3, 4});
    const auto reading =
        read(joined({early, packetOf(early, 255), packetOf(next, 255), packetOf(early)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(early), packetOf(early, 255),
                                               packetOf(next, 255), packetOf(early)));
}

TEST(DlfFile, ReadsAPropertyListThatIsLongerThanItsLengthSays)
{
    const Bytes large = longRecord();
    const auto reading = read(joined({first, large, packetOf(large), second}));
    EXPECT_THAT(reading.packets(),
                ElementsAre(packetOf(first), packetOf(large), packetOf(large), packetOf(second)));
    EXPECT_EQ(reading.error, "");
}

TEST(DlfFile, ReadsALongPropertyListAtItsEnd)
{
    EXPECT_THAT(read(joined({first, longRecord()})).packets(),
                ElementsAre(packetOf(first), packetOf(longRecord())));
}

TEST(DlfFile, EndsWithAnErrorInALongPropertyListThatIsCut)
{
    Bytes cut = joined({first, longRecord()});
    cut.pop_back();
    const auto reading = read(cut);
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first)));
    EXPECT_EQ(reading.error, "x: offset 15: truncated: a record is not whole");
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(DlfFile, SkipsGarbageToTheNextPlausibleRecord)
{
    const auto reading =
        read(joined({first, Bytes(40, 0xEE), second, third, Bytes(20, 0), second, first}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third),
                                               packetOf(second), packetOf(first)));
    EXPECT_EQ(reading.error, "");
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 60 bytes that are no record, in 2 places" + at(first.size())));
}

TEST(DlfFile, SkipsGarbageOfMoreThanOneBlock)
{
    const auto reading = read(joined({first, Bytes(700000, 0xEE), second, third}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 700000 bytes that are no record, in 1 place" + at(first.size())));
}

TEST(DlfFile, CountsGarbageAtItsEnd)
{
    const auto reading = read(joined({first, Bytes(40, 0xEE)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 40 bytes that are no record, in 1 place" + at(first.size())));
}

TEST(DlfFile, FindsThePacketBehindGarbageWithItsType)
{
    const auto reading = read(joined({first, Bytes(40, 0xEE), packetOf(second, 255), third}));
    EXPECT_THAT(reading.packets(),
                ElementsAre(packetOf(first), packetOf(second, 255), packetOf(third)));
}

TEST(DlfFile, SkipsARecordWhoseLengthIsDamagedButNotTheNext)
{
    const Bytes damaged = logRecord(0xB193, stampIn2025(), Bytes(20, 9), 70);
    const auto reading = read(joined({first, damaged, second, third, first, second}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first), packetOf(second), packetOf(third),
                                               packetOf(first), packetOf(second)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 32 bytes that are no record, in 1 place" + at(first.size())));
}

TEST(DlfFile, SkipsRecordsThatAreNotPlausible)
{
    const std::vector<Bytes> implausible{
        logRecord(0, stampIn2025(), {1}),
        logRecord(0xB193, stampIn2025(), {}, 11),
        logRecord(0xB193, UINT64_MAX, {1}),
        logRecord(0xB193, stampIn2025(std::uint64_t{11} * 366 * 86400), {1}),
        logRecord(0xB193, timestampOf(std::uint64_t{34} * 366 * 86400), {1}),
    };
    for (const Bytes& record : implausible) {
        const auto reading = read(joined({first, record, second, third}));
        EXPECT_THAT(reading.packets(),
                    ElementsAre(packetOf(first), packetOf(second), packetOf(third)));
        EXPECT_THAT(reading.notes, Contains(HasSubstr("that are no record")));
    }
}

TEST(DlfFile, TakesATimeOfYearsLater)
{
    const Bytes later = logRecord(0xB193, stampIn2025(std::uint64_t{9} * 366 * 86400), {1});
    EXPECT_THAT(read(joined({first, later, second})).packets(),
                ElementsAre(packetOf(first), packetOf(later), packetOf(second)));
}

TEST(DlfFile, FollowsAClockThatIsSetByManyYears)
{
    const Bytes early = logRecord(0xB193, timestampOf(5), {1});
    const auto reading = read(joined({early, early, first, second, third, first}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(early), packetOf(early), packetOf(first),
                                               packetOf(second), packetOf(third), packetOf(first)));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(DlfFile, IsNotLedAstrayByAFirstRecordOfAnotherTime)
{
    const Bytes stray = logRecord(0xB193, timestampOf(5), {3});
    const auto reading = read(joined({stray, first, Bytes(40, 0xEE), second, third}));
    EXPECT_THAT(reading.packets(),
                ElementsAre(packetOf(stray), packetOf(first), packetOf(second), packetOf(third)));
}

TEST(DlfFile, EndsWithAnErrorInARecordThatIsNotWhole)
{
    Bytes cut = joined({first, second});
    cut.pop_back();
    const auto reading = read(cut);
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first)));
    EXPECT_EQ(reading.error, "x: offset 15: truncated: a record is not whole");
}

TEST(DlfFile, EndsWithAnErrorInAHeadThatIsNotWhole)
{
    Bytes cut = joined({first, packetOf(second)});
    cut.resize(first.size() + 5);
    const auto reading = read(cut);
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(first)));
    EXPECT_EQ(reading.error, "x: offset 15: truncated: a record's head is not whole");
}

TEST(DlfFile, TellsWhyTheBytesEndBeforeTheirTime)
{
    const auto fail = [](std::span<std::uint8_t>, std::string& error) {
        error = "x: damaged";
        return std::size_t{0};
    };
    DlfFile file(std::make_unique<ByteSource>(fail), "x");
    EXPECT_FALSE(file.next());
    EXPECT_EQ(file.error(), "x: damaged");
}

TEST(DlfFile, ReadsTheSameInBlocksOfAnySize)
{
    EXPECT_EQ(read(mixedFile()).messages.size(), 6U);
    expectTheSameInBlocks<DlfFile>(mixedFile());
    expectTheSameInBlocks<DlfFile>(joined({first, longRecord(), second}));
}

TEST(DlfFile, GivesTheFirstMessagesWhereverItIsCut)
{
    expectPrefixesOfMessages<DlfFile>(mixedFile());
}

TEST(DlfFile, RandomBytesAreHarmless)
{
    expectRandomBytesHarmless<DlfFile>(mixedFile());
}

TEST(DlfFile, IsToldByAPlausibleRecordAtItsStart)
{
    EXPECT_TRUE(DlfFile::isIn(first));
    EXPECT_TRUE(DlfFile::isIn(versionReport));
    EXPECT_TRUE(DlfFile::isIn(joined({versionReport, first})));
    EXPECT_TRUE(DlfFile::isIn(joined({first, packetOf(second)})));
    EXPECT_TRUE(DlfFile::isIn(joined({first, prefixed(packetOf(second))})));
    EXPECT_TRUE(DlfFile::isIn(joined({first, {1, 2}})));
}

TEST(DlfFile, IsNotToldByAnythingElse)
{
    EXPECT_FALSE(DlfFile::isIn({}));
    EXPECT_FALSE(DlfFile::isIn(Bytes(100, 0)));
    EXPECT_FALSE(DlfFile::isIn(Bytes(first.begin(), first.end() - 1)));
    EXPECT_FALSE(DlfFile::isIn(joined({first, Bytes(40, 0xEE)})));
    EXPECT_FALSE(DlfFile::isIn(joined({{9}, first})));
}

} // namespace ventrik
