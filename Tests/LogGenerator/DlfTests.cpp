#include "LogGenerator/Orbel/BuildDate.h"
#include "LogGenerator/Orbel/ETLDLF.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr ETLDLFTimeRecord someTime{0x01020304, -210, 1};

Bytes versionReport(const char* version, const char* executable, const char* date)
{
    Bytes buffer(161, 0xEE);
    std::size_t written = 0;
    ETLDLFAddVersionReport(buffer.data(), buffer.size(), &written, 1, 1, version, executable, date,
                           &someTime);
    return buffer;
}

std::string textIn(const Bytes& record, std::size_t offset, std::size_t width)
{
    const auto begin = record.begin() + static_cast<std::ptrdiff_t>(offset);
    return {begin, begin + static_cast<std::ptrdiff_t>(width)};
}

class DlfTest : public GeneratorFixture
{
  protected:
    void addPeriod(PlistValue displayState)
    {
        addEntry(PlistDictionary{{"DisplayState", std::move(displayState)}});
    }
    void addEntry(PlistDictionary entry)
    {
        if (!state.contains("History"))
            state.set("History", PlistArray());
        state.find("History")->array()->append(std::move(entry));
    }
    std::optional<Bytes> dlf() { return generator->generateDlfFromState(state); }
    PlistArray contents() { return *generator->getSaveContentsFromState(state).array(); }

    std::unique_ptr<LTELogGenerator> generator = LTELogGenerator::generator(services());
};

} // namespace

TEST(VersionReport, HasItsLengthCodeAndVersions)
{
    const Bytes record = versionReport("abc", "def", "ghi");
    EXPECT_EQ((Bytes{record.begin(), record.begin() + 20}),
              (Bytes{0xA1, 0x00, 0xFD, 0x1F, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 1, 0}));
}

TEST(VersionReport, LeavesOutWhatIsNull)
{
    Bytes buffer(161, 0xEE);
    EXPECT_EQ(ETLDLFAddVersionReport(buffer.data(), buffer.size(), nullptr, 1, 1, nullptr, nullptr,
                                     nullptr, nullptr),
              etlDLFSuccess);
    EXPECT_EQ(textIn(buffer, 20, 141), std::string(141, '\0'));
    std::size_t written = 7;
    EXPECT_EQ(ETLDLFAddVersionReport(nullptr, 161, &written, 1, 1, "a", "b", "c", &someTime),
              etlDLFBufferTooSmall);
    EXPECT_EQ(written, 0U);
    EXPECT_EQ(ETLDLFAddVersionReport(nullptr, 0, nullptr, 1, 1, "a", "b", "c", &someTime),
              etlDLFBufferTooSmall);
}

TEST(VersionReport, FillsShortTextsWithZeros)
{
    const Bytes record = versionReport("abc", "def", "ghi");
    EXPECT_EQ(textIn(record, 20, 7), std::string("abc\0\0\0\0", 7));
    EXPECT_EQ(textIn(record, 27, 16), "def" + std::string(13, '\0'));
    EXPECT_EQ(textIn(record, 67, 18), "ghi" + std::string(15, '\0'));
}

TEST(VersionReport, CutsLongTextsAndEndsThemWithNul)
{
    const Bytes record =
        versionReport("Ventrik 12.3", "EXECUTABLE_NAME_LONG", "Nov 28 2021 21:22:43");
    EXPECT_EQ(textIn(record, 20, 7), std::string("Ventri\0", 7));
    EXPECT_EQ(textIn(record, 27, 16), std::string("EXECUTABLE_NAME\0", 16));
    EXPECT_EQ(textIn(record, 67, 18), std::string("Nov 28 2021 21:22\0", 18));
}

TEST(VersionReport, WritesTheTimeRecord)
{
    const Bytes record = versionReport("", "", "");
    // 0x01020304 s; -210 minutes is 0xFF2E; daylight saving.
    EXPECT_EQ((Bytes{record.begin() + 85, record.begin() + 92}),
              (Bytes{0x04, 0x03, 0x02, 0x01, 0x2E, 0xFF, 0x01}));
}

TEST(VersionReport, ZeroesTheGapsAndTheRest)
{
    const Bytes record = versionReport("abc", "def", "ghi");
    const auto isZero = [](std::uint8_t byte) { return byte == 0; };
    EXPECT_TRUE(std::all_of(record.begin() + 43, record.begin() + 67, isZero));
    EXPECT_TRUE(std::all_of(record.begin() + 92, record.end(), isZero));
}

TEST(VersionReport, RefusesABufferBelow161Bytes)
{
    Bytes buffer(161, 0xEE);
    std::size_t written = 99;
    EXPECT_EQ(ETLDLFAddVersionReport(buffer.data(), 160, &written, 1, 1, "", "", "", &someTime), 3);
    EXPECT_EQ(written, 0U);
    EXPECT_EQ(buffer, Bytes(161, 0xEE));
}

TEST(VersionReport, TakesExactly161Bytes)
{
    Bytes buffer(161);
    std::size_t written = 0;
    EXPECT_EQ(ETLDLFAddVersionReport(buffer.data(), 161, &written, 1, 1, "", "", "", &someTime), 0);
    EXPECT_EQ(written, 161U);
}

TEST(BuildDate, IsMonthDayYearTime)
{
    EXPECT_THAT(buildDate(),
                testing::MatchesRegex("[A-Z][a-z][a-z] [0-9][0-9] [0-9]{4} [0-9:]{8}"));
}

TEST_F(DlfTest, WithoutHistoryItIsTheVersionReportAlone)
{
    EXPECT_EQ(dlf()->size(), 161U);
}

TEST_F(DlfTest, TheReportCarriesTheFixedTextsAndTheClock)
{
    platform.resources.setApplicationVersion("4.2");
    const Bytes record = *dlf();
    EXPECT_EQ(textIn(record, 20, 7), std::string("Ventri\0", 7));
    EXPECT_EQ(textIn(record, 27, 16), std::string("EXECUTABLE_NAME\0", 16));
    // 1794809428 is 0x6AFA9E54.
    EXPECT_EQ((Bytes{record.begin() + 85, record.begin() + 89}), (Bytes{0x54, 0x9E, 0xFA, 0x6A}));
    EXPECT_EQ((Bytes{record.begin() + 16, record.begin() + 20}), (Bytes{1, 0, 1, 0}));
    EXPECT_EQ(textIn(record, 67, 18), std::string(buildDate(), 17) + '\0');
}

TEST_F(DlfTest, TheSecondsOfTheReportAreWholeOnesThatHavePassed)
{
    platform.clock.advance(std::chrono::milliseconds(999));
    EXPECT_EQ(dlf()->at(85), 0x54);
}

TEST_F(DlfTest, WithoutAVersionTheTextIsNone)
{
    platform.resources.setApplicationVersion(std::nullopt);
    EXPECT_EQ(textIn(*dlf(), 20, 7), std::string("(none)\0", 7));
}

TEST_F(DlfTest, WritesZonesWestAndEast)
{
    platform.clock.setTimeZone({-12600, false}); // UTC-03:30: -210 minutes, 0xFF2E
    EXPECT_EQ(dlf()->at(89), 0x2E);
    EXPECT_EQ(dlf()->at(90), 0xFF);
    EXPECT_EQ(dlf()->at(91), 0);
    platform.clock.setTimeZone({20700, true}); // UTC+05:45: 345 minutes, 0x0159
    EXPECT_EQ(dlf()->at(89), 0x59);
    EXPECT_EQ(dlf()->at(90), 0x01);
    EXPECT_EQ(dlf()->at(91), 1);
}

TEST_F(DlfTest, TruncatesOddZoneSecondsTowardZero)
{
    platform.clock.setTimeZone({-119, false});
    EXPECT_EQ(dlf()->at(89), 0xFF); // -1 minute
    EXPECT_EQ(dlf()->at(90), 0xFF);
}

TEST_F(DlfTest, APeriodLosesItsFirstByte)
{
    Bytes packet(40, 7);
    packet[1] = 9;
    addPeriod(packet);
    ASSERT_EQ(dlf()->size(), 161U + 39U);
    EXPECT_EQ(dlf()->at(161), 9);
}

TEST_F(DlfTest, OnlyTheFirstByteOfAPeriodIsDropped)
{
    addPeriod(Bytes{1, 10, 11, 1, 20, 21});
    addPeriod(Bytes{0x81, 0, 1, 30});
    const Bytes bytes = *dlf();
    EXPECT_EQ((Bytes{bytes.begin() + 161, bytes.end()}), (Bytes{10, 11, 1, 20, 21, 0, 1, 30}));
}

TEST_F(DlfTest, APeriodOfOneByteOrNoneAddsNothing)
{
    addPeriod(Bytes{1});
    addPeriod(Bytes{});
    EXPECT_EQ(dlf()->size(), 161U);
}

TEST_F(DlfTest, AnEntryWithoutDisplayStateIsSkipped)
{
    addEntry({});
    addPeriod(Bytes{1, 2});
    EXPECT_EQ(dlf()->size(), 162U);
}

TEST_F(DlfTest, AWronglyTypedDisplayStateAbortsTheFile)
{
    addPeriod(Bytes{1, 2});
    addPeriod("text");
    EXPECT_FALSE(dlf());
    EXPECT_THAT(platform.log.texts(16),
                testing::ElementsAre(
                    "Got wrong class writing history to DLF; aborting writing the DLF file"));
}

TEST_F(DlfTest, SaveContentsOfNoHistoryHoldOnlyTheDlf)
{
    const PlistArray entries = contents();
    ASSERT_EQ(entries.size(), 1U);
    EXPECT_EQ(textAt(entries[0], {"Description"}), "DLF binary (161 bytes)");
    EXPECT_EQ(entries[0].dictionary()->find("DLF")->data()->size(), 161U);
}

TEST_F(DlfTest, SaveContentsAreTheHistoryAndThenTheDlf)
{
    addPeriod(Bytes{1, 2});
    const PlistArray entries = contents();
    ASSERT_EQ(entries.size(), 2U);
    EXPECT_EQ(entries[0], state.find("History")->array()->operator[](0));
    EXPECT_EQ(textAt(entries[1], {"Description"}), "DLF binary (162 bytes)");
}

TEST_F(DlfTest, SaveContentsDoNotShareTheHistoryArray)
{
    addPeriod(Bytes{1, 2});
    const PlistArray entries = contents();
    addPeriod(Bytes{3, 4});
    EXPECT_EQ(entries.size(), 2U);
}

TEST_F(DlfTest, WithoutADlfTheSaveContentsAreTheHistory)
{
    addPeriod("text");
    EXPECT_EQ(contents().size(), 1U);
}

} // namespace ventrik
