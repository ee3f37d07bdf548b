#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/NeighboringCells.h"
#include "Packets/SharedRecords.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/ElementField.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

// Idle measurements of n neighbours, all bytes of them 0.
PacketBuilder measurements(std::uint8_t n)
{
    return PacketBuilder(0x5137).u8(28, n).size(29 + std::size_t{14} * n);
}

struct Pair {
    std::uint16_t arfcn;
    std::uint8_t bsic;
};

PacketBuilder bsicList(std::initializer_list<Pair> pairs)
{
    PacketBuilder packet(0x51FF);
    packet.u8(14, static_cast<std::uint8_t>(pairs.size()));
    std::size_t offset = 15;
    for (const auto& [arfcn, bsic] : pairs) {
        packet.u16(offset, arfcn).u8(offset + 2, bsic).u8(offset + 3, 0xFF);
        offset += 4;
    }
    return packet;
}

PlistDictionary bareNeighbor()
{
    return cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, kQXCellMonitorCellTypeNeighbor);
}

PlistDictionary neighbor(std::int32_t arfcn, std::int32_t rssi)
{
    PlistDictionary result = bareNeighbor();
    result.set(kQXCellMonitorARFCN, arfcn);
    result.set(kQXCellMonitorRSSI, rssi);
    return result;
}

class NeighboringCellsTest : public ListSectionFixture<NeighboringCells>
{
  protected:
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

constexpr ElementField fields[] = {
    {0, 16, 975, "ARFCN", "975"},
    {0, 16, 65535, "ARFCN", "65535"},
    {2, 8, 0, "RSSI", "0"},
    {2, 8, 200, "RSSI", "200"},
    {2, 8, 255, "RSSI", "255"},
    {3, 32, 21, "C1 Value", "21"},
    {3, 32, 0x10000, "C1 Value", "65536"},
    {3, 32, 0xFFFFFFFB, "C1 Value", "-5"},
    {3, 32, 0x80000000, "C1 Value", "-2147483648"},
};

} // namespace

TEST_F(NeighboringCellsTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Neighboring Cells");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x5137, 0x51FF, 0xFF0001));
}

TEST_F(NeighboringCellsTest, EachFieldIsReadFromItsBytesAlone)
{
    expectElementFields(fields, measurements(2), 43, 14,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shown(1, key);
                        });
}

TEST_F(NeighboringCellsTest, RowsHaveTheirKeysInOrder)
{
    feed(bsicList({{40, 7}}));
    feed(measurements(1).u16(29, 40));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()), ElementsAre("ARFCN", "RSSI", "C1 Value", "BSIC"));
    EXPECT_EQ(log.lines(), std::vector<Line>(2, Line{4, "NeighboringCells"}));
}

TEST_F(NeighboringCellsTest, RowsKeepTheOrderOfTheRecord)
{
    feed(measurements(3).u16(29, 700).u16(43, 5).u16(57, 62));
    EXPECT_EQ(shown(0, "ARFCN"), "700");
    EXPECT_EQ(shown(1, "ARFCN"), "5");
    EXPECT_EQ(shown(2, "ARFCN"), "62");
}

TEST_F(NeighboringCellsTest, TheBSICListNamesTheNeighborsItKnows)
{
    feed(bsicList({{40, 7}, {62, 255}}));
    feed(measurements(3).u16(29, 40).u16(43, 41).u16(57, 62));
    EXPECT_EQ(shown(0, "BSIC"), "7");
    EXPECT_EQ(shown(1, "BSIC"), "(none)");
    EXPECT_EQ(shown(2, "BSIC"), "255");
}

TEST_F(NeighboringCellsTest, TheBSICListIsAsLongAsItsCountSays)
{
    feed(bsicList({{512, 7}, {513, 8}}).u8(14, 1));
    feed(measurements(2).u16(29, 512).u16(43, 513));
    EXPECT_EQ(shown(0, "BSIC"), "7");
    EXPECT_EQ(shown(1, "BSIC"), "(none)");
}

TEST_F(NeighboringCellsTest, TheBSICListAppliesFromTheNextMeasurements)
{
    feed(measurements(1).u16(29, 40));
    feed(bsicList({{40, 7}}));
    EXPECT_EQ(shown(0, "BSIC"), "(none)");
    feed(measurements(1).u16(29, 40));
    EXPECT_EQ(shown(0, "BSIC"), "7");
}

TEST_F(NeighboringCellsTest, ANewBSICListReplacesTheOldOne)
{
    feed(bsicList({{40, 7}, {41, 8}}));
    feed(bsicList({{40, 9}}));
    feed(measurements(2).u16(29, 40).u16(43, 41));
    EXPECT_EQ(shown(0, "BSIC"), "9");
    EXPECT_EQ(shown(1, "BSIC"), "(none)");
    feed(bsicList({}));
    feed(measurements(1).u16(29, 40));
    EXPECT_EQ(shown(0, "BSIC"), "(none)");
}

TEST_F(NeighboringCellsTest, OfTwoBSICsForOneARFCNTheLaterCounts)
{
    feed(bsicList({{40, 7}, {40, 8}}));
    feed(measurements(1).u16(29, 40));
    EXPECT_EQ(shown(0, "BSIC"), "8");
}

TEST_F(NeighboringCellsTest, ABSICNeedsItsThreeBytes)
{
    feed(bsicList({{40, 7}, {41, 8}}).size(21));
    feed(measurements(2).u16(29, 40).u16(43, 41));
    EXPECT_EQ(shown(0, "BSIC"), "7");
    EXPECT_EQ(shown(1, "BSIC"), "(none)");
    feed(bsicList({{40, 7}, {41, 8}}).size(22));
    feed(measurements(2).u16(29, 40).u16(43, 41));
    EXPECT_EQ(shown(1, "BSIC"), "8");
}

TEST_F(NeighboringCellsTest, ABSICListOf14BytesKeepsTheOldOne)
{
    feed(bsicList({{40, 7}}));
    feed(PacketBuilder(0x51FF).size(14));
    feed(measurements(1).u16(29, 40));
    EXPECT_EQ(shown(0, "BSIC"), "7");
    feed(PacketBuilder(0x51FF).size(15));
    feed(measurements(1).u16(29, 40));
    EXPECT_EQ(shown(0, "BSIC"), "(none)");
}

TEST_F(NeighboringCellsTest, TheBSICListLeavesTheRows)
{
    rows.append("row");
    feed(bsicList({{40, 7}}));
    EXPECT_EQ(rows, PlistArray{"row"});
}

TEST_F(NeighboringCellsTest, Shows255NeighborsAtMost)
{
    feed(measurements(255).u16(29 + 254 * 14, 124));
    EXPECT_EQ(rows.size(), 255U);
    EXPECT_EQ(shown(254, "ARFCN"), "124");
}

TEST_F(NeighboringCellsTest, MeasurementsWithoutNeighborsEmptyTheList)
{
    rows.append("row");
    feed(measurements(0));
    EXPECT_TRUE(rows.empty());
}

TEST_F(NeighboringCellsTest, ANeighborNeedsItsSevenBytes)
{
    feed(measurements(2).size(49));
    EXPECT_EQ(rows.size(), 1U);
    feed(measurements(2).size(50));
    EXPECT_EQ(rows.size(), 2U);
    feed(measurements(2).size(29));
    EXPECT_TRUE(rows.empty());
}

TEST_F(NeighboringCellsTest, MeasurementsOf28BytesLeaveTheListAsItWas)
{
    rows.append("row");
    feed(PacketBuilder(0x5137).size(28));
    EXPECT_EQ(rows, PlistArray{"row"});
    EXPECT_THAT(log.texts(), ElementsAre("NeighboringCells"));
}

TEST_F(NeighboringCellsTest, CellMonitorShowsTheGSMNeighborsInTheirOrder)
{
    PlistDictionary umts = neighbor(1, -40);
    umts.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyUMTS);
    PlistDictionary serving = neighbor(2, -40);
    serving.set(kQXCellMonitorCellType, kQXCellMonitorCellTypeServing);
    PlistDictionary withoutTechnology = neighbor(3, -40);
    withoutTechnology.remove(kQXCellMonitorCellRadioAccessTechnology);
    monitor({neighbor(700, -50), umts, serving, "no cell", withoutTechnology, neighbor(5, -41)});
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()), ElementsAre("ARFCN", "RSSI"));
    EXPECT_EQ(shown(0, "ARFCN"), "700");
    EXPECT_EQ(shown(0, "RSSI"), "-100 dBm");
    EXPECT_EQ(shown(1, "ARFCN"), "5");
    EXPECT_EQ(shown(1, "RSSI"), "-82 dBm");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "NeighboringCells"}));
}

TEST_F(NeighboringCellsTest, CellMonitorLevelsAreTheLow16BitsSignedAndDoubled)
{
    monitor({neighbor(1, 32767), neighbor(2, 0x17FFF), neighbor(3, 0x1FFCE), // 0xFFCE is -50
             neighbor(4, 32768), neighbor(5, 32766), neighbor(6, 0)});
    const std::vector<std::string> levels{"", "", "-100 dBm", "-65536 dBm", "65532 dBm", "0 dBm"};
    ASSERT_EQ(rows.size(), levels.size());
    for (std::size_t i = 0; i < levels.size(); ++i)
        EXPECT_EQ(shown(i, "RSSI"), levels[i]) << i;
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(NeighboringCellsTest, CellMonitorReportsEachMissingNumberAndKeepsTheRow)
{
    PlistDictionary half = neighbor(7, -50);
    half.set(kQXCellMonitorRSSI, true);
    monitor({bareNeighbor(), half});
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_TRUE(rows[0].dictionary()->empty());
    EXPECT_THAT(keysOf(*rows[1].dictionary()), ElementsAre("ARFCN"));
    EXPECT_THAT(log.texts(3), ElementsAre("NeighboringCells: Failed to retrieve ARFCN\n",
                                          "NeighboringCells: Failed to retrieve RSSI\n",
                                          "NeighboringCells: Failed to retrieve RSSI\n"));
}

TEST_F(NeighboringCellsTest, CellMonitorDoesNotAskTheBSICList)
{
    feed(bsicList({{40, 7}}));
    monitor({neighbor(40, -50)});
    EXPECT_EQ(shown(0, "BSIC"), "(none)");
}

TEST_F(NeighboringCellsTest, TheRecordThatCameLastIsShown)
{
    monitor({neighbor(40, -50), neighbor(41, -51)});
    feed(measurements(1).u16(29, 62));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "ARFCN"), "62");
    monitor({neighbor(40, -50)});
    EXPECT_EQ(shown(0, "C1 Value"), "(none)");
}

TEST_F(NeighboringCellsTest, AnotherCodeIsReported)
{
    rows.append("row");
    feed(PacketBuilder(0x5134).size(60));
    EXPECT_EQ(rows, PlistArray{"row"});
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "NeighboringCells"},
                                         Line{3, "Received an unknown log message: 20788"}));
}

} // namespace ventrik
