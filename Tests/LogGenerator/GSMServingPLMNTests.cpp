#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/GSMSections.h"
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

class ServingPLMNTest : public SectionFixture<ServingPLMN>
{
  protected:
    // Country 310, network 01, location area 0x1234, routing area 5, both services.
    static PacketBuilder servingPLMN()
    {
        return PacketBuilder(0x7135)
            .u8(14, 3)
            .u8(15, 0x13)
            .u8(16, 0xF0)
            .u8(17, 0x10)
            .u16BigEndian(18, 0x1234)
            .u8(20, 5)
            .size(32);
    }
    static PacketBuilder registration(std::uint8_t selectionMode)
    {
        return PacketBuilder(0x7132).u8(14, selectionMode).size(16);
    }
    static PlistDictionary servingCell(std::int32_t countryCode)
    {
        PlistDictionary result =
            cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, kQXCellMonitorCellTypeServing);
        result.set(kQXCellMonitorMCC, countryCode);
        result.set(kQXCellMonitorMNC, 1);
        result.set(kQXCellMonitorLAC, 4711);
        return result;
    }
    void monitor(PlistArray cells)
    {
        feed(propertyListPacket(SharedRecords::cellMonitor.logCode, cells));
    }
};

struct LabelRow {
    std::uint8_t raw;
    std::string_view label;
};

constexpr LabelRow selectionModeRows[] = {
    {0, "Automatic"},          {1, "Manual"},  {2, "Limited"},   {3, "LIMITED_ROUTINE_ACQ"},
    {4, "LIMITED_MANUAL_ACQ"}, {5, "Unknown"}, {255, "Unknown"},
};

constexpr LabelRow serviceTypeRows[] = {
    {0, "NO_SERVICE"},      {1, "CS_ONLY"}, {2, "PS_ONLY"},   {3, "CS_PS_SERVICE"},
    {4, "LIMITED_SERVICE"}, {5, "Unknown"}, {255, "Unknown"},
};

struct IdentityRow {
    std::uint8_t first;
    std::uint8_t second;
    std::uint8_t third;
    std::string_view country;
    std::string_view network;
};

constexpr IdentityRow identityRows[] = {
    {0x13, 0xF0, 0x10, "310", "01 "}, // two digits and a filler
    {0x21, 0x43, 0x65, "123", "564"}, // each nibble in its place
    {0x99, 0x99, 0x99, "999", "999"}, // 9 is the last digit
    {0xA0, 0x0B, 0xC0, "0  ", "0 0"}, // 10 is none
    {0xFF, 0xFF, 0xFF, "   ", "   "},
};

} // namespace

TEST_F(ServingPLMNTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Serving PLMN");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x7135, 0x7132, 0xFF0001));
}

TEST_F(ServingPLMNTest, ShowsItsFiveValuesInOrder)
{
    feed(servingPLMN());
    EXPECT_THAT(keysOf(values),
                ElementsAre("Mobile Country Code", "Mobile Network Code", "Location Area Code",
                            "Routing Area Code", "Service Type"));
    EXPECT_EQ(shown("Mobile Country Code"), "310");
    EXPECT_EQ(shown("Mobile Network Code"), "01 ");
    EXPECT_EQ(shown("Location Area Code"), "4660"); // 0x1234
    EXPECT_EQ(shown("Routing Area Code"), "5");
    EXPECT_EQ(shown("Service Type"), "CS_PS_SERVICE");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving PLMN"}));
}

TEST_F(ServingPLMNTest, NibblesAboveNineAreBlanks)
{
    for (const IdentityRow& row : identityRows) {
        feed(servingPLMN().u8(15, row.first).u8(16, row.second).u8(17, row.third));
        EXPECT_EQ(shown("Mobile Country Code"), row.country);
        EXPECT_EQ(shown("Mobile Network Code"), row.network);
    }
}

TEST_F(ServingPLMNTest, AreaCodesAreUnsigned)
{
    feed(servingPLMN().u16BigEndian(18, 0xFFFE).u8(20, 255));
    EXPECT_EQ(shown("Location Area Code"), "65534");
    EXPECT_EQ(shown("Routing Area Code"), "255");
}

TEST_F(ServingPLMNTest, LabelsEveryServiceType)
{
    for (const auto& [raw, label] : serviceTypeRows) {
        feed(servingPLMN().u8(14, raw));
        EXPECT_EQ(shown("Service Type"), label) << int{raw};
    }
}

TEST_F(ServingPLMNTest, ARecordOf31BytesChangesNothing)
{
    feed(servingPLMN().size(31));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("Serving PLMN"));
}

TEST_F(ServingPLMNTest, RegistrationShowsTheSelectionModeAlone)
{
    feed(registration(0).u8(13, 1));
    EXPECT_THAT(keysOf(values), ElementsAre("PLMN Sel Mod"));
    EXPECT_THAT(log.texts(), ElementsAre("Serving PLMN"));
}

TEST_F(ServingPLMNTest, LabelsEverySelectionMode)
{
    for (const auto& [raw, label] : selectionModeRows) {
        feed(registration(raw));
        EXPECT_EQ(shown("PLMN Sel Mod"), label) << int{raw};
    }
}

TEST_F(ServingPLMNTest, ARegistrationOf15BytesChangesNothing)
{
    feed(registration(1).size(15));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("Serving PLMN"));
}

TEST_F(ServingPLMNTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x7131).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving PLMN"},
                                         Line{3, "Received an unknown log message: 28977"}));
}

TEST_F(ServingPLMNTest, CellMonitorShowsTheServingCellsPlainNumbers)
{
    monitor({servingCell(262)});
    EXPECT_THAT(keysOf(values),
                ElementsAre("Mobile Country Code", "Mobile Network Code", "Location Area Code"));
    EXPECT_EQ(shown("Mobile Country Code"), "262");
    EXPECT_EQ(shown("Mobile Network Code"), "1");
    EXPECT_EQ(shown("Location Area Code"), "4711");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Serving PLMN"}));
}

TEST_F(ServingPLMNTest, CellMonitorTakesAUMTSServingCellToo)
{
    PlistDictionary umts = servingCell(234);
    umts.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyUMTS);
    monitor({umts});
    EXPECT_EQ(shown("Mobile Country Code"), "234");
}

TEST_F(ServingPLMNTest, CellMonitorTakesTheFirstServingCell)
{
    monitor({servingCell(262), servingCell(310)});
    EXPECT_EQ(shown("Mobile Country Code"), "262");
}

TEST_F(ServingPLMNTest, CellMonitorSkipsCellsThatDoNotServe)
{
    PlistDictionary neighbor = servingCell(1);
    neighbor.set(kQXCellMonitorCellType, kQXCellMonitorCellTypeNeighbor);
    PlistDictionary lte = servingCell(2);
    lte.set(kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyLTE);
    PlistDictionary withoutType = servingCell(3);
    withoutType.remove(kQXCellMonitorCellType);
    PlistDictionary withoutTechnology = servingCell(4);
    withoutTechnology.remove(kQXCellMonitorCellRadioAccessTechnology);
    monitor({"no cell", neighbor, lte, withoutType, withoutTechnology, servingCell(262)});
    EXPECT_EQ(shown("Mobile Country Code"), "262");
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(ServingPLMNTest, CellMonitorWithoutAServingCellChangesNothing)
{
    monitor({});
    monitor({7, "no cell"});
    monitor({cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, kQXCellMonitorCellTypeNeighbor)});
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(ServingPLMNTest, CellMonitorWithoutANetworkCodeStillShowsTheArea)
{
    feed(servingPLMN());
    log.clear();
    PlistDictionary serving = servingCell(262);
    serving.remove(kQXCellMonitorMNC);
    monitor({serving});
    EXPECT_EQ(shown("Mobile Country Code"), "262");
    EXPECT_EQ(shown("Mobile Network Code"), "01 ");
    EXPECT_EQ(shown("Location Area Code"), "4711");
    EXPECT_THAT(log.texts(3), ElementsAre("ServingPLMN: Failed to retrieve MNC\n"));
}

TEST_F(ServingPLMNTest, CellMonitorReportsEachNumberThatIsMissingOrNone)
{
    PlistDictionary serving = servingCell(0);
    serving.set(kQXCellMonitorMCC, "262");
    serving.set(kQXCellMonitorMNC, true);
    serving.remove(kQXCellMonitorLAC);
    monitor({serving});
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(3), ElementsAre("ServingPLMN: Failed to retrieve MCC\n",
                                          "ServingPLMN: Failed to retrieve MNC\n",
                                          "ServingPLMN: Failed to retrieve LAC\n"));
}

TEST_F(ServingPLMNTest, TheRecordThatCameLastIsShown)
{
    monitor({servingCell(262)});
    feed(servingPLMN());
    EXPECT_EQ(shown("Mobile Country Code"), "310");
    monitor({servingCell(262)});
    EXPECT_EQ(shown("Mobile Country Code"), "262");
    EXPECT_EQ(shown("Routing Area Code"), "5");
}

TEST_F(ServingPLMNTest, CellMonitorThatDoesNotParseIsReportedTwice)
{
    feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    feed(propertyListPacket(SharedRecords::cellMonitor.logCode, servingCell(262))); // no array
    EXPECT_TRUE(values.empty());
    const Line trace{4, "Serving PLMN"};
    const Line unparsed{3, "Cell Info Array data could not be constructed"};
    const Line noArray{3, "Failed to get Cell Array\n"};
    EXPECT_THAT(log.lines(), ElementsAre(trace, unparsed, noArray, trace, unparsed, noArray));
}

} // namespace ventrik
