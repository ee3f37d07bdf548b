#include "Capture/SnapshotContainer.h"
#include "Capture/SnapshotFile.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/Capture/ContainerReading.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

Bytes packet(std::uint8_t type, const Bytes& record)
{
    return ByteRow().number(1, type).bytes(record);
}

const Bytes first = packet(1, logRecord(0xB193, stampIn2025(), {1, 2, 3}));
const Bytes second = packet(255, logRecord(1, stampIn2025(1), Bytes(30, 5)));
const Bytes prefixed = joined({{0x81, 7}, packet(1, logRecord(0xB0C0, stampIn2025(2), {}))});
const Bytes untold = packet(1, logRecord(0xB0C0, UINT64_MAX, {6}));

PlistDictionary period(const PlistValue& displayState,
                       const std::string& date = "2026-11-16 06:10:28 +0000")
{
    return {{"DisplayState", displayState}, {"Display", PlistArray()}, {"Date", date}};
}

Bytes snapshot(const PlistArray& entries)
{
    return propertyListBytes(makeSnapshot("t", entries, "drive")).value();
}

ContainerReading read(const Bytes& bytes)
{
    return readAll<SnapshotContainer>(bytes);
}

ContainerReading readPeriod(const Bytes& packets)
{
    return read(snapshot(PlistArray{period(packets)}));
}

Clock::TimePoint secondsSince1970(std::int64_t seconds)
{
    return Clock::TimePoint(std::chrono::seconds(seconds));
}

// The time of an untellable packet in an entry of that date.
Clock::TimePoint timeOfPacketFrom(const std::string& date)
{
    const auto reading = read(snapshot(PlistArray{period(untold, date)}));
    return reading.messages.at(0).time;
}

Bytes longPacket()
{
    Bytes payload{'b', 'p', 'l', 'i', 's', 't', '0', '0'};
    payload.resize(140000, 0x44);
    return packet(1, logRecord(0x1234, stampIn2025(), payload));
}

Bytes mixedSnapshot()
{
    return snapshot(PlistArray{
        period(joined({first, second, prefixed})), period(joined({prefixed, Bytes(40, 0xEE)})),
        PlistDictionary{{"Description", "DLF binary (2 bytes)"}, {"DLF", Bytes{0, 255}}}, "x",
        period(joined({untold, first}))});
}

} // namespace

TEST(SnapshotContainer, GivesThePacketsOfAllPeriodsWithTheirTypesAndPrefixes)
{
    const auto reading = read(snapshot(
        PlistArray{period(joined({first, second, prefixed})), period(joined({prefixed, first}))}));
    EXPECT_THAT(reading.packets(), ElementsAre(first, second, prefixed, prefixed, first));
    EXPECT_EQ(reading.error, "");
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SnapshotContainer, ReadsWhatTheWriterOfSnapshotsWrites)
{
    const auto text = writeXmlPropertyListReplacing(
        makeSnapshot("t", PlistArray{period(joined({first, second}))}, "drive"));
    EXPECT_THAT(read(Bytes(text.text->begin(), text.text->end())).packets(),
                ElementsAre(first, second));
}

TEST(SnapshotContainer, TimesAPacketByItsTimestamp)
{
    const auto reading = readPeriod(joined({first, second}));
    ASSERT_EQ(reading.messages.size(), 2U);
    EXPECT_EQ(reading.messages[1].time, timeAt(stampIn2025(1)));
}

TEST(SnapshotContainer, TimesAPacketWithoutATellableTimestampByTheEntrysDate)
{
    EXPECT_EQ(timeOfPacketFrom("2026-11-16 06:10:28 +0000"), secondsSince1970(1794809428));
}

TEST(SnapshotContainer, ReadsADateWithItsOffset)
{
    EXPECT_EQ(timeOfPacketFrom("2026-11-16 08:40:28 +0230"), secondsSince1970(1794809428));
    EXPECT_EQ(timeOfPacketFrom("2026-11-16 05:10:28 -0100"), secondsSince1970(1794809428));
}

TEST(SnapshotContainer, TakesNoTimeFromWhatIsNoDate)
{
    for (const char* date :
         {"", "2026-02-30 06:10:28 +0000", "2026-11-16 06:10:28", "2026-11-16 06:10:28 *0000",
          "2026-11-16 06:1x:28 +0000", "9999-11-16 06:10:28 +0000", "2026-11-16 06:10:28 +00000"})
        EXPECT_EQ(timeOfPacketFrom(date), Clock::TimePoint()) << date;
}

TEST(SnapshotContainer, TimesAPacketOfAnEntryWithoutADateByTheLastPacket)
{
    const auto reading =
        read(snapshot(PlistArray{period(first), PlistDictionary{{"DisplayState", untold}}}));
    EXPECT_THAT(reading.packets(), ElementsAre(first, untold));
    EXPECT_EQ(reading.messages.at(1).time, timeAt(stampIn2025()));
}

TEST(SnapshotContainer, TakesPacketsWithoutATellableTimestampWhereTheyFit)
{
    const auto reading = readPeriod(joined({untold, first, untold, untold}));
    EXPECT_THAT(reading.packets(), ElementsAre(untold, first, untold, untold));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SnapshotContainer, GivesTheCellMonitorsMessage)
{
    const PlistDictionary message{{"Cell", "7"}};
    const auto reading = read(snapshot(PlistArray{period(message), period(message)}));
    ASSERT_EQ(reading.messages.size(), 2U);
    EXPECT_EQ(readPropertyList(reading.messages[0].data).value, PlistValue(message));
    EXPECT_EQ(reading.messages[0].time, secondsSince1970(1794809428));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SnapshotContainer, GivesTheCellMonitorsMessageThatWasKeptAsBytes)
{
    const Bytes message = propertyListBytes(PlistDictionary{{"Cell", "7"}}).value();
    EXPECT_THAT(readPeriod(message).packets(), ElementsAre(message));
}

TEST(SnapshotContainer, TakesNoNoticeOfTheLogThatRepeatsThePackets)
{
    const auto reading =
        read(snapshot(PlistArray{period(first), PlistDictionary{{"DLF", Bytes{1, 2}}}}));
    EXPECT_THAT(reading.packets(), ElementsAre(first));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SnapshotContainer, CountsEntriesThatCannotBeRead)
{
    const auto reading = read(snapshot(PlistArray{"x", period(first), 7}));
    EXPECT_THAT(reading.packets(), ElementsAre(first));
    EXPECT_THAT(reading.notes, ElementsAre("x: entries of the history that cannot be read: 2"));
}

TEST(SnapshotContainer, GoesOnAtTheNextPlausiblePacketBehindGarbage)
{
    const auto reading =
        read(snapshot(PlistArray{period(first), period(joined({first, Bytes(40, 0xEE), second}))}));
    EXPECT_THAT(reading.packets(), ElementsAre(first, first, second));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 40 bytes that are no record, in 1 place, the first at offset " +
                            std::to_string(2 * first.size())));
}

TEST(SnapshotContainer, FindsAPacketWithItsPrefixBehindGarbage)
{
    EXPECT_THAT(readPeriod(joined({first, Bytes(40, 0xEE), prefixed, second})).packets(),
                ElementsAre(first, prefixed, second));
}

TEST(SnapshotContainer, ReadsAPropertyListThatIsLongerThanItsLengthSays)
{
    const auto reading = readPeriod(joined({first, longPacket(), prefixed}));
    EXPECT_THAT(reading.packets(), ElementsAre(first, longPacket(), prefixed));
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SnapshotContainer, GivesAPacketThatIsShorterThanItSaysAndCountsIt)
{
    const Bytes shorter(second.begin(), second.end() - 1);
    const auto reading =
        read(snapshot(PlistArray{period(joined({first, shorter})), period(first)}));
    EXPECT_THAT(reading.packets(), ElementsAre(first, shorter, first));
    EXPECT_THAT(reading.notes, ElementsAre("x: 1 packet cut short, the first at offset " +
                                           std::to_string(first.size())));
}

TEST(SnapshotContainer, CountsTheBytesOfAHeadThatIsNotWhole)
{
    const auto reading = readPeriod(joined({first, {1, 2, 3}}));
    EXPECT_THAT(reading.packets(), ElementsAre(first));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 3 bytes that are no record, in 1 place, the first at offset " +
                            std::to_string(first.size())));
}

TEST(SnapshotContainer, EndsWithAnErrorWhenItIsNoPropertyList)
{
    const Bytes text{'<', '?', 'x', 'm', 'l', ' '};
    const auto reading = read(text);
    EXPECT_THAT(reading.messages, IsEmpty());
    EXPECT_EQ(reading.error, "x: " + readPropertyList(text).error);
}

TEST(SnapshotContainer, EndsWithAnErrorWhenItIsNoSnapshot)
{
    for (const PlistValue& value : {PlistValue(PlistArray()), PlistValue(PlistDictionary()),
                                    PlistValue(PlistDictionary{{"Data", "x"}})}) {
        const auto reading = read(propertyListBytes(value).value());
        EXPECT_THAT(reading.messages, IsEmpty());
        EXPECT_EQ(reading.error, "x: no snapshot: it holds no array \"Data\"");
    }
}

TEST(SnapshotContainer, EndsWithAnErrorAboveItsLargestSize)
{
    const auto endless = [](std::span<std::uint8_t> room, std::string&) {
        std::ranges::fill(room, std::uint8_t{'<'});
        return room.size();
    };
    SnapshotContainer container(std::make_unique<ByteSource>(endless), "x");
    EXPECT_FALSE(container.next());
    EXPECT_EQ(container.error(), "x: offset 268435456: a snapshot may hold 256 MiB");
}

TEST(SnapshotContainer, TellsWhyTheBytesEndBeforeTheirTime)
{
    const auto fail = [](std::span<std::uint8_t>, std::string& error) {
        error = "x: damaged";
        return std::size_t{0};
    };
    SnapshotContainer container(std::make_unique<ByteSource>(fail), "x");
    EXPECT_FALSE(container.next());
    EXPECT_EQ(container.error(), "x: damaged");
}

TEST(SnapshotContainer, ReadsTheSameInBlocksOfAnySize)
{
    EXPECT_EQ(read(mixedSnapshot()).messages.size(), 6U);
    EXPECT_EQ(read(mixedSnapshot()).notes.size(), 2U);
    expectTheSameInBlocks<SnapshotContainer>(mixedSnapshot());
}

TEST(SnapshotContainer, GivesTheFirstMessagesWhereverItIsCut)
{
    expectPrefixesOfMessages<SnapshotContainer>(mixedSnapshot());
}

TEST(SnapshotContainer, RandomBytesAreHarmless)
{
    expectRandomBytesHarmless<SnapshotContainer>(mixedSnapshot());
    for (unsigned seed = 1; seed <= 100; ++seed) {
        const Bytes noise = randomBytes(seed, 20 * seed);
        EXPECT_LE(readPeriod(joined({first, noise, second})).messages.size(), noise.size());
    }
}

TEST(SnapshotContainer, IsToldByThePropertyListsBeginning)
{
    for (const std::string text : {"<?xml version", "<plist>", "bplist00\x01"})
        EXPECT_TRUE(SnapshotContainer::isIn(Bytes(text.begin(), text.end()))) << text;
    for (const std::string text : {"", "<?xm", "<html>", "bplist15", " <?xml"})
        EXPECT_FALSE(SnapshotContainer::isIn(Bytes(text.begin(), text.end()))) << text;
}

} // namespace ventrik
