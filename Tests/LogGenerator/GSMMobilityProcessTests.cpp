#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using ProcessCOTest = SectionFixture<ProcessCO>;
using ProcessCSTest = SectionFixture<ProcessCS>;

template <typename Section>
class MobilityProcessTest : public SectionFixture<Section>
{
};

using Processes = testing::Types<ProcessCO, ProcessCS, ProcessPS>;
TYPED_TEST_SUITE(MobilityProcessTest, Processes);

struct LabelRow {
    std::uint8_t raw;
    std::string_view label;
};

// A state record, its three values in their order.
PacketBuilder mmState(std::uint8_t state, std::uint8_t subState = 0, std::uint8_t updateStatus = 0)
{
    return PacketBuilder(0x7131).u8(13, state).u8(14, subState).u8(15, updateStatus);
}

PacketBuilder registration(std::uint8_t state)
{
    return PacketBuilder(0x7132).u8(13, state).size(16);
}

constexpr LabelRow mmStateRows[] = {
    {0, "MM_NULL"},
    {1, "Unknown"},
    {2, "Unknown"},
    {3, "MM_LOCATION_UPDATE_INITIATED"},
    {4, "Unknown"},
    {5, "MM_WAIT_FOR_OUTGOING_MM_CONNECTION"},
    {6, "MM_CONNECTION_ACTIVE"},
    {7, "MM_IMSI_DETACH_INITIATED"},
    {8, "MM_PROCESS_CM_SERVICE_PROMPT"},
    {9, "MM_WAIT_FOR_NETWORK_COMMAND"},
    {10, "MM_LOCATION_UPDATE_REJECTED"},
    {11, "Unknown"},
    {12, "Unknown"},
    {13, "MM_WAIT_FOR_RR_CONNECTION_LU"},
    {14, "MM_WAIT_FOR_RR_CONNECTION_MM"},
    {15, "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH"},
    {16, "Unknown"},
    {17, "MM_REESTABLISHMENT_INITIATED"},
    {18, "MM_WAIT_FOR_RR_ACTIVE"},
    {19, "MM_IDLE"},
    {20, "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION"},
    {21, "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT"},
    {22, "MM_WAIT_FOR_REESTABLISH_DECISION"},
    {23, "MM_LOCATION_UPDATING_PENDING"},
    {24, "Unknown"},
    {25, "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED"},
    {26, "Unknown"},
    {255, "Unknown"},
};

constexpr LabelRow mmSubStateRows[] = {
    {0, "MM_NULL_SUBSTATE"},
    {1, "MM_NO_IMSI"},
    {2, "MM_PLMN_SEARCH"},
    {3, "MM_LIMITED_SERVICE"},
    {4, "MM_ATTEMPTING_TO_UPDATE"},
    {5, "MM_LOCATION_UPDATE_NEEDED"},
    {6, "MM_NO_CELL_AVAILABLE"},
    {7, "MM_PLMN_SEARCH_NORMAL_SERVICE"},
    {8, "MM_NORMAL_SERVICE"},
    {9, "Unknown"},
    {255, "Unknown"},
};

constexpr LabelRow mmUpdateStatusRows[] = {
    {0, "UPDATED"},
    {1, "NOT_UPDATED"},
    {2, "ROAMING_NOT_ALLOWED"},
    {3, "LOCATION_AREA_NOT_ALLOWED"},
    {4, "Unknown"},
    {255, "Unknown"},
};

constexpr LabelRow registrationStateRows[] = {
    {0, "REG_STATE_INACTIVE"},
    {1, "REG_STATE_IDLE"},
    {2, "REG_STATE_REGISTERING"},
    {3, "REG_STATE_DEREGISTERING"},
    {4, "REG_STATE_MANUAL_SEARCH"},
    {5, "REG_STATE_AUTOMATIC_SEARCH"},
    {6, "REG_STATE_OFFLINE"},
    {7, "Unknown"},
    {255, "Unknown"},
};

} // namespace

TYPED_TEST(MobilityProcessTest, LabelsEveryRegistrationState)
{
    for (const auto& [raw, label] : registrationStateRows) {
        this->feed(registration(raw));
        EXPECT_EQ(this->shown("MM Service State"), label) << int{raw};
    }
    EXPECT_THAT(keysOf(this->values), ElementsAre("MM Service State"));
    EXPECT_TRUE(this->log.texts(3).empty());
}

TEST_F(ProcessCOTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Process CO");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x7131, 0x7132));
}

TEST_F(ProcessCOTest, ShowsTheStateAloneUnderTheCircuitSwitchedTag)
{
    feed(mmState(19, 8, 1));
    EXPECT_THAT(keysOf(values), ElementsAre("MM State"));
    EXPECT_EQ(shown("MM State"), "MM_IDLE");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessCS"}));
}

TEST_F(ProcessCOTest, LabelsEveryState)
{
    for (const auto& [raw, label] : mmStateRows) {
        feed(mmState(raw));
        EXPECT_EQ(shown("MM State"), label) << int{raw};
    }
}

TEST_F(ProcessCOTest, RecordsOf15BytesChangeNothing)
{
    feed(mmState(19).size(15));
    feed(registration(1).size(15));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("ProcessCS", "ProcessCS"));
}

TEST_F(ProcessCOTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x7130).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessCS"},
                                         Line{3, "Received an unknown log message: 28976"}));
}

TEST_F(ProcessCSTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Process CS");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x7131, 0x7132));
}

TEST_F(ProcessCSTest, ShowsTheThreeStatesInOrder)
{
    feed(mmState(25, 8, 3));
    EXPECT_THAT(keysOf(values), ElementsAre("MM State", "MM Sub State", "LU Reject Cause"));
    EXPECT_EQ(shown("MM State"), "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED");
    EXPECT_EQ(shown("MM Sub State"), "MM_NORMAL_SERVICE");
    EXPECT_EQ(shown("LU Reject Cause"), "LOCATION_AREA_NOT_ALLOWED");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessCS"}));
}

TEST_F(ProcessCSTest, LabelsEveryState)
{
    for (const auto& [raw, label] : mmStateRows) {
        feed(mmState(raw));
        EXPECT_EQ(shown("MM State"), label) << int{raw};
    }
}

TEST_F(ProcessCSTest, LabelsEverySubState)
{
    for (const auto& [raw, label] : mmSubStateRows) {
        feed(mmState(0, raw));
        EXPECT_EQ(shown("MM Sub State"), label) << int{raw};
    }
}

TEST_F(ProcessCSTest, LabelsEveryUpdateStatus)
{
    for (const auto& [raw, label] : mmUpdateStatusRows) {
        feed(mmState(0, 0, raw));
        EXPECT_EQ(shown("LU Reject Cause"), label) << int{raw};
    }
}

TEST_F(ProcessCSTest, RecordsOf15BytesKeepTheStates)
{
    feed(mmState(19, 8, 0));
    feed(registration(1));
    feed(mmState(0, 0, 1).size(15));
    feed(registration(2).size(15));
    EXPECT_EQ(shown("MM State"), "MM_IDLE");
    EXPECT_EQ(shown("MM Sub State"), "MM_NORMAL_SERVICE");
    EXPECT_EQ(shown("LU Reject Cause"), "UPDATED");
    EXPECT_EQ(shown("MM Service State"), "REG_STATE_IDLE");
    EXPECT_TRUE(log.texts(3).empty());
}

TEST_F(ProcessCSTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x7130).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessCS"},
                                         Line{3, "Received an unknown log message: 28976"}));
}

} // namespace ventrik
