#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"
#include "LogGenerator/Orbel/LTE/NeighborSignal.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

// A record that announces c + 1 cells, all bytes of them 0.
PacketBuilder idleRecord(std::uint32_t c)
{
    return PacketBuilder(0xB180).bits(19, 6, 5, c).size(21 + 20 * (c + 1));
}

using NeighborMeasurementMiscTest = SectionFixture<NeighborMeasurementMisc>;
using NeighborCellsListTest = ListSectionFixture<NeighborCellsList>;

struct CellFieldRow {
    std::size_t offset; // in the element
    unsigned shift;
    unsigned width;
    std::uint32_t raw;
    std::string_view key;
    std::string_view text;
};

constexpr CellFieldRow cellFieldRows[] = {
    {0, 0, 9, 503, "Physical Cell ID", "503"},
    {0, 0, 9, 511, "Physical Cell ID", "511"},
    {1, 1, 8, 0, "Measured RSSI", "-140.00 dBm"},
    {1, 1, 8, 131, "Measured RSSI", "-74.50 dBm"},
    {1, 1, 8, 255, "Measured RSSI", "-12.50 dBm"},
    {2, 1, 9, 0, "Measured RSRP", "-140.00 dBm"},
    {2, 1, 9, 81, "Measured RSRP", "-99.50 dBm"},
    {2, 1, 9, 511, "Measured RSRP", "115.50 dBm"},
    {4, 0, 9, 0, "Average RSRP", "-140.00 dBm"},
    {4, 0, 9, 511, "Average RSRP", "115.50 dBm"},
    {5, 1, 7, 0, "Measured RSRQ", "-30.00 dB"},
    {5, 1, 7, 127, "Measured RSRQ", "1.75 dB"},
    {6, 0, 7, 0, "Average RSRQ", "-30.00 dB"},
    {6, 0, 7, 127, "Average RSRQ", "1.75 dB"},
    {6, 7, 7, 0, "Srxlev", "-30 dBm"},
    {6, 7, 7, 127, "Srxlev", "97 dBm"},
    {8, 0, 16, 65535, "Frequency Offset", "65535"},
    {12, 0, 11, 2047, "Ant 0 Frame Offset", "2047"},
    {12, 0, 11, 2047, "Ant 1 Frame Offset", "2047"},
    {12, 11, 19, 524287, "Ant 0 Sample Offset", "524287"},
    {12, 11, 19, 524287, "Ant 1 Sample Offset", "524287"},
};

} // namespace

TEST_F(NeighborMeasurementMiscTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Neighbor Measurements");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB180));
}

TEST_F(NeighborMeasurementMiscTest, ShowsItsThreeValuesInOrder)
{
    feed(PacketBuilder(0xB180).u8(13, 2).u16(17, 1300).bits(19, 0, 6, 8).size(21));
    EXPECT_EQ(shown("Version"), "2");
    EXPECT_EQ(shown("E-ARFCN"), "1300");
    EXPECT_EQ(shown("Qrxlevmin"), "-124 dBm"); // 2 * 8 - 140
    EXPECT_THAT(keysOf(values), ElementsAre("Version", "E-ARFCN", "Qrxlevmin"));
    EXPECT_THAT(log.texts(), ElementsAre("Neighbor Measurements"));
}

TEST_F(NeighborMeasurementMiscTest, QrxlevminEndsAtItsSixBits)
{
    feed(PacketBuilder(0xB180).bits(19, 0, 6, 63).bits(19, 6, 5, 31).size(21));
    EXPECT_EQ(shown("Qrxlevmin"), "-14 dBm");
}

TEST_F(NeighborMeasurementMiscTest, ARecordOf20BytesChangesNothing)
{
    feed(PacketBuilder(0xB180).size(20));
    EXPECT_TRUE(values.empty());
}

TEST_F(NeighborMeasurementMiscTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB186).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45446"));
}

TEST_F(NeighborCellsListTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Neighbor Cells List");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB180));
}

TEST_F(NeighborCellsListTest, EachFieldIsReadFromItsBitsAndFormatted)
{
    for (const CellFieldRow& row : cellFieldRows) {
        feed(idleRecord(1).bits(41 + row.offset, row.shift, row.width, row.raw));
        EXPECT_EQ(shown(1, row.key), row.text) << row.key << " raw " << row.raw;
    }
}

TEST_F(NeighborCellsListTest, NoFieldIsTouchedByTheBitsAroundIt)
{
    for (const CellFieldRow& row : cellFieldRows) {
        PacketBuilder packet = idleRecord(0);
        for (std::size_t offset = 21; offset < 41; ++offset)
            packet.u8(offset, 0xFF);
        feed(packet.bits(21 + row.offset, row.shift, row.width, row.raw));
        EXPECT_EQ(shown(0, row.key), row.text) << row.key << " raw " << row.raw;
    }
}

TEST_F(NeighborCellsListTest, RowsHaveTheirKeysInOrder)
{
    feed(idleRecord(0));
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("Physical Cell ID", "Measured RSSI", "Measured RSRP", "Average RSRP",
                            "Measured RSRQ", "Average RSRQ", "Srxlev", "Frequency Offset",
                            "Ant 0 Frame Offset", "Ant 0 Sample Offset", "Ant 1 Frame Offset",
                            "Ant 1 Sample Offset"));
}

TEST_F(NeighborCellsListTest, ShowsOneCellAtLeastAnd32AtMost)
{
    feed(idleRecord(0));
    EXPECT_EQ(rows.size(), 1U);
    feed(idleRecord(31));
    EXPECT_EQ(rows.size(), 32U);
}

TEST_F(NeighborCellsListTest, TracesTheCountAndEachRowsLevels)
{
    feed(idleRecord(0).bits(21, 0, 9, 503).bits(22, 1, 8, 131));
    EXPECT_THAT(log.texts(4),
                ElementsAre("Neighbor Cells List",
                            "Number of neighboring cells being reported: 1\n",
                            "Physical Cell ID: 503\n", "Measured RSSI: -74.500000\n",
                            "Measured RSSI: -140.000000\n", "Measured RSSI: -140.000000\n",
                            "Measured RSSI: -30.000000\n", "Measured RSSI: -30.000000\n"));
}

TEST_F(NeighborCellsListTest, AnElementNeedsItsFirst16Bytes)
{
    feed(idleRecord(1).size(41 + 15));
    EXPECT_EQ(rows.size(), 1U);
    feed(idleRecord(1).size(41 + 16));
    EXPECT_EQ(rows.size(), 2U);
}

TEST_F(NeighborCellsListTest, OnlyRowsThatAreShownAreTraced)
{
    feed(idleRecord(3).size(41));
    EXPECT_EQ(log.count("Physical Cell ID: 0\n"), 1U);
    EXPECT_TRUE(log.contains("Number of neighboring cells being reported: 4\n"));
}

TEST_F(NeighborCellsListTest, ARecordWithoutACompleteCellEmptiesTheList)
{
    rows.append("row");
    feed(idleRecord(0).size(21));
    EXPECT_TRUE(rows.empty());
}

TEST_F(NeighborCellsListTest, ARecordOf20BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(idleRecord(0).size(20));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("Neighbor Cells List"));
}

TEST_F(NeighborCellsListTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB186).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45446"));
}

} // namespace ventrik
