#include "PropertyList/PropertyListReader.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <fstream>
#include <map>

namespace ventrik
{

namespace
{

using Keys = std::vector<std::string>;

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
    {"SIM Info",
     {"EF-ICCID", "EF-MSISDN", "EF-3GPP MAIL BOX DIALING NUMBER", "EF-HPPLMN SEARCH PERIOD",
      "EF-LOCI", "EF-GPRS/PS-LOCI", "EF-ACCESS CONTROL CLASS", "EF-ADMINISTRATIVE DATA", "EF-FPLMN",
      "EF-ACTING HPLMN", "EF-RAT MODE", "EF-PLMN NETWORK NAME", "EF-OPERATOR PLMN LIST",
      "EF-OPLMNAcT"}},
};

const Keys listSections{"Measured Neighbor Cells", "Detected Cells", "Neighbor Cells List",
                        "Reselection Candidates List", "PDP Context Info"};

// Every entry of the tree by its key, however deep.
void collect(const PlistDictionary& dictionary, std::multimap<std::string, PlistValue>& entries)
{
    for (const auto& [key, value] : dictionary) {
        entries.emplace(key, value);
        if (value.dictionary())
            collect(*value.dictionary(), entries);
    }
}

class LTETemplateTest : public testing::Test
{
  protected:
    LTETemplateTest()
    {
        std::ifstream file(VENTRIK_RESOURCES "/LTE.plist", std::ios::binary);
        const Bytes bytes{std::istreambuf_iterator<char>(file), {}};
        const auto reading = readPropertyList(bytes);
        EXPECT_TRUE(reading) << reading.error;
        if (reading)
            collect(*reading.value->dictionary(), entries);
    }

    const PlistValue* only(const std::string& key)
    {
        EXPECT_EQ(entries.count(key), 1U) << key;
        const auto entry = entries.find(key);
        return entry == entries.end() ? nullptr : &entry->second;
    }

    std::multimap<std::string, PlistValue> entries;
};

} // namespace

TEST_F(LTETemplateTest, OffersEveryKeyOfEachDictionarySection)
{
    for (const auto& [name, keys] : dictionarySections) {
        const PlistValue* container = only(name);
        ASSERT_TRUE(container && container->dictionary()) << name;
        EXPECT_THAT(keysOf(*container->dictionary()), testing::UnorderedElementsAreArray(keys))
            << name;
        for (const std::string& key : keys)
            EXPECT_EQ(textAt(*container, {key}), "-") << name << " " << key;
    }
}

TEST_F(LTETemplateTest, OffersAnEmptyArrayForEachListSection)
{
    for (const std::string& name : listSections) {
        const PlistValue* container = only(name);
        ASSERT_TRUE(container && container->array()) << name;
        EXPECT_TRUE(container->array()->empty()) << name;
    }
}

TEST_F(LTETemplateTest, KeepsTheUARFCNLastWhereItComesAndGoes)
{
    EXPECT_EQ(keysOf(*only("Serving Cell Info")->dictionary()).back(), "UARFCN");
}

} // namespace ventrik
