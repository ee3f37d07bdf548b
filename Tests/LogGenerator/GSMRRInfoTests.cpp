#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/RecordFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using GSMRRInfoTest = RecordFixture<GSMRRInfo>;

constexpr RecordSize sizes[] = {{0x512C, 17}, {0x5137, 29}, {0x5072, 20}, {0x51F6, 24}};

constexpr RecordField fields[] = {
    {0x512C, 13, 8, 0, "RR State", "RR_INACTIVE"},
    {0x512C, 13, 8, 1, "RR State", "RR_GOING_ACTIVE"},
    {0x512C, 13, 8, 2, "RR State", "RR_GOING_INACTIVE"},
    {0x512C, 13, 8, 3, "RR State", "RR_CELL_SELECTION"},
    {0x512C, 13, 8, 4, "RR State", "RR_PLMN_LIST_CONSTRUCTION"},
    {0x512C, 13, 8, 5, "RR State", "RR_IDLE"},
    {0x512C, 13, 8, 6, "RR State", "RR_CELL_RESELECTION"},
    {0x512C, 13, 8, 7, "RR State", "RR_CONNECTION_PENDING"},
    {0x512C, 13, 8, 8, "RR State", "RR_CHOOSE_CELL"},
    {0x512C, 13, 8, 9, "RR State", "RR_DATA_TRANSFER"},
    {0x512C, 13, 8, 10, "RR State", "RR_NO_CHANNELS"},
    {0x512C, 13, 8, 11, "RR State", "RR_CONNECTION_RELEASE"},
    {0x512C, 13, 8, 12, "RR State", "RR_EARLY_CAMPED_WAIT_FOR_SI"},
    {0x512C, 13, 8, 13, "RR State", "RR_W2G_INTERRAT_HANDOVER_ PROGRESS"},
    {0x512C, 13, 8, 14, "RR State", "RR_W2G_INTERRAT_RESELECTION_PROGRESS"},
    {0x512C, 13, 8, 15, "RR State", "RR_WAIT_FOR_EARLY_PSCAN"},
    {0x512C, 13, 8, 16, "RR State", "GRR51"},
    {0x512C, 13, 8, 17, "RR State", "GRR52"},
    {0x512C, 13, 8, 18, "RR State", "RR_G2W_INTERRAT_RESELECTION_PROGRESS"},
    {0x512C, 13, 8, 19, "RR State", "RR_G2W_INTERRAT_HANDOVER_ PROGRESS"},
    {0x512C, 13, 8, 20, "RR State", "RR_CELL_REEST"},
    {0x512C, 13, 8, 21, "RR State", "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS"},
    {0x512C, 13, 8, 22, "RR State", "Unknown"},
    {0x512C, 13, 8, 255, "RR State", "Unknown"},
    {0x512C, 14, 8, 4, "RR Sub State", "4"},
    {0x512C, 14, 8, 255, "RR Sub State", "255"},
    {0x512C, 15, 8, 5, "RR Status", "5"},
    {0x512C, 15, 8, 255, "RR Status", "255"},
    {0x512C, 16, 8, 0, "RR Mode", "Voice"},
    {0x512C, 16, 8, 1, "RR Mode", "Data"},
    {0x512C, 16, 8, 255, "RR Mode", "Data"},
    {0x5137, 15, 8, 0x6E, "Serving Rx Level", "110"},
    {0x5137, 15, 8, 255, "Serving Rx Level", "255"},
    {0x5137, 16, 32, 0x12345, "Rx Quality Full", "74565"},
    {0x5137, 16, 32, 0xFFFFFFFE, "Rx Quality Full", "-2"},
    {0x5137, 16, 32, 0x80000000, "Rx Quality Full", "-2147483648"},
    {0x5137, 20, 32, 0x10020, "Rx Quality Sub", "65568"},
    {0x5137, 20, 32, 0xFFFFFFFF, "Rx Quality Sub", "-1"},
    {0x5072, 19, 8, 0, "DTX Used", "OFF"},
    {0x5072, 19, 8, 1, "DTX Used", "ON"},
    {0x5072, 19, 8, 255, "DTX Used", "ON"},
    {0x51F6, 16, 8, 0, "DRX Used", "0 sec"},
    {0x51F6, 16, 8, 7, "DRX Used", "7 sec"},
    {0x51F6, 16, 8, 255, "DRX Used", "255 sec"},
};

} // namespace

TEST_F(GSMRRInfoTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "GSM RR Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x512C, 0x5137, 0x5072, 0x51F6));
}

TEST_F(GSMRRInfoTest, EachFieldIsReadFromItsBytesAlone)
{
    expectFields(fields, sizes);
}

TEST_F(GSMRRInfoTest, EachRecordHasItsMinimumSize)
{
    expectMinimumSizes(sizes, "GSMRRInfo");
}

TEST_F(GSMRRInfoTest, EachRecordShowsItsKeysInOrder)
{
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x512C).size(17)),
                ElementsAre("RR State", "RR Sub State", "RR Status", "RR Mode"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5137).size(29)),
                ElementsAre("Serving Rx Level", "Rx Quality Full", "Rx Quality Sub"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5072).size(20)), ElementsAre("DTX Used"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51F6).size(24)), ElementsAre("DRX Used"));
    EXPECT_EQ(log.lines(), std::vector<Line>(4, Line{4, "GSMRRInfo"}));
}

TEST_F(GSMRRInfoTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x51F5).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSMRRInfo"},
                                         Line{3, "Received an unknown log message: 20981"}));
}

} // namespace ventrik
