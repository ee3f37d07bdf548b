#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using ProcessPSTest = SectionFixture<ProcessPS>;

struct LabelRow {
    std::uint8_t raw;
    std::string_view label;
};

// A state record, its three values in their order.
PacketBuilder gmmState(std::uint8_t state, std::uint8_t subState = 0, std::uint8_t updateStatus = 0)
{
    return PacketBuilder(0x7130).u8(13, state).u8(14, subState).u8(15, updateStatus);
}

constexpr LabelRow gmmStateRows[] = {
    {0, "GMM_NULL"},
    {1, "GMM_DEREGISTERED"},
    {2, "GMM_REGISTERED_INITIATED"},
    {3, "GMM_REGISTERED"},
    {4, "GMM_DEREGISTERED_INITIATED"},
    {5, "GMM_ROUTING_AREA_UPDATE_INITIATED"},
    {6, "GMM_SERVICE_REQUEST_INITIATED"},
    {7, "Unknown"},
    {255, "Unknown"},
};

constexpr LabelRow gmmSubStateRows[] = {
    {0, "GMM_NORMAL_SERVICE"},
    {1, "GMM_LIMITED_SERVICE"},
    {2, "GMM_ATTACH_NEEDED"},
    {3, "GMM_ATTEMPTING_TO_ATTACH"},
    {4, "GMM_NO_IMSI"},
    {5, "GMM_NO_CELL_AVAILABLE"},
    {6, "GMM_PLMN_SEARCH"},
    {7, "GMM_SUSPENDED"},
    {8, "GMM_UPDATE_NEEDED"},
    {9, "GMM_ATTEMPING_TO_UPDATE"},
    {10, "GMM_ATTEMPTING_TO_UPDATE_MM"},
    {11, "GMM_IMSI_DETACH_INITIATED"},
    {12, "GMM_NULL_SUBSTATE"},
    {13, "Unknown"},
    {255, "Unknown"},
};

constexpr LabelRow gmmUpdateStatusRows[] = {
    {0, "GMM_GU1_UPDATED"},
    {1, "GMM_GU2_NOT_UPDATED"},
    {2, "GMM_GU3_PLMN_NOT_ALLOWED"},
    {3, "GMM_GU3_ROUTING_AREA_NOT_ALLOWED"},
    {4, "Unknown"},
    {255, "Unknown"},
};

} // namespace

TEST_F(ProcessPSTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "Process PS");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x7130, 0x7132));
}

TEST_F(ProcessPSTest, ShowsTheThreeStatesInOrder)
{
    feed(gmmState(3, 9, 1));
    EXPECT_THAT(keysOf(values), ElementsAre("MM State", "MM Sub State", "Attach Reject Cause"));
    EXPECT_EQ(shown("MM State"), "GMM_REGISTERED");
    EXPECT_EQ(shown("MM Sub State"), "GMM_ATTEMPING_TO_UPDATE");
    EXPECT_EQ(shown("Attach Reject Cause"), "GMM_GU2_NOT_UPDATED");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessPS"}));
}

TEST_F(ProcessPSTest, LabelsEveryState)
{
    for (const auto& [raw, label] : gmmStateRows) {
        feed(gmmState(raw));
        EXPECT_EQ(shown("MM State"), label) << int{raw};
    }
}

TEST_F(ProcessPSTest, LabelsEverySubState)
{
    for (const auto& [raw, label] : gmmSubStateRows) {
        feed(gmmState(0, raw));
        EXPECT_EQ(shown("MM Sub State"), label) << int{raw};
    }
}

TEST_F(ProcessPSTest, LabelsEveryUpdateStatus)
{
    for (const auto& [raw, label] : gmmUpdateStatusRows) {
        feed(gmmState(0, 0, raw));
        EXPECT_EQ(shown("Attach Reject Cause"), label) << int{raw};
    }
}

TEST_F(ProcessPSTest, RecordsOf15BytesChangeNothing)
{
    feed(gmmState(3).size(15));
    feed(PacketBuilder(0x7132).size(15));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("ProcessPS", "ProcessPS"));
}

TEST_F(ProcessPSTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x7131).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ProcessPS"},
                                         Line{3, "Received an unknown log message: 28977"}));
}

} // namespace ventrik
