#include "Platform/TelephonyConstants.h"
#include "TelephonyService/GSMScenario.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

std::vector<TimedMessage> rideUpTo(std::chrono::seconds end, std::uint32_t seed = 1)
{
    GSMScenario scenario(seed);
    return messagesUpTo(scenario, end);
}

// What the decoders show, sampled over a long ride.
class GSMRideTest : public ScenarioFixture
{
  protected:
    GSMRideTest() { decode(rideUpTo(400s), kQXLogChannelTechnology_Orbel_GSM, "Orbel_GSM"); }
};

} // namespace

TEST(GSMScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 7)));
}

TEST(GSMScenario, IsAnotherRideForAnotherSeed)
{
    EXPECT_FALSE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 8)));
}

TEST(GSMScenario, SendsAbout20MessagesASecondInOrder)
{
    const auto messages = rideUpTo(120s);
    EXPECT_GE(messages.size(), 1800U);
    EXPECT_LE(messages.size(), 3000U);
    EXPECT_TRUE(std::ranges::is_sorted(messages, {}, &TimedMessage::due));
}

TEST(GSMScenario, HasBursts)
{
    EXPECT_GE(largestBurst(rideUpTo(100s)), 10);
}

TEST(GSMScenario, SendsEveryCodeThatTheStartCommandAsksFor)
{
    EXPECT_THAT(codesOf(rideUpTo(60s)),
                ElementsAre(0x4005, 0x4031, 0x4116, 0x4125, 0x4127, 0x4157, 0x417A, 0x4221, 0x5072,
                            0x5076, 0x512C, 0x5134, 0x5137, 0x51F4, 0x51F5, 0x51F6, 0x51F8, 0x51FB,
                            0x51FD, 0x51FF, 0x7130, 0x7131, 0x7132, 0x7135, 0x7150, 0xFF0000,
                            0xFF0001, 0xFF0002));
}

TEST(GSMScenario, SomeMessagesCarryTheTransportPrefix)
{
    const std::size_t prefixed = prefixedCount(rideUpTo(60s));
    EXPECT_GT(prefixed, 50U);
    EXPECT_LT(prefixed, 600U);
}

TEST_F(GSMRideTest, FillsEveryKeyOfEverySection)
{
    shown.erase("/_sorted"); // marks the groups as sorted
    for (const auto& [key, texts] : shown)
        EXPECT_GT(texts.size(), texts.count("-")) << key;
    for (const char* key :
         {"Active Set/Scrambling Code", "Active Set/RSCP", "Active Set/Energy Per Chip",
          "Neighboring Cells/ARFCN", "Neighboring Cells/RSSI", "Neighboring Cells/C1 Value",
          "Neighboring Cells/BSIC", "UMTS Set/UARFCN", "UMTS Set/Downlink Frequency",
          "UMTS Set/Ranking Value", "GSM Set/ARFCN", "GSM Set/Ranking Value",
          "Equivalent PLMN List/Mobile Country Code", "Transport Channels/CRC Received in Error",
          "Primary HARQ Process/No Rx Bits", "Secondary HARQ Process/Block Errors",
          "Mobile Allocation/ARFCNs", "PDP Context Info/APN", "SIM Info/EF-OPLMNAcT"})
        EXPECT_TRUE(shown.contains(key)) << key;
}

TEST_F(GSMRideTest, CampsCallsLoadsAndChangesTheTechnology)
{
    EXPECT_THAT(shown["GSM RR Info/RR State"],
                ElementsAre("-", "RR_CELL_SELECTION", "RR_CONNECTION_PENDING",
                            "RR_CONNECTION_RELEASE", "RR_DATA_TRANSFER",
                            "RR_G2W_INTERRAT_HANDOVER_ PROGRESS", "RR_IDLE", "RR_INACTIVE",
                            "RR_W2G_INTERRAT_RESELECTION_PROGRESS"));
    EXPECT_THAT(
        shown["UMTS RR Info/RRC State"],
        ElementsAre("-", "CELL_DCH", "CELL_FACH", "CELL_PCH", "Connecting", "Disconnected"));
    EXPECT_THAT(shown["GSM RR Info/RR Mode"], ElementsAre("-", "Data", "Voice"));
    EXPECT_THAT(shown["GSM RR Info/DTX Used"], ElementsAre("-", "OFF", "ON"));
    EXPECT_THAT(shown["Process CS/MM State"],
                ElementsAre("-", "MM_CONNECTION_ACTIVE", "MM_IDLE", "MM_LOCATION_UPDATE_INITIATED",
                            "MM_WAIT_FOR_RR_CONNECTION_MM"));
    EXPECT_THAT(shown["Process PS/MM State"],
                ElementsAre("-", "GMM_REGISTERED", "GMM_REGISTERED_INITIATED",
                            "GMM_ROUTING_AREA_UPDATE_INITIATED"));
    EXPECT_THAT(shown["HSDPA Info/Carrier Info"],
                ElementsAre("-", "Dual Carrier", "Single Carrier"));
}

TEST_F(GSMRideTest, GoesThroughSeveralCellsAndAreas)
{
    EXPECT_GE(shown["GSM Serving Cell/Cell ID"].size(), 5U);
    EXPECT_GE(shown["UMTS RR Info/Cell ID"].size(), 4U);
    EXPECT_THAT(shown["Serving PLMN/Location Area Code"],
                ElementsAre("-", "4711", "4712", "4721", "4722"));
    EXPECT_THAT(shown["Serving PLMN/Mobile Country Code"], ElementsAre("-", "262"));
    EXPECT_THAT(shown["Serving PLMN/Mobile Network Code"], ElementsAre("-", "07 ", "7"));
}

TEST_F(GSMRideTest, EquivalentNetworksAreNetworks)
{
    EXPECT_THAT(shown["Equivalent PLMN List/Mobile Country Code"], ElementsAre("262"));
    EXPECT_THAT(shown["Equivalent PLMN List/Mobile Network Code"], ElementsAre("203", "26"));
}

TEST_F(GSMRideTest, LevelsMoveWithinReason)
{
    const auto [lowRssi, highRssi] = rangeOf("GSM Serving Cell/RSSI"); // without their sign
    EXPECT_GE(lowRssi, 40);
    EXPECT_LE(highRssi, 110);
    EXPECT_GE(highRssi - lowRssi, 15);
    const auto [lowRscp, highRscp] = rangeOf("Active Set/RSCP");
    EXPECT_GE(lowRscp, -120);
    EXPECT_LE(highRscp, -50);
    EXPECT_GE(highRscp - lowRscp, 10);
    const auto [lowEnergy, highEnergy] = rangeOf("Active Set/Energy Per Chip");
    EXPECT_GE(lowEnergy, -24);
    EXPECT_LE(highEnergy, -3);
    const auto [lowPower, highPower] = rangeOf("UMTS RR Info/Transmit Power");
    EXPECT_GE(lowPower, -52);
    EXPECT_LE(highPower, 26);
    EXPECT_GE(highPower - lowPower, 10);
}

TEST_F(GSMRideTest, BlockErrorsAreFewOfTheBlocks)
{
    const auto [lowErrors, highErrors] = rangeOf("Primary HARQ Process/Block Errors");
    const auto [lowBlocks, highBlocks] = rangeOf("Primary HARQ Process/New Tx");
    EXPECT_GE(highErrors, 1);
    EXPECT_LT(highErrors, highBlocks);
    EXPECT_EQ(lowErrors, 0);
    EXPECT_GT(lowBlocks, 0);
    EXPECT_EQ(shown["Primary HARQ Process/Process ID"].size(), 6U);
}

TEST_F(GSMRideTest, PdpContextsComeAndGo)
{
    EXPECT_THAT(shown["PDP Context Info/APN"], ElementsAre("ims", "internet"));
}

} // namespace ventrik
