#include "Platform/TelephonyConstants.h"
#include "TelephonyService/UTRANScenario.h"
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
    UTRANScenario scenario(seed);
    return messagesUpTo(scenario, end);
}

// What the decoders show, sampled over a long ride.
class RideTest : public ScenarioFixture
{
  protected:
    RideTest()
    {
        testing::internal::CaptureStderr(); // each change of state is a line on the console
        decode(rideUpTo(400s), kQXLogChannelTechnology_Orbel_UTRAN2, "UTRAN");
        testing::internal::GetCapturedStderr();
    }
};

} // namespace

TEST(UTRANScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 7)));
}

TEST(UTRANScenario, IsAnotherRideForAnotherSeed)
{
    EXPECT_FALSE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 8)));
}

TEST(UTRANScenario, SendsAbout20MessagesASecondInOrder)
{
    const auto messages = rideUpTo(100s);
    EXPECT_GE(messages.size(), 2000U);
    EXPECT_LE(messages.size(), 2500U);
    EXPECT_TRUE(std::ranges::is_sorted(messages, {}, &TimedMessage::due));
}

TEST(UTRANScenario, HasBursts)
{
    EXPECT_GE(largestBurst(rideUpTo(100s)), 6);
}

TEST(UTRANScenario, SendsEveryCodeThatTheStartCommandAsksFor)
{
    EXPECT_THAT(codesOf(rideUpTo(60s)),
                ElementsAre(0xD00A, 0xD00C, 0xD00E, 0xD0E0, 0xD0E2, 0xFF0000, 0xFF0001, 0xFF0002));
}

TEST(UTRANScenario, SendsEveryCodeInItsFirstSecond)
{
    EXPECT_EQ(codesOf(rideUpTo(1s)).size(), 8U);
}

TEST(UTRANScenario, SomeMessagesCarryTheTransportPrefix)
{
    const std::size_t prefixed = prefixedCount(rideUpTo(60s));
    EXPECT_GT(prefixed, 50U);
    EXPECT_LT(prefixed, 600U);
}

TEST_F(RideTest, FillsEveryKeyOfEverySection)
{
    for (const auto& [key, texts] : shown)
        EXPECT_GT(texts.size(), texts.count("-")) << key;
    for (const char* key :
         {"Neighbor Cell List/UARFCN", "Neighbor Cell List/Cell ID",
          "Neighbor Cell List/Filter RSCP", "Neighbor Cell List/Status",
          "Neighbor Cell List/inJDCS", "TRCH BLER/TRCH ID", "TRCH BLER/TRCH BLER Measurement",
          "CCTRCH SIR/CCTRCH ID", "CCTRCH SIR/TSNUM", "CCTRCH SIR/SIR", "PDP Context Info/APN",
          "SIM Info/EF-OPLMNAcT"})
        EXPECT_TRUE(shown.contains(key)) << key;
}

TEST_F(RideTest, GoesThroughEveryStateOfTheConnection)
{
    EXPECT_THAT(shown["RRC Info/State"], ElementsAre("-", "Cell DCH", "Cell Fach", "Cell PCH",
                                                     "Cell URA PCH", "Connecting", "Disconnected"));
}

TEST_F(RideTest, GoesThroughSeveralCellsAreasAndBands)
{
    EXPECT_GE(shown["Serving Cell Info/Cell ID"].size(), 5U);
    EXPECT_GE(shown["Serving Cell Info/Cell Scrambling Code"].size(), 5U);
    EXPECT_THAT(shown["Serving Cell Info/Local Area Code"], ElementsAre("-", "4711", "4712"));
    EXPECT_THAT(shown["Serving Cell Info/Freq Band Indicator"], ElementsAre("-", "34", "39"));
    EXPECT_THAT(shown["Serving Cell Info/Allowed Access"], ElementsAre("-", "All Calls"));
}

TEST_F(RideTest, NeighborsHaveEveryStatusAndMove)
{
    EXPECT_THAT(shown["Neighbor Cell List/Status"], ElementsAre("ASET", "DSET", "MSET"));
    EXPECT_THAT(shown["Neighbor Cell List/inJDCS"], ElementsAre("FALSE", "TRUE"));
    const auto [low, high] = rangeOf("Neighbor Cell List/Filter RSCP");
    EXPECT_LT(low, 0.2);
    EXPECT_GT(high, 0.6);
}

TEST_F(RideTest, ErrorRatesAndSignalLevelsMoveWithinReason)
{
    const auto [lowRate, highRate] = rangeOf("TRCH BLER/TRCH BLER Measurement");
    EXPECT_LE(lowRate, 2);
    EXPECT_GE(highRate, 8);
    EXPECT_LE(highRate, 60);
    const auto [lowRatio, highRatio] = rangeOf("CCTRCH SIR/SIR");
    EXPECT_GE(highRatio - lowRatio, 10);
    EXPECT_LE(highRatio, 60);
    EXPECT_GE(shown["TRCH BLER/TRCH ID"].size(), 3U);
    EXPECT_THAT(shown["CCTRCH SIR/TSNUM"], ElementsAre("4", "5"));
}

TEST_F(RideTest, PdpContextsComeAndGo)
{
    EXPECT_THAT(shown["PDP Context Info/APN"], ElementsAre("ims", "internet"));
}

} // namespace ventrik
