#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListReader.h"
#include "TelephonyService/CellMonitorScenario.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

std::vector<TimedMessage> walkUpTo(std::chrono::seconds end, std::uint32_t seed = 1)
{
    CellMonitorScenario scenario(seed);
    return messagesUpTo(scenario, end);
}

// Is every leaf a text?
bool isAllText(const PlistValue& value)
{
    if (const PlistArray* elements = value.array())
        return std::ranges::all_of(*elements, isAllText);
    if (const PlistDictionary* entries = value.dictionary())
        return std::ranges::all_of(*entries, isAllText, &PlistDictionary::Entry::value);
    return value.string() != nullptr;
}

// What the decoder shows, sampled over a long walk.
class CellMonitorWalkTest : public ScenarioFixture
{
  protected:
    CellMonitorWalkTest() { decode(walkUpTo(400s), kQXLogChannelTechnology_IFX, "LTE"); }
};

} // namespace

TEST(CellMonitorScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(walkUpTo(60s, 7), walkUpTo(60s, 7)));
    EXPECT_FALSE(areSame(walkUpTo(60s, 7), walkUpTo(60s, 8)));
}

TEST(CellMonitorScenario, SendsTwoMessagesASecondFromTheStart)
{
    const auto messages = walkUpTo(60s);
    EXPECT_EQ(messages.size(), 120U);
    EXPECT_EQ(messages.front().due, 0s);
    EXPECT_EQ(messages[1].due, 500ms);
}

TEST(CellMonitorScenario, SendsNothingButTexts)
{
    for (const TimedMessage& message : walkUpTo(60s)) {
        const auto reading = readPropertyList(message.data);
        ASSERT_TRUE(reading) << reading.error;
        EXPECT_TRUE(isAllText(*reading.value));
    }
}

TEST(CellMonitorScenario, SendsTheServicesLineFirstInEachList)
{
    for (const TimedMessage& message : walkUpTo(60s)) {
        const auto reading = readPropertyList(message.data);
        for (const char* key : {"GSM Neighbor Cells", "UMTS Neighbor Cells"}) {
            const PlistArray& cells = *reading.value->dictionary()->find(key)->array();
            EXPECT_EQ(cells[0], PlistValue(fmt::format("{} cells", cells.size() - 1)));
        }
    }
}

TEST_F(CellMonitorWalkTest, GoesThroughSeveralCellsAndAreas)
{
    EXPECT_THAT(shown["Serving Cell/Cell ID"], ElementsAre("1201", "1202", "1209", "2044", "2047"));
    EXPECT_THAT(shown["Serving Cell/LAC"], ElementsAre("4711", "4715"));
    const auto [low, high] = rangeOf("Serving Cell/RxLev");
    EXPECT_GT(low, -95);
    EXPECT_LT(high, -50);
}

TEST_F(CellMonitorWalkTest, ShowsTheStateWithoutItsName)
{
    EXPECT_THAT(shown["/Registration"], ElementsAre("Registered, busy", "Registered, home"));
}

TEST_F(CellMonitorWalkTest, MakesCalls)
{
    EXPECT_THAT(shown["Call/Channel"], ElementsAre("TCH/F"));
    const auto [low, high] = rangeOf("Call/RxQual");
    EXPECT_EQ(low, 0);
    EXPECT_LE(high, 7);
}

TEST_F(CellMonitorWalkTest, NeighborsOfBothKindsComeAndGo)
{
    EXPECT_EQ(shown["GSM Neighbor Cells/ARFCN"].size(), 5U);
    EXPECT_EQ(shown["UMTS Neighbor Cells/Scrambling Code"].size(), 3U);
    const auto [low, high] = rangeOf("UMTS Neighbor Cells/RSCP");
    EXPECT_GE(low, -105);
    EXPECT_LT(high, -60);
}

} // namespace ventrik
