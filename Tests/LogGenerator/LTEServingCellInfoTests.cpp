#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class LTEServingCellInfoTest : public SectionFixture<LTEServingCellInfo>
{
  protected:
    static PacketBuilder cellInfo()
    {
        return PacketBuilder(0xB0C2)
            .u16(14, 301)
            .u16(16, 1300)
            .u16(18, 19300)
            .u8(20, 50)
            .u8(21, 100)
            .u32(22, 0x01A2D003)
            .u16(26, 0x8001)
            .u32(28, 3)
            .size(38);
    }
    static PlistDictionary servingCell()
    {
        return cellEntry(kQXCellMonitorRadioAccessTechnologyLTE, kQXCellMonitorCellTypeServing);
    }
    static PlistDictionary fullServingCell()
    {
        PlistDictionary result = servingCell();
        result.set(kQXCellMonitorTAC, 4711);
        result.set(kQXCellMonitorCellId, 27447299);
        result.set(kQXCellMonitorPID, 12);
        result.set(kQXCellMonitorBandInfo, 7);
        result.set(kQXCellMonitorUARFCN, 3050);
        return result;
    }
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

struct BandwidthRow {
    std::uint8_t raw;
    std::string_view label;
};

constexpr BandwidthRow bandwidthRows[] = {
    {0, "Unknown"}, {5, "Unknown"},  {6, "1.4 MHz"},   {7, "Unknown"},   {14, "Unknown"},
    {15, "3 MHz"},  {16, "Unknown"}, {25, "5 MHz"},    {26, "Unknown"},  {50, "10 MHz"},
    {75, "15 MHz"}, {100, "20 MHz"}, {101, "Unknown"}, {255, "Unknown"},
};

} // namespace

TEST_F(LTEServingCellInfoTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Serving Cell Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB0C2, 0xB0C1, 0xFF0001));
}

TEST_F(LTEServingCellInfoTest, CellInfoShowsEachFieldInOrder)
{
    feed(cellInfo());
    EXPECT_EQ(shown("Physical Cell ID"), "301");
    EXPECT_EQ(shown("Download Frequency"), "1300");
    EXPECT_EQ(shown("Upload Frequency"), "19300");
    EXPECT_EQ(shown("Download Bandwidth"), "10 MHz");
    EXPECT_EQ(shown("Upload Bandwidth"), "20 MHz");
    EXPECT_EQ(shown("Cell Identity"), "27447299"); // 0x01A2D003
    EXPECT_EQ(shown("Tracking Area Code"), "32769");
    EXPECT_EQ(shown("Freq Band Indicator"), "3");
    EXPECT_THAT(keysOf(values),
                ElementsAre("Physical Cell ID", "Download Frequency", "Upload Frequency",
                            "Download Bandwidth", "Upload Bandwidth", "Cell Identity",
                            "Tracking Area Code", "Freq Band Indicator"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "LTE Serving Cell Info"}));
}

TEST_F(LTEServingCellInfoTest, CellInfoOf37BytesChangesNothing)
{
    feed(cellInfo().size(37));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "LTE Serving Cell Info"}));
}

TEST_F(LTEServingCellInfoTest, CellInfoShowsLargeNumbersNegative)
{
    feed(cellInfo().u32(22, 0x80000000).u32(28, 0xFFFFFFFF));
    EXPECT_EQ(shown("Cell Identity"), "-2147483648");
    EXPECT_EQ(shown("Freq Band Indicator"), "-1");
}

TEST_F(LTEServingCellInfoTest, BandwidthsFollowTheResourceBlocks)
{
    for (const auto& [raw, label] : bandwidthRows) {
        feed(cellInfo().u8(20, raw).u8(21, raw));
        EXPECT_EQ(shown("Download Bandwidth"), label) << int{raw};
        EXPECT_EQ(shown("Upload Bandwidth"), label) << int{raw};
    }
}

TEST_F(LTEServingCellInfoTest, AntennaCountIsShownAndStillReportedAsUnknown)
{
    feed(PacketBuilder(0xB0C1).u8(20, 2).size(22));
    EXPECT_EQ(shown("Num Tx Antennas"), "2");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "LTE Serving Cell Info"},
                                         Line{3, "Received an unknown log message: 45249"}));
}

TEST_F(LTEServingCellInfoTest, AntennaCountOf21BytesChangesNothing)
{
    feed(PacketBuilder(0xB0C1).u8(20, 2).size(21));
    EXPECT_TRUE(values.empty());
    EXPECT_EQ(log.lines().size(), 1U);
}

TEST_F(LTEServingCellInfoTest, AnotherCodeIsReportedAndChangesNothing)
{
    feed(PacketBuilder(0xB17F).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.contains("Received an unknown log message: 45439"));
}

TEST_F(LTEServingCellInfoTest, CellMonitorShowsTheServingCell)
{
    monitor({fullServingCell()});
    EXPECT_EQ(shown("Tracking Area Code"), "4711");
    EXPECT_EQ(shown("Cell Identity"), "27447299");
    EXPECT_EQ(shown("Physical Cell ID"), "12");
    EXPECT_EQ(shown("Freq Band Indicator"), "7");
    EXPECT_EQ(shown("UARFCN"), "3050");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "LTE Serving Cell Info"}));
}

TEST_F(LTEServingCellInfoTest, CellInfoSupersedesTheUARFCN)
{
    monitor({fullServingCell()});
    feed(cellInfo());
    EXPECT_EQ(shown("UARFCN"), "(none)");
}

TEST_F(LTEServingCellInfoTest, CellMonitorSkipsCellsThatAreNotTheLTEServingOne)
{
    PlistDictionary neighbour =
        cellEntry(kQXCellMonitorRadioAccessTechnologyLTE, kQXCellMonitorCellTypeNeighbor);
    neighbour.set(kQXCellMonitorPID, 1);
    PlistDictionary umts =
        cellEntry(kQXCellMonitorRadioAccessTechnologyUMTS, kQXCellMonitorCellTypeServing);
    PlistDictionary withoutType{
        {kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyLTE}};
    monitor({neighbour, umts, withoutType, "no cell", fullServingCell()});
    EXPECT_EQ(shown("Physical Cell ID"), "12");
}

TEST_F(LTEServingCellInfoTest, CellMonitorTakesTheFirstServingCell)
{
    PlistDictionary second = fullServingCell();
    second.set(kQXCellMonitorPID, 99);
    monitor({fullServingCell(), second});
    EXPECT_EQ(shown("Physical Cell ID"), "12");
}

TEST_F(LTEServingCellInfoTest, CellMonitorWithoutAServingCellChangesNothing)
{
    monitor({});
    monitor({cellEntry(kQXCellMonitorRadioAccessTechnologyLTE, kQXCellMonitorCellTypeNeighbor)});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(LTEServingCellInfoTest, CellMonitorReportsEachMissingNumber)
{
    monitor({servingCell()});
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(3),
                ElementsAre("Serving Cell Info: Failed to retrieve TAC\n",
                            "Serving Cell Info: Failed to retrieve Cell ID\n",
                            "Serving Cell Info: Failed to retrieve Physical Cell ID\n",
                            "Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                            "Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST_F(LTEServingCellInfoTest, CellMonitorKeepsTheValueOfANumberThatIsMissing)
{
    monitor({fullServingCell()});
    PlistDictionary next = fullServingCell();
    next.remove(kQXCellMonitorTAC);
    next.set(kQXCellMonitorPID, 13);
    monitor({next});
    EXPECT_EQ(shown("Tracking Area Code"), "4711");
    EXPECT_EQ(shown("Physical Cell ID"), "13");
}

TEST_F(LTEServingCellInfoTest, CellMonitorThatDoesNotParseIsReportedTwice)
{
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "LTE Serving Cell Info"},
                                         Line{3, "Cell Info Array data could not be constructed"},
                                         Line{3, "Failed to get Cell Array\n"}));
}

TEST_F(LTEServingCellInfoTest, EveryShorterCellInfoIsHarmless)
{
    const Bytes packet = cellInfo().build();
    for (std::size_t size = 13; size < packet.size(); ++size)
        feed(Bytes(packet.begin(), packet.begin() + static_cast<std::ptrdiff_t>(size)));
    EXPECT_TRUE(values.empty());
}

} // namespace ventrik
