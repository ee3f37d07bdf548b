#include "Tests/LogGenerator/TemplateFixture.h"

namespace ventrik
{

namespace
{

class UTRANTemplateTest : public TemplateFixture
{
  protected:
    UTRANTemplateTest() : TemplateFixture("UTRAN.plist") {}
};

} // namespace

TEST_F(UTRANTemplateTest, OffersEveryKeyOfEachDictionarySection)
{
    expectDictionary("RRC Info", {"State"});
    expectDictionary("Serving Cell Info",
                     {"Cell Access Restrictions", "Cell ID", "Downlink UARFCN", "Uplink UARFCN",
                      "URA ID", "Allowed Access", "Local Area Code", "Freq Band Indicator",
                      "Cell Scrambling Code"});
    expectDictionary("SIM Info", simInfoKeys());
}

TEST_F(UTRANTemplateTest, OffersAnEmptyArrayForEachListSection)
{
    for (const char* name : {"Neighbor Cell List", "GSM Neighbor Cell List", "TRCH BLER",
                             "CCTRCH SIR", "PDP Context Info"})
        expectEmptyArray(name);
}

TEST_F(UTRANTemplateTest, BeginsWithTheServingCell)
{
    EXPECT_EQ(keysOf(root).front(), "Serving Cell Info");
    EXPECT_EQ(keysOf(root).size(), 8U);
}

} // namespace ventrik
