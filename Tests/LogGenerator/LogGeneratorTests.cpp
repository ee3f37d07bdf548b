#include "LogGenerator/Core/LogGenerator.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

class HistoryTest : public GeneratorFixture
{
  protected:
    HistoryTest()
    {
        state.set("DisplayState", Bytes{1, 2});
        state.set("Display", PlistDictionary{{"RSSI", "-70"}});
        state.set("ExtraInfo", PlistDictionary());
    }

    void update() { LogGenerator::updateHistoryInState(state, platform.clock); }
    const PlistArray& history() { return *state.find("History")->array(); }
    const PlistDictionary& newest() { return *history()[history().size() - 1].dictionary(); }
};

class TechnologyTest : public GeneratorFixture
{
  protected:
    bool known(const PlistValue& technology)
    {
        return LogGenerator::generatorFromTechnology(technology, services()) != nullptr;
    }
};

} // namespace

TEST_F(HistoryTest, AnEntryHoldsItsFiveKeysInOrder)
{
    update();
    EXPECT_THAT(keysOf(newest()), testing::ElementsAre("DisplayState", "Display", "ExtraInfo",
                                                       "Date", "Description"));
    EXPECT_EQ(textAt(newest(), {"Date"}), "2026-11-16 06:10:28 +0000");
    EXPECT_EQ(textAt(newest(), {"Description"}), "Snapshot (2026-11-16 06:10:28 +0000)");
}

TEST_F(HistoryTest, ASixthDisplayDropsTheOldest)
{
    for (int i = 0; i < 6; ++i) {
        state.set("DisplayState", Bytes{static_cast<std::uint8_t>(i)});
        update();
    }
    ASSERT_EQ(history().size(), 5U);
    EXPECT_EQ(*history()[0].dictionary()->find("DisplayState")->data(), Bytes{1});
    EXPECT_EQ(*newest().find("DisplayState")->data(), Bytes{5});
}

TEST_F(HistoryTest, NineEntriesAreCutToFourAndGrowToFive)
{
    PlistArray entries;
    for (int i = 0; i < 9; ++i)
        entries.append(i);
    state.set("History", entries);
    update();
    ASSERT_EQ(history().size(), 5U);
    EXPECT_EQ(history()[0], PlistValue(5));
    EXPECT_EQ(history()[3], PlistValue(8));
}

TEST_F(HistoryTest, AStateWithoutDisplayStateGivesAnEmptyEntry)
{
    state.remove("DisplayState");
    update();
    EXPECT_TRUE(newest().empty());
}

TEST_F(HistoryTest, AStateWithoutDisplayGivesAnEntryOfDisplayStateOnly)
{
    state.remove("Display");
    update();
    EXPECT_THAT(keysOf(newest()), testing::ElementsAre("DisplayState"));
}

TEST_F(HistoryTest, AStateWithoutExtraInfoGivesAnEntryWithoutDate)
{
    state.remove("ExtraInfo");
    update();
    EXPECT_THAT(keysOf(newest()), testing::ElementsAre("DisplayState", "Display"));
}

TEST_F(HistoryTest, TheTopLevelIsCopiedAndNestedContainersAreShared)
{
    PlistDictionary nested;
    PlistDictionary display{{"Cell", nested}};
    state.set("Display", display);
    update();
    display.set("Later", "x");
    nested.set("RSSI", "-70");
    const PlistDictionary& kept = *newest().find("Display")->dictionary();
    EXPECT_FALSE(kept.contains("Later"));
    EXPECT_EQ(textAt(kept, {"Cell", "RSSI"}), "-70");
}

TEST_F(TechnologyTest, EachTechnologyHasItsGenerator)
{
    EXPECT_TRUE(known(kQXLogChannelTechnology_IFX));
    EXPECT_TRUE(known(kQXLogChannelTechnology_Orbel_GSM));
    EXPECT_TRUE(known(kQXLogChannelTechnology_Orbel_CDMA));
    EXPECT_TRUE(known(kQXLogChannelTechnology_Orbel_LTE));
    EXPECT_TRUE(known(kQXLogChannelTechnology_Orbel_UTRAN2));
}

TEST_F(TechnologyTest, AnUnknownTechnologyGivesNone)
{
    EXPECT_FALSE(known("kQXLogChannelTechnology_Orbel_NR"));
    EXPECT_FALSE(known(""));
    EXPECT_FALSE(known(4));
    EXPECT_FALSE(known(PlistDictionary()));
}

} // namespace ventrik
