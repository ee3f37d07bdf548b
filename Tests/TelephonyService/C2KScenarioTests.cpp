#include "Platform/TelephonyConstants.h"
#include "TelephonyService/C2KScenario.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsSupersetOf;

std::vector<TimedMessage> rideUpTo(std::chrono::seconds end, std::uint32_t seed = 1)
{
    C2KScenario scenario(seed);
    return messagesUpTo(scenario, end);
}

// What the decoders show, sampled over a long ride.
class C2KRideTest : public ScenarioFixture
{
  protected:
    C2KRideTest() { decode(rideUpTo(400s), kQXLogChannelTechnology_Orbel_CDMA, "C2KTemplate"); }

    /// The texts under a key without those that are no numbers.
    std::pair<double, double> numbersOf(const std::string& key)
    {
        std::erase_if(shown[key],
                      [](const std::string& text) { return text.empty() || text == "N/A"; });
        return rangeOf(key);
    }
    /// The names of the pilots ever shown in a group.
    std::set<std::string> pilotsIn(const std::string& group)
    {
        std::set<std::string> pilots;
        for (const auto& [key, texts] : shown)
            if (key.starts_with(group + "/") && key != group + "/_sorted")
                pilots.insert(key.substr(key.find(';', group.size()) + 1));
        return pilots;
    }
};

} // namespace

TEST(C2KScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 7)));
}

TEST(C2KScenario, IsAnotherRideForAnotherSeed)
{
    EXPECT_FALSE(areSame(rideUpTo(60s, 7), rideUpTo(60s, 8)));
}

TEST(C2KScenario, SendsAbout20MessagesASecondAndMoreInACall)
{
    const auto messages = rideUpTo(100s);
    EXPECT_GE(messages.size(), 2000U);
    EXPECT_LE(messages.size(), 3500U);
    EXPECT_TRUE(std::ranges::is_sorted(messages, {}, &TimedMessage::due));
}

TEST(C2KScenario, SendsEveryCodeThatTheStartCommandAsksFor)
{
    EXPECT_THAT(codesOf(rideUpTo(60s)),
                ElementsAre(0x108A, 0x1183, 0x1192, 0x119C, 0x119D, 0x127E, 0x12B6, 0x134F));
}

TEST(C2KScenario, SendsAllButTheCallInItsFirstSecond)
{
    EXPECT_EQ(codesOf(rideUpTo(1s)).size(), 7U);
}

TEST(C2KScenario, SomeMessagesCarryTheTransportPrefix)
{
    const std::size_t prefixed = prefixedCount(rideUpTo(60s));
    EXPECT_GT(prefixed, 50U);
    EXPECT_LT(prefixed, 600U);
}

TEST_F(C2KRideTest, FillsEveryLabel)
{
    for (const auto& [key, texts] : shown) {
        const std::string label = key.substr(key.find('/') + 1);
        EXPECT_TRUE(texts.size() > texts.count("") || shown.contains(label + "/_sorted")) << key;
    }
    for (const char* group :
         {"3;Active Set/_sorted", "4;Fingers/_sorted", "3;Active Set Pilots/_sorted"})
        EXPECT_TRUE(shown.contains(group)) << group;
}

TEST_F(C2KRideTest, GoesThroughTheStatesOfBothSystems)
{
    EXPECT_THAT(shown["1;1x/1;State"],
                ElementsAre("", "Acquisition [3]", "Paging [6]", "Slotted mode sleep state [7]",
                            "Sync [4]", "Traffic [8]"));
    EXPECT_THAT(shown["2;EV-DO/1;State"],
                ElementsAre("", "Access [4]", "Acquisition [1]", "Connected [5]", "Idle [3]",
                            "Inactive [0]", "Sync [2]"));
    EXPECT_THAT(shown["4;Session/1;Session State"],
                ElementsAre("", "AMP setup [1]", "AT-initiated neg [2]", "Closed [0]",
                            "Initiated neg [3]", "Open [4]"));
}

TEST_F(C2KRideTest, ComesToAnotherSystem)
{
    EXPECT_THAT(shown["6;System/2;System ID"], ElementsAre("4139", "5120"));
    EXPECT_THAT(shown["6;System/1;Roaming"], ElementsAre("OFF [0]", "ON [1]"));
    EXPECT_EQ(shown["6;System/4;Base Station ID"].size(), 5U);
    EXPECT_THAT(shown["2;Radio/2;Rx 0 Channel"], ElementsAre("", "283", "425"));
    EXPECT_THAT(shown["2;Radio/2;Channel"], ElementsAre("", "475", "630"));
    EXPECT_THAT(shown["4;Session/3;Color Code"], ElementsAre("", "112", "37"));
    EXPECT_THAT(shown["4;Session/2;UATI"], IsSupersetOf({"0x000000", "0x0a1b00", "0x0a1b01"}));
}

TEST_F(C2KRideTest, PilotsComeAndGo)
{
    for (const char* group : {"3;Active Set", "4;Fingers", "3;Active Set Pilots"})
        EXPECT_THAT(pilotsIn(group), IsSupersetOf({"12", "180", "348", "24", "192"})) << group;
    EXPECT_TRUE(shown.contains("3;Active Set/1;180"));
    EXPECT_TRUE(shown["1;1x/4;Fingers"].contains("(none)"));
    EXPECT_TRUE(shown["2;EV-DO/3;Active Set Pilots"].contains("(none)"));
    EXPECT_TRUE(shown["2;Radio/6;Serving PN Offset"].contains("Invalid Value"));
}

TEST_F(C2KRideTest, LevelsMoveWithinReason)
{
    for (const char* key : {"2;Radio/3;Rx 0 AGC", "2;Radio/6;Rx 1 AGC", "2;Radio/4;Rx 1 AGC"}) {
        const auto [low, high] = numbersOf(key);
        EXPECT_GT(low, -100) << key;
        EXPECT_LT(high, -50) << key;
        EXPECT_GT(high - low, 10) << key;
    }
    for (const char* key : {"2;Radio/7;Tx AGC", "2;Radio/5;Tx AGC"}) {
        const auto [low, high] = numbersOf(key);
        EXPECT_GT(low, -30) << key;
        EXPECT_LT(high, 23) << key;
        EXPECT_GT(high - low, 10) << key;
    }
}

TEST_F(C2KRideTest, FramesAreLostInCallsAndTheLastRateStays)
{
    EXPECT_TRUE(shown["1;1x/5;Traffic FER"].contains("0.00%"));
    const auto [low, high] = numbersOf("1;1x/5;Traffic FER");
    EXPECT_GT(high, 2);
    EXPECT_LT(high, 20);
    EXPECT_TRUE(std::ranges::any_of(shown["1;1x/5;Traffic FER"], [](const std::string& text) {
        return text.ends_with("% (old)");
    }));
}

TEST_F(C2KRideTest, DataFlowsBothWays)
{
    for (const char* key : {"5;Data Rates/1;Forward Link", "5;Data Rates/2;Reverse Link"}) {
        EXPECT_GT(shown[key].size(), 15U) << key;
        EXPECT_EQ(numbersOf(key).first, 0) << key;
    }
    EXPECT_GT(numbersOf("5;Data Rates/1;Forward Link").second, 1000);
    EXPECT_LT(numbersOf("5;Data Rates/1;Forward Link").second, 3100);
    EXPECT_GT(numbersOf("5;Data Rates/2;Reverse Link").second, 100);
    EXPECT_LT(numbersOf("5;Data Rates/2;Reverse Link").second, 1800);
}

} // namespace ventrik
