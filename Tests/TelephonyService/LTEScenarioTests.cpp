#include "Platform/TelephonyConstants.h"
#include "TelephonyService/LTEScenario.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

std::vector<TimedMessage> driveUpTo(std::chrono::seconds end, std::uint32_t seed = 1)
{
    LTEScenario scenario(seed);
    return messagesUpTo(scenario, end);
}

// What the decoders show, sampled over a long drive.
class DriveTest : public ScenarioFixture
{
  protected:
    DriveTest() { decode(driveUpTo(400s), kQXLogChannelTechnology_Orbel_LTE, "LTE"); }
};

} // namespace

TEST(LTEScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(driveUpTo(60s, 7), driveUpTo(60s, 7)));
}

TEST(LTEScenario, IsAnotherDriveForAnotherSeed)
{
    EXPECT_FALSE(areSame(driveUpTo(60s, 7), driveUpTo(60s, 8)));
}

TEST(LTEScenario, SendsAbout20MessagesASecondInOrder)
{
    const auto messages = driveUpTo(100s);
    EXPECT_GE(messages.size(), 2000U);
    EXPECT_LE(messages.size(), 2500U);
    EXPECT_TRUE(std::ranges::is_sorted(messages, {}, &TimedMessage::due));
}

TEST(LTEScenario, HasBursts)
{
    EXPECT_GE(largestBurst(driveUpTo(100s)), 6);
}

TEST(LTEScenario, SendsEveryCodeThatTheStartCommandAsksFor)
{
    EXPECT_THAT(codesOf(driveUpTo(60s)),
                testing::ElementsAre(0xB0C1, 0xB0C2, 0xB179, 0xB17F, 0xB180, 0xB186, 0xFF0000,
                                     0xFF0001, 0xFF0002));
}

TEST(LTEScenario, SendsACellMonitorArrayEveryFewSeconds)
{
    std::chrono::nanoseconds last{};
    for (const auto& message : driveUpTo(100s))
        if (codeOf(message) == 0xFF0001) {
            EXPECT_LE(message.due - last, 3s);
            last = message.due;
        }
    EXPECT_GT(last, 96s);
}

TEST(LTEScenario, SomeMessagesCarryTheTransportPrefix)
{
    const std::size_t prefixed = prefixedCount(driveUpTo(60s));
    EXPECT_GT(prefixed, 50U);
    EXPECT_LT(prefixed, 600U);
}

TEST_F(DriveTest, GoesThroughSeveralCellsBandsAndBandwidths)
{
    EXPECT_GE(shown["Serving Cell Info/Physical Cell ID"].size(), 5U);
    EXPECT_GE(shown["Serving Cell Info/Freq Band Indicator"].size(), 3U);
    EXPECT_GE(shown["Serving Cell Info/Download Bandwidth"].size(), 4U);
    EXPECT_EQ(shown["Serving Cell Info/Download Bandwidth"].count("Unknown"), 0U);
    EXPECT_GE(shown["Serving Cell Info/Tracking Area Code"].size(), 2U);
}

TEST_F(DriveTest, ShowsBelievableLevels)
{
    const auto [lowRsrp, highRsrp] = rangeOf("Serving Cell Measurements/Measured RSRP");
    EXPECT_GT(lowRsrp, -125);
    EXPECT_LT(lowRsrp, -90);
    EXPECT_GT(highRsrp, -80);
    EXPECT_LT(highRsrp, -50);
    const auto [lowRsrq, highRsrq] = rangeOf("Serving Cell Measurements/Measured RSRQ");
    EXPECT_GE(lowRsrq, -19.5);
    EXPECT_LE(highRsrq, -3);
    const auto [lowRssi, highRssi] = rangeOf("Serving Cell Measurements/Measured RSSI");
    EXPECT_GT(lowRssi, -110);
    EXPECT_LT(highRssi, -20);
}

TEST_F(DriveTest, FillsEveryKeyOfEverySection)
{
    for (const auto& [key, texts] : shown)
        EXPECT_GT(texts.size(), texts.count("-")) << key;
    for (const char* key :
         {"Measured Neighbor Cells/Filtered RSRP", "Detected Cells/Physical Cell ID",
          "Neighbor Cells List/Srxlev", "Reselection Candidates List/Cell ID",
          "PDP Context Info/APN", "SIM Info/EF-OPLMNAcT"})
        EXPECT_TRUE(shown.contains(key)) << key;
}

TEST_F(DriveTest, PdpContextsComeAndGo)
{
    EXPECT_THAT(shown["PDP Context Info/APN"], testing::ElementsAre("ims", "internet"));
}

} // namespace ventrik
