#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Packets/SharedRecords.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/RecordFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class GSMServingCellTest : public RecordFixture<GSMServingCell>
{
  protected:
    static PlistDictionary bareCell()
    {
        return cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, kQXCellMonitorCellTypeServing);
    }
    static PlistDictionary cell(std::int32_t cellIdentity, std::int32_t arfcn)
    {
        PlistDictionary result = bareCell();
        result.set(kQXCellMonitorCellId, cellIdentity);
        result.set(kQXCellMonitorARFCN, arfcn);
        return result;
    }
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

constexpr RecordSize sizes[] = {{0x5134, 26}, {0x5137, 29}, {0x5076, 17}};

constexpr RecordField fields[] = {
    {0x5134, 17, 16, 40123, "Cell ID", "40123"},
    {0x5134, 17, 16, 65535, "Cell ID", "65535"},
    {0x5134, 13, 16, 0, "ARFCN", "0"},
    {0x5134, 13, 16, 975, "ARFCN", "975"},
    {0x5134, 13, 16, 65535, "ARFCN", "65535"},
    {0x5134, 15, 16, 0x0102, "BSIC", "258"},
    {0x5134, 15, 16, 65535, "BSIC", "65535"},
    {0x5137, 15, 8, 0x6E, "RSSI", "110 dBm"},
    {0x5137, 15, 8, 0, "RSSI", "0 dBm"},
    {0x5137, 15, 8, 255, "RSSI", "255 dBm"},
    {0x5137, 16, 32, 74565, "C1 Value", "9029"}, // 0x12345
    {0x5137, 16, 32, 0xFFFFFFFF, "C1 Value", "65535"},
    {0x5137, 20, 32, 0x10020, "C2 Value", "32"},
    {0x5137, 20, 32, 0xFFFF, "C2 Value", "65535"},
    {0x5076, 13, 16, 515, "MA Dedicated ARFCN", "3"},
    {0x5076, 13, 16, 255, "MA Dedicated ARFCN", "255"},
    {0x5076, 13, 16, 256, "MA Dedicated ARFCN", "0"},
};

} // namespace

TEST_F(GSMServingCellTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "GSM Serving Cell");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x5134, 0x5137, 0x5076, 0xFF0001));
}

TEST_F(GSMServingCellTest, EachFieldIsReadFromItsBytesAlone)
{
    expectFields(fields, sizes);
}

TEST_F(GSMServingCellTest, EachRecordHasItsMinimumSize)
{
    expectMinimumSizes(sizes, "GSMServingCell");
}

TEST_F(GSMServingCellTest, EachRecordShowsItsKeysInOrder)
{
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5134).size(26)),
                ElementsAre("Cell ID", "ARFCN", "BSIC"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5137).size(29)),
                ElementsAre("RSSI", "C1 Value", "C2 Value"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5076).size(17)), ElementsAre("MA Dedicated ARFCN"));
    EXPECT_EQ(log.lines(), std::vector<Line>(3, Line{4, "GSMServingCell"}));
}

TEST_F(GSMServingCellTest, CellMonitorShowsTheFirstServingGSMCell)
{
    PlistDictionary umts = cell(1, 1);
    umts.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyUMTS);
    PlistDictionary neighbor = cell(2, 2);
    neighbor.set(kQXCellMonitorCellType, kQXCellMonitorCellTypeNeighbor);
    PlistDictionary withoutType = cell(3, 3);
    withoutType.remove(kQXCellMonitorCellType);
    PlistDictionary withoutTechnology = cell(4, 4);
    withoutTechnology.remove(kQXCellMonitorCellRadioAccessTechnology);
    monitor({"no cell", umts, neighbor, withoutType, withoutTechnology, cell(40123, 62),
             cell(40124, 63)});
    EXPECT_THAT(keysOf(values), ElementsAre("Cell ID", "ARFCN"));
    EXPECT_EQ(shown("Cell ID"), "40123");
    EXPECT_EQ(shown("ARFCN"), "62");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSMServingCell"}));
}

TEST_F(GSMServingCellTest, CellMonitorWithoutAServingGSMCellChangesNothing)
{
    monitor({});
    monitor({cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, kQXCellMonitorCellTypeNeighbor)});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(GSMServingCellTest, CellMonitorReportsEachMissingNumberAndTriesTheNext)
{
    monitor({cell(40123, 62)});
    log.clear();
    PlistDictionary half = bareCell();
    half.set(kQXCellMonitorCellId, "40124");
    half.set(kQXCellMonitorARFCN, 63);
    monitor({half});
    EXPECT_EQ(shown("Cell ID"), "40123");
    EXPECT_EQ(shown("ARFCN"), "63");
    monitor({bareCell()});
    EXPECT_EQ(shown("ARFCN"), "63");
    EXPECT_THAT(log.texts(3), ElementsAre("GSMServingCell: Failed to retrieve Cell ID\n",
                                          "GSMServingCell: Failed to retrieve Cell ID\n",
                                          "GSMServingCell: Failed to retrieve ARFCN\n"));
}

TEST_F(GSMServingCellTest, CellMonitorThatDoesNotParseChangesNothing)
{
    values.set("ARFCN", "62");
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cell(1, 1))); // no array
    EXPECT_EQ(values, (PlistDictionary{{"ARFCN", "62"}}));
    const Line trace{4, "GSMServingCell"};
    const Line unparsed{3, "Cell Info Array data could not be constructed"};
    const Line noArray{3, "Failed to get Cell Array\n"};
    EXPECT_THAT(log.lines(), ElementsAre(trace, unparsed, noArray, trace, unparsed, noArray));
}

TEST_F(GSMServingCellTest, TheRecordThatCameLastIsShownAndTheBSICStays)
{
    feed(PacketBuilder(0x5134).u16(13, 62).u16(15, 41).u16(17, 40123).size(26));
    monitor({cell(70000, 975)});
    EXPECT_EQ(shown("Cell ID"), "70000");
    EXPECT_EQ(shown("ARFCN"), "975");
    EXPECT_EQ(shown("BSIC"), "41");
    feed(PacketBuilder(0x5134).u16(13, 62).u16(15, 42).u16(17, 40123).size(26));
    EXPECT_EQ(shown("Cell ID"), "40123");
    EXPECT_EQ(shown("ARFCN"), "62");
    EXPECT_EQ(shown("BSIC"), "42");
}

TEST_F(GSMServingCellTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x51F6).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSMServingCell"},
                                         Line{3, "Received an unknown log message: 20982"}));
}

} // namespace ventrik
