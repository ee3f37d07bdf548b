#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "LogGenerator/Orbel/LTE/MeasuredNeighborCells.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

// n measured neighbours with cell identities 100, 101 ... and m detected cells with 200, 201 ...
PacketBuilder connectedRecord(std::uint8_t n, std::uint8_t m)
{
    PacketBuilder packet(0xB179);
    packet.u8(27, n).u8(28, m);
    for (std::size_t i = 0; i < n; ++i)
        packet.u16(29 + 6 * i, static_cast<std::uint16_t>(100 + i)).u32(31 + 6 * i, 0);
    for (std::size_t j = 0; j < m; ++j)
        packet.u16(29 + 6 * std::size_t{n} + 2 * j, static_cast<std::uint16_t>(200 + j));
    return packet;
}

using MeasuredNeighborCellsTest = ListSectionFixture<MeasuredNeighborCells>;
using DetectedCellsTest = ListSectionFixture<DetectedCells>;

} // namespace

TEST_F(MeasuredNeighborCellsTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Measured Neighbor Cells");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB179));
}

TEST_F(MeasuredNeighborCellsTest, ShowsARowForEachNeighbour)
{
    feed(connectedRecord(2, 1).u16(29, 503).u16(31, 160).u16(33, 84).u16(37, 65535).u16(39, 0));
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("Physical Cell ID", "Filtered RSRP", "Filtered RSRQ"));
    EXPECT_EQ(shown(0, "Physical Cell ID"), "503");
    EXPECT_EQ(shown(0, "Filtered RSRP"), "-100.00 dBm"); // 160 / 4 - 140
    EXPECT_EQ(shown(0, "Filtered RSRQ"), "-9.50 dB");    // 84 / 8 - 20
    EXPECT_EQ(shown(1, "Physical Cell ID"), "101");
    EXPECT_EQ(shown(1, "Filtered RSRP"), "16243.75 dBm");
    EXPECT_EQ(shown(1, "Filtered RSRQ"), "-20.00 dB");
    EXPECT_THAT(log.texts(), ElementsAre("Measured Neighbor Cells"));
}

TEST_F(MeasuredNeighborCellsTest, ARecordWithoutNeighboursIsReportedAndEmptiesTheList)
{
    rows.append("row");
    feed(connectedRecord(0, 1)); // 31 bytes, less 2 for the detected cell
    EXPECT_TRUE(rows.empty());
    EXPECT_THAT(log.texts(3),
                ElementsAre("Unexpected log packet bytes size: expected=0 actual=29"));
}

TEST_F(MeasuredNeighborCellsTest, ARecordThatIsTooShortForItsCountIsReported)
{
    rows.append("row");
    feed(connectedRecord(6, 0).size(35)); // 36 bytes are expected
    EXPECT_TRUE(rows.empty());
    EXPECT_THAT(log.texts(3),
                ElementsAre("Unexpected log packet bytes size: expected=36 actual=35"));
}

TEST_F(MeasuredNeighborCellsTest, TheCheckLeavesTheHeaderOut)
{
    feed(connectedRecord(6, 0).size(36)); // passes, though only one element is there
    EXPECT_TRUE(log.texts(3).empty());
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(MeasuredNeighborCellsTest, TheCheckWrapsAt256)
{
    // 6 * 43 is 258, taken as 2.
    feed(connectedRecord(43, 0));
    EXPECT_EQ(rows.size(), 43U);
    feed(connectedRecord(43, 0).size(257)); // 1 of 2
    EXPECT_TRUE(rows.empty());
    EXPECT_THAT(log.texts(3), ElementsAre("Unexpected log packet bytes size: expected=2 actual=1"));
}

TEST_F(MeasuredNeighborCellsTest, ARecordOf28BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(connectedRecord(2, 0).size(28));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("Measured Neighbor Cells"));
}

TEST_F(MeasuredNeighborCellsTest, ACutElementIsNotShown)
{
    feed(connectedRecord(2, 0).size(29 + 11));
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(MeasuredNeighborCellsTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB180).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45440"));
}

TEST_F(DetectedCellsTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Detected Cells");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB179));
}

TEST_F(DetectedCellsTest, ReadsItsCellsBehindTheMeasuredOnes)
{
    const Bytes packet = connectedRecord(2, 1).build();
    ASSERT_EQ(packet.size(), 43U);
    feed(packet);
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(rows[0], PlistValue(PlistDictionary{{"Physical Cell ID", "200"}}));
    EXPECT_THAT(log.texts(), ElementsAre("Detected Cells"));
}

TEST_F(DetectedCellsTest, ShowsItsCellsEvenWithoutMeasuredOnes)
{
    feed(connectedRecord(0, 3));
    ASSERT_EQ(rows.size(), 3U);
    EXPECT_EQ(shown(2, "Physical Cell ID"), "202");
}

TEST_F(DetectedCellsTest, ARecordWithoutDetectedCellsEmptiesTheList)
{
    rows.append("row");
    feed(connectedRecord(1, 0));
    EXPECT_TRUE(rows.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(DetectedCellsTest, ManyCellsThatAreCutShortEndWithTheLastCompleteOne)
{
    feed(connectedRecord(0, 255).size(29 + 2 * 100 + 1));
    EXPECT_EQ(rows.size(), 100U);
    feed(connectedRecord(255, 255).size(40));
    EXPECT_TRUE(rows.empty());
}

TEST_F(DetectedCellsTest, ARecordOf28BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(connectedRecord(0, 1).size(28));
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(DetectedCellsTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB180).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45440"));
}

} // namespace ventrik
