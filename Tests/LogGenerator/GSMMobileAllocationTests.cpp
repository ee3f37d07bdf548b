#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class MobileAllocationTest : public SectionFixture<MobileAllocation>
{
  protected:
    static PacketBuilder allocation(std::uint8_t hsn, std::uint8_t count)
    {
        return PacketBuilder(0x51F8).u8(13, hsn).u8(14, count).size(15 + std::size_t{2} * count);
    }
    PlistArray arfcns() { return *values.find("ARFCNs")->array(); }
};

} // namespace

TEST_F(MobileAllocationTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Mobile Allocation");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x51F8));
}

TEST_F(MobileAllocationTest, ShowsTheFrequenciesInTheOrderOfTheRecord)
{
    feed(allocation(63, 3).u16(15, 700).u16(17, 5).u16(19, 65535));
    EXPECT_THAT(keysOf(values), ElementsAre("HSN", "ARFCNs"));
    EXPECT_EQ(shown("HSN"), "63");
    EXPECT_EQ(arfcns(), (PlistArray{"700", "5", "65535"}));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "MobileAllocation"}));
}

TEST_F(MobileAllocationTest, ShowsTheHoppingSequenceNumberWithoutASign)
{
    feed(allocation(255, 0));
    EXPECT_EQ(shown("HSN"), "255");
}

TEST_F(MobileAllocationTest, AnAllocationWithoutFrequenciesIsAnEmptyList)
{
    feed(allocation(1, 1));
    feed(allocation(2, 0));
    EXPECT_EQ(shown("HSN"), "2");
    EXPECT_EQ(arfcns(), PlistArray());
}

// What was copied for the display must not change under it.
TEST_F(MobileAllocationTest, EachRecordMakesANewList)
{
    feed(allocation(1, 1).u16(15, 5));
    const PlistArray before = arfcns();
    feed(allocation(1, 1).u16(15, 6));
    EXPECT_EQ(before, PlistArray{"5"});
    EXPECT_EQ(arfcns(), PlistArray{"6"});
}

TEST_F(MobileAllocationTest, Shows255FrequenciesAtMost)
{
    feed(allocation(1, 255).u16(15 + 2 * 254, 124));
    ASSERT_EQ(arfcns().size(), 255U);
    EXPECT_EQ(arfcns()[254], PlistValue("124"));
}

TEST_F(MobileAllocationTest, AFrequencyNeedsItsTwoBytes)
{
    feed(allocation(1, 2).size(18));
    EXPECT_EQ(arfcns().size(), 1U);
    feed(allocation(1, 2).size(19));
    EXPECT_EQ(arfcns().size(), 2U);
    feed(allocation(1, 2).size(15));
    EXPECT_TRUE(arfcns().empty());
}

TEST_F(MobileAllocationTest, ARecordOf14BytesChangesNothing)
{
    feed(PacketBuilder(0x51F8).u8(13, 1).size(14));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("MobileAllocation"));
}

TEST_F(MobileAllocationTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x51F6).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "MobileAllocation"},
                                         Line{3, "Received an unknown log message: 20982"}));
}

} // namespace ventrik
