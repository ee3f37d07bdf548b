#include "LogGenerator/Orbel/Base.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ArrayLockHolder.h"

namespace ventrik
{

namespace
{

class NamedSection : public Base
{
  public:
    NamedSection(SystemLog& log, std::string_view name, std::vector<std::uint32_t> codes)
        : Base(log), _name(name), _codes(std::move(codes))
    {
    }
    void updateWithData(const LogPacket&, std::uint32_t logCode) override
    {
        logUnknownMessage(logCode);
    }
    std::string_view getSectionName() const override { return _name; }
    std::vector<std::uint32_t> getLogCodeArray() const override { return _codes; }

    using Base::show;
    using Base::withdraw;

  private:
    std::string_view _name;
    std::vector<std::uint32_t> _codes;
};

class BaseTest : public testing::Test
{
  protected:
    CapturingSystemLog log;
    ClassDictionary classDictionary;
    CodeDictionary codeDictionary;
    NamedSection section{log, "Cells", {0xD0E0, 0xFF0001}};
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
    NamedSection second(log, "Second", {0xFF0001});
    section.initWithDict(classDictionary, codeDictionary);
    second.initWithDict(classDictionary, codeDictionary);
    EXPECT_THAT(*codeDictionary.subscribers(0xFF0001), testing::ElementsAre(&section, &second));
}

TEST_F(BaseTest, ACodeListedTwiceIsRegisteredTwice)
{
    NamedSection twice(log, "Twice", {7, 7});
    twice.updateLogCodeDict(codeDictionary);
    EXPECT_EQ(codeDictionary.subscribers(7)->size(), 2U);
    EXPECT_THAT(codeDictionary.keys(), testing::ElementsAre("7"));
}

TEST_F(BaseTest, BindingLogsTheSectionNameAsItStands)
{
    NamedSection odd(log, "Rate {} %d", {});
    odd.updateSectionRef(PlistDictionary());
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{4, "Rate {} %d"}));
}

TEST_F(BaseTest, WritesGoNowhereBeforeBinding)
{
    section.show("RSSI", "-70");
    section.withdraw("RSSI");
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(BaseTest, WritesGoToTheBoundDictionary)
{
    PlistDictionary values{{"RSSI", "-"}};
    section.updateSectionRef(values);
    section.show("RSSI", "-70");
    EXPECT_EQ(textAt(values, {"RSSI"}), "-70");
    section.withdraw("RSSI");
    EXPECT_FALSE(values.contains("RSSI"));
}

TEST_F(BaseTest, WritesGoNowhereOnceTheDisplayIsGone)
{
    {
        const PlistDictionary values;
        section.updateSectionRef(values);
    }
    section.show("RSSI", "-70");
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
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{
                                 3, "Received an unknown log message: -1"}));
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
