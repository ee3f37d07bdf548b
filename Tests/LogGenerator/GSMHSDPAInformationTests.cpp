#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/ElementField.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

constexpr const char* primary = "Primary HARQ Process";
constexpr const char* secondary = "Secondary HARQ Process";

class HSDPAInformationTest : public SectionFixture<HSDPAInformation>
{
  protected:
    // A record of p primary and s secondary processes, all bytes of them 0.
    static PacketBuilder hsdpa(std::uint8_t p, std::uint8_t s)
    {
        const std::size_t end =
            s > 0 ? 18 + std::size_t{162} * p + std::size_t{9} * s : 18 + std::size_t{9} * p;
        return PacketBuilder(0x4221).u8(16, p).u8(17, s).size(end);
    }
    PlistArray processes(const char* key) { return *values.find(key)->array(); }
    std::string shownOf(const char* list, std::size_t process, std::string_view key)
    {
        return textAt(processes(list)[process], {key});
    }
};

constexpr ElementField fields[] = {
    {0, 8, 7, "Process ID", "7"},
    {0, 8, 255, "Process ID", "255"},
    {1, 32, 70000, "No Rx Bits", "70000"},
    {1, 32, 0x80000000, "No Rx Bits", "2147483648"},
    {1, 32, 0xFFFFFFFF, "No Rx Bits", "4294967295"},
    {5, 16, 258, "New Tx", "258"},
    {5, 16, 65535, "New Tx", "65535"},
    {7, 16, 259, "Block Errors", "259"},
    {7, 16, 65535, "Block Errors", "65535"},
};

} // namespace

TEST_F(HSDPAInformationTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "HSDPA Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x4221));
}

TEST_F(HSDPAInformationTest, WithoutProcessesShowsTheThreeSummariesAlone)
{
    feed(hsdpa(0, 0).u8(13, 2).u8(14, 100));
    EXPECT_THAT(keysOf(values), ElementsAre("Version", "Sub Frames", "Carrier Info"));
    EXPECT_EQ(shown("Version"), "2");
    EXPECT_EQ(shown("Sub Frames"), "100");
    EXPECT_EQ(shown("Carrier Info"), "Single Carrier");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "HSDPA Info"}));
}

TEST_F(HSDPAInformationTest, SubFramesHaveTenBitsAndTheCarrierTheNextTwo)
{
    feed(hsdpa(0, 0).u8(13, 255).u8(14, 4).u8(15, 0x09));
    EXPECT_EQ(shown("Version"), "255");
    EXPECT_EQ(shown("Sub Frames"), "260"); // 256 + 4
    EXPECT_EQ(shown("Carrier Info"), "Dual Carrier");
    feed(hsdpa(0, 0).u8(14, 255).u8(15, 0xFF));
    EXPECT_EQ(shown("Sub Frames"), "1023");
    EXPECT_EQ(shown("Carrier Info"), "Reserved");
    feed(hsdpa(0, 0).u8(15, 0xF4));
    EXPECT_EQ(shown("Sub Frames"), "0");
    EXPECT_EQ(shown("Carrier Info"), "MIMO");
    feed(hsdpa(0, 0).u8(15, 0xF0));
    EXPECT_EQ(shown("Carrier Info"), "Single Carrier");
}

TEST_F(HSDPAInformationTest, EachFieldOfAPrimaryProcessIsReadFromItsBytesAlone)
{
    expectElementFields(fields, hsdpa(2, 0), 27, 9,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shownOf(primary, 1, key);
                        });
}

TEST_F(HSDPAInformationTest, EachFieldOfASecondaryProcessIsReadFromItsBytesAlone)
{
    constexpr std::size_t second = 18 + 2 * 162 + 9;
    expectElementFields(fields, hsdpa(2, 2), second, 9,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shownOf(secondary, 1, key);
                        });
}

TEST_F(HSDPAInformationTest, ProcessesHaveTheirKeysInOrder)
{
    feed(hsdpa(1, 1));
    EXPECT_THAT(keysOf(values),
                ElementsAre("Version", "Sub Frames", "Carrier Info", primary, secondary));
    for (const char* list : {primary, secondary})
        EXPECT_THAT(keysOf(*processes(list)[0].dictionary()),
                    ElementsAre("Process ID", "No Rx Bits", "New Tx", "Block Errors"));
}

TEST_F(HSDPAInformationTest, SecondaryProcessesBegin162BytesAfterEachPrimaryOne)
{
    feed(hsdpa(1, 1).u8(18, 1).u8(27, 2).u8(180, 3));
    EXPECT_EQ(shownOf(primary, 0, "Process ID"), "1");
    EXPECT_EQ(shownOf(secondary, 0, "Process ID"), "3");
}

TEST_F(HSDPAInformationTest, WithoutPrimaryProcessesTheSecondaryOnesBeginAt18)
{
    feed(hsdpa(0, 1).u8(18, 4));
    EXPECT_EQ(shownOf(secondary, 0, "Process ID"), "4");
    EXPECT_FALSE(values.contains(primary));
}

TEST_F(HSDPAInformationTest, ACountOfZeroKeepsTheListThatWasShown)
{
    feed(hsdpa(1, 1).u8(18, 1).u8(180, 3));
    feed(hsdpa(0, 0));
    EXPECT_EQ(shownOf(primary, 0, "Process ID"), "1");
    EXPECT_EQ(shownOf(secondary, 0, "Process ID"), "3");
    feed(hsdpa(1, 0).u8(18, 5));
    EXPECT_EQ(shownOf(primary, 0, "Process ID"), "5");
    EXPECT_EQ(shownOf(secondary, 0, "Process ID"), "3");
}

TEST_F(HSDPAInformationTest, Shows255ProcessesAtMost)
{
    feed(hsdpa(255, 255).u8(18 + 9 * 254, 8).u8(18 + 162 * 255 + 9 * 254, 9));
    ASSERT_EQ(processes(primary).size(), 255U);
    ASSERT_EQ(processes(secondary).size(), 255U);
    EXPECT_EQ(shownOf(primary, 254, "Process ID"), "8");
    EXPECT_EQ(shownOf(secondary, 254, "Process ID"), "9");
}

TEST_F(HSDPAInformationTest, AProcessNeedsItsNineBytes)
{
    feed(hsdpa(2, 0).size(35));
    EXPECT_EQ(processes(primary).size(), 1U);
    feed(hsdpa(2, 0).size(36));
    EXPECT_EQ(processes(primary).size(), 2U);
    feed(hsdpa(1, 2).size(197));
    EXPECT_EQ(processes(secondary).size(), 1U);
    feed(hsdpa(1, 2).size(198));
    EXPECT_EQ(processes(secondary).size(), 2U);
}

TEST_F(HSDPAInformationTest, AListThatTheRecordDoesNotHoldIsEmpty)
{
    feed(hsdpa(1, 1));
    feed(hsdpa(1, 1).size(18));
    EXPECT_TRUE(processes(primary).empty());
    EXPECT_TRUE(processes(secondary).empty());
}

TEST_F(HSDPAInformationTest, ARecordOf17BytesOnlyLeavesATrace)
{
    feed(PacketBuilder(0x4221).u8(13, 1).size(17));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "HSDPA Info"}));
}

TEST_F(HSDPAInformationTest, AnotherCodeOnlyLeavesATrace)
{
    feed(PacketBuilder(0x4116).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "HSDPA Info"}));
}

} // namespace ventrik
