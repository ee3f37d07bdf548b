#include "Tests/LogGenerator/TemplateFixture.h"

namespace ventrik
{

namespace
{

const std::map<std::string, Keys> dictionarySections{
    {"Serving Cell Info",
     {"Physical Cell ID", "Download Frequency", "Upload Frequency", "Download Bandwidth",
      "Upload Bandwidth", "Cell Identity", "Tracking Area Code", "Freq Band Indicator",
      "Num Tx Antennas", "UARFCN"}},
    {"Serving Cell Measurements",
     {"Version", "E-ARFCN", "Physical Cell ID", "Serving Layer Priority", "Measured RSRP",
      "Average RSRP", "Measured RSRQ", "Average RSRQ", "Measured RSSI", "Qrxlevmin", "P_Max",
      "Max UE Tx Power", "Srxlev", "Num of Consecutive DRX Cycles of S < 0", "S Intra Search",
      "S Non Intra Search", "Measurement Rules Updated", "Measurement Rules"}},
    {"Connected mode LTE Intra-frequency Measurement",
     {"E-ARFCN", "Serving Physical Cell ID", "Subframe Number", "Serving Filtered RSRP",
      "Serving Filtered RSRQ"}},
    {"Neighbor Measurements", {"Version", "E-ARFCN", "Qrxlevmin"}},
    {"Reselection Candidates", {"Version", "Serving EARFCN", "Serving Cell ID"}},
};

const Keys listSections{"Measured Neighbor Cells", "Detected Cells", "Neighbor Cells List",
                        "Reselection Candidates List", "PDP Context Info"};

class LTETemplateTest : public TemplateFixture
{
  protected:
    LTETemplateTest() : TemplateFixture("LTE.plist") {}
};

} // namespace

TEST_F(LTETemplateTest, OffersEveryKeyOfEachDictionarySection)
{
    for (const auto& [name, keys] : dictionarySections)
        expectDictionary(name, keys);
    expectDictionary("SIM Info", simInfoKeys());
}

TEST_F(LTETemplateTest, OffersAnEmptyArrayForEachListSection)
{
    for (const std::string& name : listSections)
        expectEmptyArray(name);
}

TEST_F(LTETemplateTest, KeepsTheUARFCNLastWhereItComesAndGoes)
{
    EXPECT_EQ(keysOf(*only("Serving Cell Info")->dictionary()).back(), "UARFCN");
}

} // namespace ventrik
