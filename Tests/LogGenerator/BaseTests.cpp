#include "LogGenerator/Orbel/Base.h"
#include "Packets/ShownNumbers.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ArrayLockHolder.h"

namespace ventrik
{

namespace
{

constexpr std::array<Field, 2> levelFields{{{"RSSI", i8(13), wholeDbm()}, {"Quality", u8(14)}}};
constexpr std::array<Field, 1> otherFields{{{"RSSI", u8(13)}}};
constexpr Record levels{0xD0E0, "Levels", 15, {levelFields}, {}, u8(15)};
constexpr Record others{0xFF0001, "Others", 14, {otherFields}};

constexpr SectionTable cellsTable{
    .name = "Cells",
    .records = {{{&levels, levelFields},
                 {.record = &others, .fields = otherFields, .superseded = "Quality"}}},
};
constexpr SectionTable secondTable{.name = "Second", .records = {{{&others, otherFields}}}};
constexpr SectionTable twiceTable{.name = "Twice", .records = {{{&levels}, {&levels}}}};
constexpr SectionTable oddTable{.name = "Rate {} %d"};
constexpr SectionTable quietTable{
    .name = "Quiet", .records = {{{&levels}}}, .unknownCode = UnknownCode::Ignored};
constexpr SectionTable anySizeTable{
    .name = "Any size", .records = {{{&levels, levelFields}}}, .decodesShortRecords = true};

using CellsSection = TableSection<cellsTable>;

class BaseTest : public testing::Test
{
  protected:
    void feed(const PacketBuilder& builder)
    {
        const Bytes packet = builder.build();
        section.updateWithData(LogPacket(packet), effectiveLogCode(LogPacket(packet)));
    }
    static PacketBuilder levelsOf(std::uint8_t rssi, std::uint8_t quality)
    {
        return PacketBuilder(0xD0E0).u8(13, rssi).u8(14, quality);
    }

    CapturingSystemLog log;
    ClassDictionary classDictionary;
    CodeDictionary codeDictionary;
    CellsSection section{log};
};

struct EcnoRow {
    std::uint32_t from;
    std::uint32_t to;
    std::int16_t result;
};

constexpr EcnoRow ecnoRows[] = {
    {524288, 4294967295, 0}, {417648, 524287, -1}, {331809, 417647, -2}, {263625, 331808, -3},
    {209464, 263624, -4},    {166442, 209463, -5}, {132269, 166441, -6}, {105124, 132268, -7},
    {83563, 105123, -8},     {66436, 83562, -9},   {52831, 66435, -10},  {42024, 52830, -11},
    {33441, 42023, -12},     {26622, 33440, -13},  {21206, 26621, -14},  {16904, 21205, -15},
    {13487, 16903, -16},     {10772, 13486, -17},  {8616, 10771, -18},   {6903, 8615, -19},
    {5543, 6902, -20},       {4462, 5542, -21},    {3604, 4461, -22},    {2922, 3603, -23},
    {2241, 2921, -24},       {1950, 2240, -25},    {1608, 1949, -26},    {1337, 1607, -27},
    {1121, 1336, -28},       {950, 1120, -29},     {814, 949, -30},      {757, 813, -31},
    {706, 756, -31},         {0, 705, 0},
};

} // namespace

TEST_F(BaseTest, RegistersUnderItsNameAndItsCodes)
{
    section.initWithDict(classDictionary, codeDictionary);
    EXPECT_EQ(classDictionary.at("Cells"), &section);
    EXPECT_THAT(codeDictionary.keys(), testing::ElementsAre("53472", "16711681"));
    EXPECT_THAT(*codeDictionary.subscribers(0xD0E0), testing::ElementsAre(&section));
}

TEST_F(BaseTest, RegistrationLogsTheNumberOfCodes)
{
    section.updateLogCodeDict(codeDictionary);
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{4, "Array Count: 2"}));
}

TEST_F(BaseTest, SectionsThatShareACodeAreKeptInOrder)
{
    TableSection<secondTable> second(log);
    section.initWithDict(classDictionary, codeDictionary);
    second.initWithDict(classDictionary, codeDictionary);
    EXPECT_THAT(*codeDictionary.subscribers(0xFF0001), testing::ElementsAre(&section, &second));
}

TEST_F(BaseTest, ACodeListedTwiceIsRegisteredTwice)
{
    TableSection<twiceTable> twice(log);
    twice.updateLogCodeDict(codeDictionary);
    EXPECT_EQ(codeDictionary.subscribers(0xD0E0)->size(), 2U);
    EXPECT_THAT(codeDictionary.keys(), testing::ElementsAre("53472"));
}

TEST_F(BaseTest, BindingLogsTheSectionNameAsItStands)
{
    TableSection<oddTable> odd(log);
    odd.updateSectionRef(PlistDictionary());
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{4, "Rate {} %d"}));
}

TEST_F(BaseTest, WritesGoNowhereBeforeBinding)
{
    feed(levelsOf(0xBA, 1));
    EXPECT_THAT(log.texts(), testing::ElementsAre("Cells"));
}

TEST_F(BaseTest, ShowsTheFieldsOfARecordInTheBoundDictionary)
{
    PlistDictionary values{{"RSSI", "-"}};
    section.updateSectionRef(values);
    feed(levelsOf(0xBA, 3)); // -70
    EXPECT_EQ(textAt(values, {"RSSI"}), "-70 dBm");
    EXPECT_EQ(textAt(values, {"Quality"}), "3");
}

TEST_F(BaseTest, ARecordWithdrawsTheKeyThatItSupersedes)
{
    PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(0xBA, 3));
    feed(PacketBuilder(0xFF0001).u8(13, 5));
    EXPECT_EQ(values, (PlistDictionary{{"RSSI", "5"}}));
    feed(levelsOf(0xBA, 3));
    EXPECT_EQ(values, (PlistDictionary{{"RSSI", "-70 dBm"}, {"Quality", "3"}}));
}

TEST_F(BaseTest, AShortRecordChangesNothing)
{
    PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(0xBA, 3).size(14));
    EXPECT_TRUE(values.empty());
}

TEST_F(BaseTest, ASectionThatDecodesShortRecordsReadsMissingBytesAsZero)
{
    PlistDictionary values;
    TableSection<anySizeTable> anySize(log);
    anySize.updateSectionRef(values);
    const Bytes packet = PacketBuilder(0xD0E0).u8(13, 7).build();
    anySize.updateWithData(LogPacket(packet), 0xD0E0);
    EXPECT_EQ(values, (PlistDictionary{{"RSSI", "7 dBm"}, {"Quality", "0"}}));
}

// Whoever changes the display behind the section's back sees what it stores.
TEST_F(BaseTest, AnUnchangedNumberIsNotStoredAgain)
{
    PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(1, 3));
    values.set("RSSI", "mine");
    feed(levelsOf(1, 4));
    EXPECT_EQ(values, (PlistDictionary{{"RSSI", "mine"}, {"Quality", "4"}}));
    feed(levelsOf(2, 4));
    EXPECT_EQ(textAt(values, {"RSSI"}), "2 dBm");
}

TEST_F(BaseTest, AnotherRecordOfTheSameKeyMakesTheFieldShowAgain)
{
    PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(5, 3));
    feed(PacketBuilder(0xFF0001).u8(13, 5));
    EXPECT_EQ(textAt(values, {"RSSI"}), "5");
    feed(levelsOf(5, 3));
    EXPECT_EQ(textAt(values, {"RSSI"}), "5 dBm");
}

TEST_F(BaseTest, ANewContainerShowsEverythingAgain)
{
    const PlistDictionary first;
    section.updateSectionRef(first);
    feed(levelsOf(5, 3));
    PlistDictionary second{{"RSSI", "-"}, {"Quality", "-"}};
    section.updateSectionRef(second);
    feed(levelsOf(5, 3));
    EXPECT_EQ(second, (PlistDictionary{{"RSSI", "5 dBm"}, {"Quality", "3"}}));
}

TEST_F(BaseTest, AContainerThatLostItsEntriesShowsThemAgain)
{
    PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(5, 3));
    values.clear();
    feed(levelsOf(5, 3));
    EXPECT_EQ(values, (PlistDictionary{{"RSSI", "5 dBm"}, {"Quality", "3"}}));
}

TEST_F(BaseTest, TellsWhereAValueComesFrom)
{
    const PlistDictionary values;
    section.updateSectionRef(values);
    EXPECT_FALSE(section.originOf("RSSI"));
    feed(levelsOf(0xBA, 3).u8(15, 9));
    const auto origin = section.originOf("RSSI");
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->record->logCode, 0xD0E0U);
    EXPECT_EQ(origin->version, 9);
    EXPECT_EQ(origin->firstByte(), 13U);
    EXPECT_EQ(origin->field->place.bytes(), 1U);
    EXPECT_EQ(origin->raw, -70);
    EXPECT_EQ(origin->number(), -70.0);
    EXPECT_EQ(origin->field->shown.unit, "dBm");
}

TEST_F(BaseTest, TheOriginIsThatOfTheRecordThatWroteLast)
{
    const PlistDictionary values;
    section.updateSectionRef(values);
    feed(levelsOf(5, 3));
    feed(PacketBuilder(0xFF0001).u8(13, 5));
    EXPECT_EQ(section.originOf("RSSI")->record->logCode, 0xFF0001U);
    EXPECT_FALSE(section.originOf("RSSI")->version);
    EXPECT_FALSE(section.originOf("Quality"));
}

TEST_F(BaseTest, WritesGoNowhereOnceTheDisplayIsGone)
{
    {
        const PlistDictionary values;
        section.updateSectionRef(values);
    }
    feed(levelsOf(5, 3));
    PlistDictionary next;
    section.updateSectionRef(next);
    EXPECT_TRUE(next.empty());
}

TEST_F(BaseTest, ReplaceArrayKeepsTheContainerAndTheOrder)
{
    PlistArray rows{"old"};
    Base::replaceArray(rows, {"a", "b"});
    EXPECT_EQ(rows, (PlistArray{"a", "b"}));
}

TEST_F(BaseTest, ClearElementsEmptiesTheArray)
{
    PlistArray rows{"a", "b"};
    Base::clearElementsInArray(rows);
    EXPECT_TRUE(rows.empty());
}

TEST_F(BaseTest, AnUnknownMessageIsLoggedWithItsCodeAsASignedNumber)
{
    section.updateWithData(LogPacket({}), 0xFFFFFFFF);
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{4, "Cells"},
                                                  CapturingSystemLog::Line{
                                                      3, "Received an unknown log message: -1"}));
}

TEST_F(BaseTest, AnUnknownMessageIsPassedOverWhereTheTableSaysSo)
{
    TableSection<quietTable> quiet(log);
    quiet.updateWithData(LogPacket({}), 0x1234);
    EXPECT_THAT(log.texts(), testing::ElementsAre("Quiet"));
}

TEST(LookUpECNO, GivesEachRowsValueAtBothItsEnds)
{
    for (const EcnoRow& row : ecnoRows) {
        EXPECT_EQ(Base::lookUpECNO(row.from), row.result) << row.from;
        EXPECT_EQ(Base::lookUpECNO(row.to), row.result) << row.to;
    }
}

TEST(BaseArrays, AreClearedAndReplacedUnderTheirLock)
{
    PlistArray array{"a"};
    EXPECT_TRUE(waitsForArrayLock([&] { Base::clearElementsInArray(array); }));
    EXPECT_TRUE(array.empty());
    EXPECT_TRUE(waitsForArrayLock([&] { Base::replaceArray(array, PlistArray{"b"}); }));
    EXPECT_EQ(array, PlistArray{"b"});
}

} // namespace ventrik
