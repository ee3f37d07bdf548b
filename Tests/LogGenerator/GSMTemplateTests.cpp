#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"
#include "Tests/LogGenerator/TemplateFixture.h"

namespace ventrik
{

namespace
{

struct SectionKeys {
    Keys values;
    Keys lists;
};

const std::map<std::string, SectionKeys> dictionarySections{
    {"GSM Serving Cell",
     {{"Cell ID", "ARFCN", "BSIC", "RSSI", "C1 Value", "C2 Value", "MA Dedicated ARFCN"}, {}}},
    {"GSM RR Info",
     {{"RR State", "RR Sub State", "RR Status", "RR Mode", "Serving Rx Level", "Rx Quality Full",
       "Rx Quality Sub", "DTX Used", "DRX Used"},
      {}}},
    {"Mobile Allocation", {{"HSN"}, {"ARFCNs"}}},
    {"UMTS RR Info",
     {{"RRC State", "Cell ID", "Downlink Frequency", "Uplink Frequency", "URA ID", "Transmit Power",
       "Ciphering", "Scrambling Code", "UARFCN"},
      {}}},
    {"Serving PLMN",
     {{"Mobile Country Code", "Mobile Network Code", "Location Area Code", "Routing Area Code",
       "Service Type", "PLMN Sel Mod"},
      {}}},
    {"Process CS", {{"MM State", "MM Sub State", "LU Reject Cause", "MM Service State"}, {}}},
    {"Process PS", {{"MM State", "MM Sub State", "Attach Reject Cause", "MM Service State"}, {}}},
    {"Process CO", {{"MM State", "MM Service State"}, {}}},
    {"BLER", {{"Window Size"}, {"Transport Channels"}}},
    {"HSDPA Info",
     {{"Version", "Sub Frames", "Carrier Info"},
      {"Primary HARQ Process", "Secondary HARQ Process"}}},
    {"GPRS Information",
     {{"Network Control Order", "PFC Supported", "Priority Access Threshold",
       "Network Operating Mode", "T3192", "Access Burst Type", "DRX Timer Max", "PBCCH Present",
       "Ext Measurement Order", "Packet PSI Status", "Packet SI Status", "Count LR", "Count HR",
       "SI13 Position", "Cell Reselect Hysteresis"},
      {}}},
    {"SIM Info", {simInfoKeys(), {}}},
    {"UMTS RR Measurement", {}},
    {"Cell Change Counters", {}},
    {"Coding Scheme", {}},
};

const Keys listSections{"Active Set",
                        "Equivalent PLMN List",
                        "Neighboring Cells",
                        "UMTS Set",
                        "GSM Set",
                        "Monitored Set",
                        "Detected Set",
                        "Virtual Active Set",
                        "Non-Ranked UMTS Set",
                        "Non-Ranked GSM Set",
                        "PDP Context Info"};

class GSMTemplateTest : public TemplateFixture
{
  protected:
    GSMTemplateTest() : TemplateFixture("Orbel_GSM.plist") {}
};

} // namespace

TEST_F(GSMTemplateTest, OffersEveryKeyOfEachDictionarySection)
{
    for (const auto& [name, keys] : dictionarySections)
        expectDictionary(name, keys.values, keys.lists);
}

TEST_F(GSMTemplateTest, OffersAnEmptyArrayForEachListSection)
{
    for (const std::string& name : listSections)
        expectEmptyArray(name);
}

TEST_F(GSMTemplateTest, NamesEverySectionOfTheClassIndex)
{
    CapturingSystemLog log;
    const Orbel_GSMClassIndex index(log);
    EXPECT_EQ(dictionarySections.size() + listSections.size(), index.sections().size());
    for (const auto& [name, section] : index.sections())
        only(std::string(name));
}

TEST_F(GSMTemplateTest, GroupsTheSectionsInTheOrderInWhichTheyAreNeeded)
{
    EXPECT_THAT(keysOf(root),
                testing::ElementsAre("_sorted", "1;Serving Cell", "2;Registration", "3;Neighbors",
                                     "4;Measurements", "5;Data", "SIM Info"));
}

TEST_F(GSMTemplateTest, KeepsTheUARFCNLastWhereItComesAndGoes)
{
    EXPECT_EQ(keysOf(*only("UMTS RR Info")->dictionary()).back(), "UARFCN");
}

} // namespace ventrik
