#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/UTRAN/UTRANServingCellInfo.h"
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

class UTRANServingCellInfoTest : public SectionFixture<UTRANServingCellInfo>
{
  protected:
    static PacketBuilder cellInfo() { return PacketBuilder(0xD0E2).size(26); }
    static PlistDictionary servingCell()
    {
        return cellEntry(kQXCellMonitorRadioAccessTechnologyUTRAN2, kQXCellMonitorCellTypeServing);
    }
    static PlistDictionary
    fullServingCell(std::string_view technology = kQXCellMonitorRadioAccessTechnologyUTRAN2,
                    std::string_view type = kQXCellMonitorCellTypeServing)
    {
        PlistDictionary result = cellEntry(technology, type);
        result.set(kQXCellMonitorLAC, 4711);
        result.set(kQXCellMonitorCellId, 667905);
        result.set(kQXCellMonitorBandInfo, 34);
        result.set(kQXCellMonitorSCN, 47);
        result.set(kQXCellMonitorUARFCN, 10054);
        return result;
    }
    void monitor(const PlistArray& cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

struct FieldRow {
    std::size_t offset;
    unsigned width;
    std::uint32_t raw;
    std::string_view key;
    std::string_view text;
};

constexpr FieldRow fieldRows[] = {
    {14, 8, 0, "Cell Access Restrictions", "0"},
    {14, 8, 255, "Cell Access Restrictions", "255"},
    {15, 8, 21, "URA ID", "21"},
    {15, 8, 255, "URA ID", "255"},
    {17, 16, 10054, "Uplink UARFCN", "10054"},
    {17, 16, 65535, "Uplink UARFCN", "65535"},
    {19, 16, 0x2746, "Downlink UARFCN", "10054"}, // 39 * 256 + 70
    {19, 16, 65535, "Downlink UARFCN", "65535"},
    {21, 32, 0x00A3101, "Cell ID", "667905"}, // 10 * 65536 + 49 * 256 + 1
    {21, 32, 0x7FFFFFFF, "Cell ID", "2147483647"},
    {21, 32, 0x80000000, "Cell ID", "-2147483648"},
    {21, 32, 0xFFFFFFFF, "Cell ID", "-1"},
    {25, 8, 0x00, "Allowed Access", "All Calls"},
    {25, 8, 0x01, "Allowed Access", "Emergency Calls Only"},
    {25, 8, 0x02, "Allowed Access", "All Calls"},
    {25, 8, 0x03, "Allowed Access", "Emergency Calls Only"},
    {25, 8, 0xFE, "Allowed Access", "All Calls"},
    {25, 8, 0xFF, "Allowed Access", "Emergency Calls Only"},
};

struct MonitorRow {
    std::string_view cellKey;
    std::string_view nameInLog;
    std::vector<std::string> displayKeys;
};

const MonitorRow monitorRows[] = {
    {kQXCellMonitorLAC, "LAC", {"Local Area Code"}},
    {kQXCellMonitorCellId, "Cell ID", {"Cell ID"}},
    {kQXCellMonitorBandInfo, "Freq Band Indicator", {"Freq Band Indicator"}},
    {kQXCellMonitorSCN, "Cell Scrambling Code", {"Cell Scrambling Code"}},
    {kQXCellMonitorUARFCN, "UARFCN", {"Uplink UARFCN", "Downlink UARFCN"}},
};

} // namespace

TEST_F(UTRANServingCellInfoTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Serving Cell Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD0E2, 0xFF0001));
}

TEST_F(UTRANServingCellInfoTest, EachFieldIsReadFromItsBytesAndFormatted)
{
    for (const FieldRow& row : fieldRows) {
        feed(cellInfo().bits(row.offset, 0, row.width, row.raw));
        EXPECT_EQ(shown(row.key), row.text) << row.key << " raw " << row.raw;
    }
}

TEST_F(UTRANServingCellInfoTest, NoFieldIsTouchedByTheBytesAroundIt)
{
    for (const FieldRow& row : fieldRows) {
        PacketBuilder packet = cellInfo();
        for (std::size_t offset = 13; offset < 26; ++offset)
            packet.u8(offset, 0xFF);
        feed(packet.bits(row.offset, 0, row.width, row.raw));
        EXPECT_EQ(shown(row.key), row.text) << row.key << " raw " << row.raw;
    }
}

TEST_F(UTRANServingCellInfoTest, CellInfoWritesItsKeysInOrder)
{
    feed(cellInfo());
    EXPECT_THAT(keysOf(values),
                ElementsAre("Cell Access Restrictions", "Cell ID", "Downlink UARFCN",
                            "Uplink UARFCN", "URA ID", "Allowed Access"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving Cell Info"}));
}

TEST_F(UTRANServingCellInfoTest, EveryCellInfoBelow26BytesChangesNothing)
{
    for (std::size_t size = 13; size < 26; ++size)
        feed(cellInfo().size(size));
    EXPECT_TRUE(values.empty());
    EXPECT_EQ(log.lines(), std::vector<Line>(13, Line{4, "Serving Cell Info"}));
}

TEST_F(UTRANServingCellInfoTest, AnotherCodeChangesNothingAndIsNotReported)
{
    feed(PacketBuilder(0xD0E0).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving Cell Info"}));
}

TEST_F(UTRANServingCellInfoTest, CellMonitorShowsTheServingCell)
{
    monitor({fullServingCell()});
    EXPECT_EQ(shown("Local Area Code"), "4711");
    EXPECT_EQ(shown("Cell ID"), "667905");
    EXPECT_EQ(shown("Freq Band Indicator"), "34");
    EXPECT_EQ(shown("Cell Scrambling Code"), "47");
    EXPECT_EQ(shown("Uplink UARFCN"), "10054");
    EXPECT_EQ(shown("Downlink UARFCN"), "10054");
    EXPECT_EQ(values.size(), 6U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving Cell Info"}));
}

TEST_F(UTRANServingCellInfoTest, CellMonitorNumbersAreSigned32Bits)
{
    PlistDictionary serving = fullServingCell();
    serving.set(kQXCellMonitorCellId, 4294967295);
    serving.set(kQXCellMonitorSCN, -3);
    serving.set(kQXCellMonitorLAC, 12.9);
    monitor({serving});
    EXPECT_EQ(shown("Cell ID"), "-1");
    EXPECT_EQ(shown("Cell Scrambling Code"), "-3");
    EXPECT_EQ(shown("Local Area Code"), "12");
}

TEST_F(UTRANServingCellInfoTest, TheLaterPacketWins)
{
    feed(cellInfo().u16(17, 1).u16(19, 2).u32(21, 3));
    monitor({fullServingCell()});
    EXPECT_EQ(shown("Cell ID"), "667905");
    EXPECT_EQ(shown("Uplink UARFCN"), "10054");
    feed(cellInfo().u16(17, 1).u16(19, 2).u32(21, 3));
    EXPECT_EQ(shown("Cell ID"), "3");
    EXPECT_EQ(shown("Uplink UARFCN"), "1");
    EXPECT_EQ(shown("Downlink UARFCN"), "2");
    EXPECT_EQ(shown("Local Area Code"), "4711");
}

TEST_F(UTRANServingCellInfoTest, ServingCellsOfOtherTechnologiesChangeNothing)
{
    monitor({fullServingCell(kQXCellMonitorRadioAccessTechnologyGSM),
             fullServingCell(kQXCellMonitorRadioAccessTechnologyUMTS),
             fullServingCell(kQXCellMonitorRadioAccessTechnologyLTE)});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UTRANServingCellInfoTest, CellsThatAreNotTheServingOneAreSkipped)
{
    PlistDictionary withoutType = fullServingCell();
    withoutType.remove(kQXCellMonitorCellType);
    PlistDictionary withoutTechnology = fullServingCell();
    withoutTechnology.remove(kQXCellMonitorCellRadioAccessTechnology);
    monitor(
        {fullServingCell(kQXCellMonitorRadioAccessTechnologyUTRAN2, kQXCellMonitorCellTypeNeighbor),
         withoutType, withoutTechnology, "no cell", 5});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UTRANServingCellInfoTest, OfSeveralServingCellsTheLastOnesValuesRemain)
{
    PlistDictionary second = fullServingCell();
    second.set(kQXCellMonitorSCN, 99);
    second.remove(kQXCellMonitorLAC);
    monitor({fullServingCell(), second});
    EXPECT_EQ(shown("Cell Scrambling Code"), "99");
    EXPECT_EQ(shown("Local Area Code"), "4711");
    EXPECT_THAT(log.texts(3), ElementsAre("Serving Cell Info: Failed to retrieve LAC\n"));
}

TEST_F(UTRANServingCellInfoTest, AMissingNumberIsReportedAndTheOthersAreShown)
{
    for (const MonitorRow& row : monitorRows) {
        values.clear();
        log.clear();
        PlistDictionary serving = fullServingCell();
        serving.remove(row.cellKey);
        monitor({serving});
        EXPECT_EQ(values.size(), 6 - row.displayKeys.size()) << row.nameInLog;
        for (const std::string& key : row.displayKeys)
            EXPECT_EQ(shown(key), "(none)");
        EXPECT_THAT(log.lines(),
                    ElementsAre(Line{4, "Serving Cell Info"},
                                Line{3, fmt::format("Serving Cell Info: Failed to retrieve {}\n",
                                                    row.nameInLog)}));
    }
}

TEST_F(UTRANServingCellInfoTest, MissingNumbersAreReportedInOrder)
{
    PlistDictionary serving = servingCell();
    serving.set(kQXCellMonitorLAC, "4711"); // a string is no number
    monitor({serving});
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(3),
                ElementsAre("Serving Cell Info: Failed to retrieve LAC\n",
                            "Serving Cell Info: Failed to retrieve Cell ID\n",
                            "Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                            "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n",
                            "Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST_F(UTRANServingCellInfoTest, AMissingNumberKeepsItsLastValue)
{
    monitor({fullServingCell()});
    monitor({servingCell()});
    EXPECT_EQ(shown("Local Area Code"), "4711");
    EXPECT_EQ(shown("Downlink UARFCN"), "10054");
}

TEST_F(UTRANServingCellInfoTest, AnEmptyCellListChangesNothing)
{
    monitor({});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UTRANServingCellInfoTest, AListThatDoesNotParseIsReportedOnce)
{
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode));
    feed(propertyListPacket(SharedRecords::cellMonitor.logCode, fullServingCell()));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(3), ElementsAre("Cell Info Array data could not be constructed",
                                          "Cell Info Array data could not be constructed",
                                          "Cell Info Array data could not be constructed"));
}

TEST_F(UTRANServingCellInfoTest, WithoutAContainerPacketsAreHarmless)
{
    UTRANServingCellInfo unbound(log);
    const Bytes info = cellInfo().build();
    const Bytes cells =
        propertyListPacket(SharedRecords::cellMonitor.logCode, PlistArray{fullServingCell()});
    unbound.updateWithData(LogPacket(info), 0xD0E2);
    unbound.updateWithData(LogPacket(cells), SharedRecords::cellMonitor.logCode);
    EXPECT_TRUE(values.empty());
}

} // namespace ventrik
