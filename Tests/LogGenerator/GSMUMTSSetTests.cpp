#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/ElementField.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

// A record of u UMTS cells, all bytes of them 0.
PacketBuilder rankedCells(std::uint8_t u)
{
    return PacketBuilder(0x4005).u8(13, u).size(15 + std::size_t{10} * u);
}

constexpr ElementField fields[] = {
    {2, 16, 0, "Scrambling Code", "0"},
    {2, 16, 511, "Scrambling Code", "511"},
    {2, 16, 65535, "Scrambling Code", "65535"},
    {4, 8, 0xB0, "RSCP", "-101 dB"}, // -80 - 21
    {4, 8, 0, "RSCP", "-21 dB"},
    {4, 8, 127, "RSCP", "106 dB"},
    {4, 8, 128, "RSCP", "-149 dB"},                  // -128 - 21
    {7, 8, 0xF9, "Energy Per Chip", "-3.500000 dB"}, // -7 / 2
    {7, 8, 0, "Energy Per Chip", "0.000000 dB"},
    {7, 8, 127, "Energy Per Chip", "63.500000 dB"},
    {7, 8, 128, "Energy Per Chip", "-64.000000 dB"},
    {0, 16, 10700, "Downlink Frequency", "10700"},
    {0, 16, 0x8000, "Downlink Frequency", "-32768"},
    {8, 16, 32767, "Ranking Value", "32767"},
    {8, 16, 0xFFFE, "Ranking Value", "-2"},
    {5, 16, 0xFF9C, "Rank Cell RSCP", "-100 dB"},
    {5, 16, 32767, "Rank Cell RSCP", "32767 dB"},
};

PlistDictionary bareNeighbor()
{
    return cellEntry(kQXCellMonitorRadioAccessTechnologyUMTS, kQXCellMonitorCellTypeNeighbor);
}

PlistDictionary neighbor(std::int32_t code)
{
    PlistDictionary result = bareNeighbor();
    result.set(kQXCellMonitorUARFCN, 10700);
    result.set(kQXCellMonitorSCN, code);
    result.set(kQXCellMonitorRSCP, -95);
    result.set(kQXCellMonitorECN0, -7);
    return result;
}

class UMTSSetTest : public ListSectionFixture<UMTSSet>
{
  protected:
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

} // namespace

TEST_F(UMTSSetTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "UMTS Set");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x4005, 0xFF0001));
}

TEST_F(UMTSSetTest, EachFieldIsReadFromItsBytesAlone)
{
    section.readRecords(RecordsMode::Base);
    expectElementFields(fields, rankedCells(2), 25, 10,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shown(1, key);
                        });
}

TEST_F(UMTSSetTest, RankedRowsHaveTheirKeysInOrder)
{
    feed(rankedCells(1));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("Scrambling Code", "RSCP", "Energy Per Chip", "Downlink Frequency",
                            "Ranking Value", "Rank Cell RSCP"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "UMTSSet"}));
}

TEST_F(UMTSSetTest, Shows255RankedCellsAtMost)
{
    feed(rankedCells(255).u16(15 + 254 * 10 + 2, 511));
    EXPECT_EQ(rows.size(), 255U);
    EXPECT_EQ(shown(254, "Scrambling Code"), "511");
}

TEST_F(UMTSSetTest, ARecordWithoutUMTSCellsEmptiesTheList)
{
    rows.append("row");
    feed(rankedCells(0).u8(14, 1).size(22));
    EXPECT_TRUE(rows.empty());
    rows.append("row");
    feed(rankedCells(0).size(15));
    EXPECT_TRUE(rows.empty());
}

TEST_F(UMTSSetTest, ARankedCellNeedsItsTenBytes)
{
    feed(rankedCells(2).size(34));
    EXPECT_EQ(rows.size(), 1U);
    feed(rankedCells(2).size(35));
    EXPECT_EQ(rows.size(), 2U);
    feed(rankedCells(2).size(24));
    EXPECT_TRUE(rows.empty());
}

TEST_F(UMTSSetTest, ARecordOf14BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(rankedCells(1).size(14));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("UMTSSet"));
}

TEST_F(UMTSSetTest, AnotherCodeIsReported)
{
    rows.append("row");
    feed(PacketBuilder(0x417A).size(60));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(),
                ElementsAre(Line{4, "UMTSSet"}, Line{3, "Received an unknown log message: 16762"}));
}

TEST_F(UMTSSetTest, CellMonitorShowsANeighborsValuesInOrder)
{
    monitor({neighbor(300)});
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("UARFCN", "Scrambling Code", "RSCP", "Energy Per Chip"));
    EXPECT_EQ(shown(0, "UARFCN"), "10700");
    EXPECT_EQ(shown(0, "Scrambling Code"), "300");
    EXPECT_EQ(shown(0, "RSCP"), "-95 dBm");
    EXPECT_EQ(shown(0, "Energy Per Chip"), "-7 dB");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "UMTSSet"}));
}

TEST_F(UMTSSetTest, CellMonitorKeepsTheNeighborsInTheirOrder)
{
    PlistDictionary gsm = neighbor(3);
    gsm.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyGSM);
    PlistDictionary serving = neighbor(4);
    serving.set(kQXCellMonitorCellType, kQXCellMonitorCellTypeServing);
    PlistDictionary withoutType = neighbor(5);
    withoutType.remove(kQXCellMonitorCellType);
    monitor({neighbor(2), gsm, serving, "no cell", withoutType, neighbor(1)});
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_EQ(shown(0, "Scrambling Code"), "2");
    EXPECT_EQ(shown(1, "Scrambling Code"), "1");
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UMTSSetTest, CellMonitorShowsAnEmptyTextForALevelWithoutAValue)
{
    PlistDictionary without = neighbor(1);
    without.set(kQXCellMonitorRSCP, 32767);
    without.set(kQXCellMonitorECN0, 32767);
    monitor({without});
    EXPECT_EQ(shown(0, "RSCP"), "");
    EXPECT_EQ(shown(0, "Energy Per Chip"), "");
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UMTSSetTest, CellMonitorLevelsAreTheLow16BitsSigned)
{
    PlistDictionary wide = neighbor(1);
    wide.set(kQXCellMonitorRSCP, 0x1FF9C); // 0xFF9C is -100
    wide.set(kQXCellMonitorECN0, 32768);
    monitor({wide});
    EXPECT_EQ(shown(0, "RSCP"), "-100 dBm");
    EXPECT_EQ(shown(0, "Energy Per Chip"), "-32768 dB");
    wide.set(kQXCellMonitorRSCP, 0x17FFF); // 32767 in its low 16 bits
    wide.set(kQXCellMonitorECN0, 0x27FFF);
    monitor({wide});
    EXPECT_EQ(shown(0, "RSCP"), "");
    EXPECT_EQ(shown(0, "Energy Per Chip"), "");
}

TEST_F(UMTSSetTest, CellMonitorFrequencyAndCodeKeep32Bits)
{
    PlistDictionary wide = neighbor(0x10001);
    wide.set(kQXCellMonitorUARFCN, 32767 + 65536);
    monitor({wide});
    EXPECT_EQ(shown(0, "UARFCN"), "98303");
    EXPECT_EQ(shown(0, "Scrambling Code"), "65537");
}

TEST_F(UMTSSetTest, CellMonitorReportsEachMissingNumberAndKeepsTheRow)
{
    PlistDictionary half = neighbor(7);
    half.remove(kQXCellMonitorUARFCN);
    half.set(kQXCellMonitorRSCP, "-95");
    monitor({bareNeighbor(), half});
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_TRUE(rows[0].dictionary()->empty());
    EXPECT_THAT(keysOf(*rows[1].dictionary()), ElementsAre("Scrambling Code", "Energy Per Chip"));
    EXPECT_THAT(log.texts(3), ElementsAre("UMTSSet: Failed to retrieve UARFCN\n",
                                          "UMTSSet: Failed to retrieve Scrambling Code\n",
                                          "UMTSSet: Failed to retrieve RSCP\n",
                                          "UMTSSet: Failed to retrieve Energy Per Chip\n",
                                          "UMTSSet: Failed to retrieve UARFCN\n",
                                          "UMTSSet: Failed to retrieve RSCP\n"));
}

TEST_F(UMTSSetTest, TheRecordThatCameLastIsShown)
{
    monitor({neighbor(300), neighbor(301)});
    feed(rankedCells(1));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "UARFCN"), "(none)");
    monitor({neighbor(300)});
    EXPECT_EQ(shown(0, "Downlink Frequency"), "(none)");
}

} // namespace ventrik
