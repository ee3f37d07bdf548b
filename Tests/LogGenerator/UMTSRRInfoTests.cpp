#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/UMTSRRInfo.h"
#include "Packets/SharedRecords.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/RecordFixture.h"

#include <cstdio>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class UMTSRRInfoTest : public RecordFixture<UMTSRRInfo>
{
  protected:
    static PacketBuilder powers(std::initializer_list<int> samples)
    {
        PacketBuilder packet(0x4031);
        packet.u8(14, static_cast<std::uint8_t>(samples.size())).size(16 + 14 * samples.size());
        std::size_t offset = 16;
        for (const int sample : samples) {
            packet.u16(offset + 4, static_cast<std::uint16_t>(sample));
            offset += 14;
        }
        return packet;
    }
    static PlistDictionary bareCell()
    {
        return cellEntry(kQXCellMonitorRadioAccessTechnologyUMTS, kQXCellMonitorCellTypeServing);
    }
    static PlistDictionary cell(std::int32_t cellIdentity)
    {
        PlistDictionary result = bareCell();
        result.set(kQXCellMonitorCellId, cellIdentity);
        result.set(kQXCellMonitorUARFCN, 10700);
        result.set(kQXCellMonitorSCN, 300);
        return result;
    }
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

// As the C library prints the quotient of 0 by 0 on this machine.
std::string noNumber()
{
    const volatile double zero = 0;
    char text[32];
    std::snprintf(text, sizeof text, "%4.2f dBm", zero / zero);
    return text;
}

constexpr RecordSize sizes[] = {{0x4125, 14}, {0x4127, 29}, {0x4157, 19}};

constexpr RecordField fields[] = {
    {0x4125, 13, 8, 0, "RRC State", "Disconnected"},
    {0x4125, 13, 8, 1, "RRC State", "Connecting"},
    {0x4125, 13, 8, 2, "RRC State", "CELL_FACH"},
    {0x4125, 13, 8, 3, "RRC State", "CELL_DCH"},
    {0x4125, 13, 8, 4, "RRC State", "CELL_PCH"},
    {0x4125, 13, 8, 5, "RRC State", "URA_PCH"},
    {0x4125, 13, 8, 6, "RRC State", "Unknown"},
    {0x4125, 13, 8, 255, "RRC State", "Unknown"},
    {0x4127, 21, 32, 70123456, "Cell ID", "70123456"},
    {0x4127, 21, 32, 0x80000000, "Cell ID", "-2147483648"},
    {0x4127, 17, 32, 10700, "Downlink Frequency", "10700"},
    {0x4127, 17, 32, 0xFFFFFFFF, "Downlink Frequency", "-1"},
    {0x4127, 13, 32, 9750, "Uplink Frequency", "9750"},
    {0x4127, 13, 32, 0xFFFFFFFE, "Uplink Frequency", "-2"},
    {0x4127, 25, 16, 258, "URA ID", "258"},
    {0x4127, 25, 16, 65535, "URA ID", "65535"},
    {0x4157, 13, 8, 0, "Ciphering", "Disabled"},
    {0x4157, 13, 8, 1, "Ciphering", "Enabled"},
    {0x4157, 13, 8, 2, "Ciphering", "Enabled"},
    {0x4157, 13, 8, 255, "Ciphering", "Enabled"},
};

struct PowerRow {
    std::initializer_list<int> samples;
    std::string_view text;
};

} // namespace

TEST_F(UMTSRRInfoTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "UMTS RR Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x4125, 0x4031, 0x4127, 0x4157, 0xFF0001));
}

TEST_F(UMTSRRInfoTest, EachFieldIsReadFromItsBytesAlone)
{
    expectFields(fields, sizes);
}

TEST_F(UMTSRRInfoTest, EachRecordHasItsMinimumSize)
{
    expectMinimumSizes(sizes, "UMTSRRInfo");
    const RecordSize powerSize[] = {{0x4031, 16}};
    expectMinimumSizes(powerSize, "UMTSRRInfo");
}

TEST_F(UMTSRRInfoTest, EachRecordShowsItsKeysInOrder)
{
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x4125).size(14)), ElementsAre("RRC State"));
    EXPECT_THAT(keysOfRecord(powers({100})), ElementsAre("Transmit Power"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x4127).size(29)),
                ElementsAre("Cell ID", "Downlink Frequency", "Uplink Frequency", "URA ID"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x4157).size(19)), ElementsAre("Ciphering"));
    EXPECT_EQ(log.lines(), std::vector<Line>(4, Line{4, "UMTSRRInfo"}));
}

TEST_F(UMTSRRInfoTest, TransmitPowerIsTheMeanOfTheSamplesInWholeDb)
{
    const PowerRow rows[] = {
        {{100}, "-9.00 dBm"},           // 612 / 10 = 61
        {{-600}, "-78.00 dBm"},         // -88 / 10 = -8
        {{100, -600}, "-43.50 dBm"},    // (-9 - 78) / 2
        {{-512}, "-70.00 dBm"},         // 0
        {{-521}, "-70.00 dBm"},         // -9 / 10 = 0: toward zero
        {{-522}, "-71.00 dBm"},         // -10 / 10 = -1
        {{-503}, "-70.00 dBm"},         // 9 / 10 = 0
        {{-502}, "-69.00 dBm"},         // 10 / 10 = 1
        {{32767}, "3257.00 dBm"},       // 33279 / 10 = 3327
        {{-32768}, "-3295.00 dBm"},     // -32256 / 10 = -3225
        {{0, 100, 0}, "-9.00 dBm"},     // 0 is no sample
        {{100, 110, 120}, "-8.00 dBm"}, // -9, -8, -7
        {{100, 100, 110}, "-8.67 dBm"}, // -26 / 3
    };
    for (const PowerRow& row : rows) {
        feed(powers(row.samples));
        EXPECT_EQ(shown("Transmit Power"), row.text);
    }
}

TEST_F(UMTSRRInfoTest, TransmitPowerReadsTheTwoBytesOfASampleAlone)
{
    feed(PacketBuilder(0x4031).bytes(13, Bytes(31, 0xFF)).u8(14, 2).u16(20, 100).u16(34, 110));
    EXPECT_EQ(shown("Transmit Power"), "-8.50 dBm");
}

TEST_F(UMTSRRInfoTest, TransmitPowerWithoutASampleIsNoNumber)
{
    feed(powers({}));
    EXPECT_EQ(shown("Transmit Power"), noNumber());
    feed(powers({100}));
    feed(powers({0, 0}));
    EXPECT_EQ(shown("Transmit Power"), noNumber());
}

TEST_F(UMTSRRInfoTest, ASampleNeedsTheBytesOfItsPower)
{
    feed(powers({100, 200}).size(35)); // the second sample's power stands at 34 and 35
    EXPECT_EQ(shown("Transmit Power"), "-9.00 dBm");
    feed(powers({100, 200}).size(36));
    EXPECT_EQ(shown("Transmit Power"), "-4.00 dBm"); // -9 and 1
}

TEST_F(UMTSRRInfoTest, Averages255SamplesAtMost)
{
    PacketBuilder packet = PacketBuilder(0x4031).u8(14, 255).size(16 + 14 * 255);
    packet.u16(16 + 254 * 14 + 4, 100);
    feed(packet);
    EXPECT_EQ(shown("Transmit Power"), "-9.00 dBm");
}

TEST_F(UMTSRRInfoTest, CellMonitorShowsTheFirstServingUMTSCell)
{
    PlistDictionary gsm = cell(1);
    gsm.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyGSM);
    PlistDictionary neighbor = cell(2);
    neighbor.set(kQXCellMonitorCellType, kQXCellMonitorCellTypeNeighbor);
    PlistDictionary withoutType = cell(3);
    withoutType.remove(kQXCellMonitorCellType);
    monitor({gsm, neighbor, "no cell", withoutType, cell(70123456), cell(5)});
    EXPECT_THAT(keysOf(values), ElementsAre("Cell ID", "UARFCN", "Scrambling Code"));
    EXPECT_EQ(shown("Cell ID"), "70123456");
    EXPECT_EQ(shown("UARFCN"), "10700");
    EXPECT_EQ(shown("Scrambling Code"), "300");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "UMTSRRInfo"}));
}

TEST_F(UMTSRRInfoTest, CellMonitorWithoutAServingUMTSCellChangesNothing)
{
    monitor({});
    monitor({cellEntry(kQXCellMonitorRadioAccessTechnologyUMTS, kQXCellMonitorCellTypeNeighbor)});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(UMTSRRInfoTest, CellMonitorReportsEachMissingNumberAndTriesTheNext)
{
    monitor({cell(70123456)});
    log.clear();
    PlistDictionary half = bareCell();
    half.set(kQXCellMonitorSCN, 301);
    half.set(kQXCellMonitorUARFCN, "10701");
    monitor({half});
    EXPECT_EQ(shown("Cell ID"), "70123456");
    EXPECT_EQ(shown("UARFCN"), "10700");
    EXPECT_EQ(shown("Scrambling Code"), "301");
    monitor({bareCell()});
    EXPECT_EQ(shown("Scrambling Code"), "301");
    EXPECT_THAT(log.texts(3), ElementsAre("UMTSRRInfo: Failed to retrieve Cell ID\n",
                                          "UMTSRRInfo: Failed to retrieve UARFCN\n",
                                          "UMTSRRInfo: Failed to retrieve Cell ID\n",
                                          "UMTSRRInfo: Failed to retrieve UARFCN\n",
                                          "UMTSRRInfo: Failed to retrieve Scrambling Code\n"));
}

TEST_F(UMTSRRInfoTest, CellMonitorThatDoesNotParseChangesNothing)
{
    values.set("UARFCN", "10700");
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cell(1))); // no array
    EXPECT_EQ(values, (PlistDictionary{{"UARFCN", "10700"}}));
    const Line trace{4, "UMTSRRInfo"};
    const Line unparsed{3, "Cell Info Array data could not be constructed"};
    const Line noArray{3, "Failed to get Cell Array\n"};
    EXPECT_THAT(log.lines(), ElementsAre(trace, unparsed, noArray, trace, unparsed, noArray));
}

TEST_F(UMTSRRInfoTest, TheServingCellRecordTakesTheUARFCNAway)
{
    monitor({cell(70123456)});
    feed(PacketBuilder(0x4127).u32(13, 9750).u32(17, 10700).u32(21, 5).u16(25, 6).size(29));
    EXPECT_THAT(keysOf(values), ElementsAre("Cell ID", "Scrambling Code", "Downlink Frequency",
                                            "Uplink Frequency", "URA ID"));
    EXPECT_EQ(shown("Cell ID"), "5");
    EXPECT_EQ(shown("Downlink Frequency"), "10700");
    EXPECT_EQ(shown("Uplink Frequency"), "9750");
}

TEST_F(UMTSRRInfoTest, TheCellMonitorSetsTheUARFCNBesideTheFrequencies)
{
    feed(PacketBuilder(0x4127).u32(17, 10700).size(29));
    monitor({cell(70123456)});
    EXPECT_EQ(shown("UARFCN"), "10700");
    EXPECT_EQ(shown("Downlink Frequency"), "10700");
    EXPECT_EQ(shown("Cell ID"), "70123456");
}

TEST_F(UMTSRRInfoTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x4005).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "UMTSRRInfo"},
                                         Line{3, "Received an unknown log message: 16389"}));
}

} // namespace ventrik
