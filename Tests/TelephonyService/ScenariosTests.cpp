#include "TelephonyService/Scenarios.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

std::set<std::uint32_t> codesOfScenario(std::string_view technology)
{
    const auto scenario = makeScenario(*technologyNamed(technology), 1);
    return scenario ? codesOf(messagesUpTo(*scenario, 60s)) : std::set<std::uint32_t>{};
}

} // namespace

TEST(Scenarios, EachTechnologyGetsItsOwn)
{
    EXPECT_TRUE(codesOfScenario("gsm").contains(0x417A));
    EXPECT_TRUE(codesOfScenario("lte").contains(0xB17F));
    EXPECT_TRUE(codesOfScenario("utran").contains(0xD00A));
    EXPECT_TRUE(codesOfScenario("c2k").contains(0x108A));
}

TEST(Scenarios, TheCellMonitorGetsPropertyListsWithoutPackets)
{
    const Bytes message = makeScenario(*technologyNamed("ifx"), 1)->next()->data;
    EXPECT_EQ(std::string(message.begin(), message.begin() + 5), "<?xml");
}

TEST(Scenarios, TheSeedReachesTheScenario)
{
    const auto technology = *technologyNamed("utran");
    EXPECT_FALSE(areSame(messagesUpTo(*makeScenario(technology, 1), 10s),
                         messagesUpTo(*makeScenario(technology, 2), 10s)));
    EXPECT_TRUE(areSame(messagesUpTo(*makeScenario(technology, 2), 10s),
                        messagesUpTo(*makeScenario(technology, 2), 10s)));
}

TEST(Scenarios, ATechnologyWithoutAScenarioGetsNone)
{
    EXPECT_EQ(makeScenario({"kQXLogChannelTechnology_Other", "other", 200, "Other"}, 1), nullptr);
}

} // namespace ventrik
