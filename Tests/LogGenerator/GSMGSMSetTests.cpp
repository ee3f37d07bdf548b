#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/ElementField.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using GSMSetTest = ListSectionFixture<GSMSet>;

// A record of g GSM cells, all bytes of them 0.
PacketBuilder rankedCells(std::uint8_t g)
{
    return PacketBuilder(0x4005).u8(14, g).size(15 + std::size_t{7} * g);
}

constexpr ElementField fields[] = {
    {0, 16, 975, "ARFCN", "975"},
    {0, 16, 65535, "ARFCN", "65535"},
    {2, 16, 63, "BSIC", "63"},
    {2, 16, 65535, "BSIC", "65535"},
    {4, 8, 0xA6, "RSSI", "-90 dBm"},
    {4, 8, 127, "RSSI", "127 dBm"},
    {5, 16, 0xFFF6, "Ranking Value", "-10"},
    {5, 16, 32767, "Ranking Value", "32767"},
};

} // namespace

TEST_F(GSMSetTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "GSM Set");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x4005));
}

TEST_F(GSMSetTest, EachFieldIsReadFromItsBytesAlone)
{
    section.readRecords(RecordsMode::Base);
    expectElementFields(fields, rankedCells(2), 22, 7,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shown(1, key);
                        });
}

TEST_F(GSMSetTest, RowsHaveTheirKeysInOrder)
{
    feed(rankedCells(1));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("ARFCN", "BSIC", "RSSI", "Ranking Value"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSMSet"}));
}

TEST_F(GSMSetTest, CellsLieOverTheUMTSCells)
{
    feed(rankedCells(1).u8(13, 1).size(25).u16(15, 10700).u16(17, 300));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "ARFCN"), "10700");
    EXPECT_EQ(shown(0, "BSIC"), "300");
}

TEST_F(GSMSetTest, Shows255CellsAtMost)
{
    feed(rankedCells(255).u16(15 + 254 * 7, 124));
    EXPECT_EQ(rows.size(), 255U);
    EXPECT_EQ(shown(254, "ARFCN"), "124");
}

TEST_F(GSMSetTest, ARecordWithoutGSMCellsEmptiesTheList)
{
    rows.append("row");
    feed(rankedCells(0).u8(13, 1).size(25));
    EXPECT_TRUE(rows.empty());
    rows.append("row");
    feed(rankedCells(0).size(15));
    EXPECT_TRUE(rows.empty());
}

TEST_F(GSMSetTest, ACellNeedsItsSevenBytes)
{
    feed(rankedCells(2).size(28));
    EXPECT_EQ(rows.size(), 1U);
    feed(rankedCells(2).size(29));
    EXPECT_EQ(rows.size(), 2U);
    feed(rankedCells(2).size(21));
    EXPECT_TRUE(rows.empty());
}

TEST_F(GSMSetTest, ARecordOf14BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(rankedCells(1).size(14));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("GSMSet"));
}

TEST_F(GSMSetTest, AnotherCodeIsReported)
{
    rows.append("row");
    feed(PacketBuilder(0x417A).size(60));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(),
                ElementsAre(Line{4, "GSMSet"}, Line{3, "Received an unknown log message: 16762"}));
}

} // namespace ventrik
