#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using EquivalentPLMNListTest = ListSectionFixture<EquivalentPLMNList>;

// A record of `count` networks, with room for the last one's six bytes.
PacketBuilder plmnRecord(std::uint8_t count)
{
    return PacketBuilder(0x7150).u8(16, count).size(17 + std::size_t{3} * count + 3);
}

} // namespace

TEST_F(EquivalentPLMNListTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Equivalent PLMN List");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x7150));
}

TEST_F(EquivalentPLMNListTest, CountryAndNetworkDigitsTakeTurns)
{
    const Bytes digits{2, 0, 6, 7, 2, 1};
    feed(plmnRecord(1).bytes(17, digits));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("Mobile Country Code", "Mobile Network Code"));
    EXPECT_EQ(shown(0, "Mobile Country Code"), "262");
    EXPECT_EQ(shown(0, "Mobile Network Code"), "71"); // 0 * 100 + 7 * 10 + 1
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Equivalent PLMN List"}));
}

TEST_F(EquivalentPLMNListTest, ANetworkSharesItsSecondHalfWithTheNext)
{
    const Bytes digits{1, 2, 3, 4, 5, 6, 7, 8, 9};
    feed(plmnRecord(2).bytes(17, digits));
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_EQ(shown(0, "Mobile Country Code"), "135"); // bytes 17, 19, 21
    EXPECT_EQ(shown(0, "Mobile Network Code"), "246"); // bytes 18, 20, 22
    EXPECT_EQ(shown(1, "Mobile Country Code"), "468"); // bytes 20, 22, 24
    EXPECT_EQ(shown(1, "Mobile Network Code"), "579"); // bytes 21, 23, 25
}

TEST_F(EquivalentPLMNListTest, BytesThatAreNoDigitsCountAsTheyAre)
{
    const Bytes digits{255, 200, 255, 0, 255, 255};
    feed(plmnRecord(1).bytes(17, digits));
    EXPECT_EQ(shown(0, "Mobile Country Code"), "28305"); // 255 * 111
    EXPECT_EQ(shown(0, "Mobile Network Code"), "20255");
}

TEST_F(EquivalentPLMNListTest, Shows255NetworksAtMost)
{
    feed(plmnRecord(255));
    EXPECT_EQ(rows.size(), 255U);
}

TEST_F(EquivalentPLMNListTest, ARecordWithoutNetworksEmptiesTheList)
{
    rows.append("row");
    feed(plmnRecord(0).size(17));
    EXPECT_TRUE(rows.empty());
}

TEST_F(EquivalentPLMNListTest, ANetworkNeedsItsSixBytes)
{
    feed(plmnRecord(2).size(25));
    EXPECT_EQ(rows.size(), 1U);
    feed(plmnRecord(2).size(26));
    EXPECT_EQ(rows.size(), 2U);
}

TEST_F(EquivalentPLMNListTest, ARecordWithoutACompleteNetworkEmptiesTheList)
{
    rows.append("row");
    feed(plmnRecord(2).size(22));
    EXPECT_TRUE(rows.empty());
}

TEST_F(EquivalentPLMNListTest, ARecordOf16BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(plmnRecord(0).size(16));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("Equivalent PLMN List"));
}

TEST_F(EquivalentPLMNListTest, AnotherCodeIsReported)
{
    rows.append("row");
    feed(PacketBuilder(0x7135).size(60));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Equivalent PLMN List"},
                                         Line{3, "Received an unknown log message: 28981"}));
}

} // namespace ventrik
