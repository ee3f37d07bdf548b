#include "Model/ValueAlert.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using HolderKind = PlaceTable::HolderKind;

/// What an alert that is right says of some numbers: beyond or not.
std::vector<bool> beyond(std::string_view text, const std::vector<double>& numbers)
{
    const AlertReading reading = parseAlert(text);
    EXPECT_TRUE(reading.alert) << reading.error;
    std::vector<bool> result;
    for (const double number : numbers)
        result.push_back(reading.alert && reading.alert->isBeyond(number));
    return result;
}

class AlertWatchTest : public testing::Test
{
  protected:
    AlertWatchTest()
    {
        const PlaceId cell = places.add(PlaceTable::root, HolderKind::Dictionary, "Cell", {});
        level = places.add(cell, HolderKind::Dictionary, "Level", {});
        other = places.add(cell, HolderKind::Dictionary, "Other", {});
    }

    bool take(AlertWatch& watch, PlaceId place, double number)
    {
        return watch.take(place, places, {.text = "", .number = number});
    }

    PlaceTable places;
    PlaceId level;
    PlaceId other;
};

} // namespace

TEST(Alert, ComparesWithItsThreshold)
{
    using testing::ElementsAre;
    EXPECT_THAT(beyond("/a < -110", {-110.5, -110, -109}), ElementsAre(true, false, false));
    EXPECT_THAT(beyond("/a <= -110", {-110.5, -110, -109}), ElementsAre(true, true, false));
    EXPECT_THAT(beyond("/a > 3.5", {3, 3.5, 4}), ElementsAre(false, false, true));
    EXPECT_THAT(beyond("/a>=3.5", {3, 3.5, 4}), ElementsAre(false, true, true));
}

TEST(Alert, KnowsItsPathsAndItsCondition)
{
    const AlertReading reading = parseAlert("  /Neighbors/**/Measured RSRP  <=  -110.25 ");
    ASSERT_TRUE(reading.alert) << reading.error;
    EXPECT_TRUE(reading.alert->paths.selects("/Neighbors/Cells/0/Measured RSRP"));
    EXPECT_FALSE(reading.alert->paths.selects("/Neighbors/Cells/0/Measured RSRQ"));
    EXPECT_EQ(reading.alert->condition, "<= -110.25");
}

TEST(Alert, MayHaveAComparisonInItsPath)
{
    const AlertReading reading = parseAlert("/Cell/Cycles of S < 0 > 5");
    ASSERT_TRUE(reading.alert) << reading.error;
    EXPECT_TRUE(reading.alert->paths.selects("/Cell/Cycles of S < 0"));
    EXPECT_EQ(reading.alert->condition, "> 5");
}

TEST(Alert, SaysInALineWhatIsWrongWithIt)
{
    EXPECT_EQ(parseAlert("/a").error, "Alert \"/a\": there is no <, <=, > or >= in it");
    EXPECT_EQ(parseAlert("").error, "Alert \"\": there is no <, <=, > or >= in it");
    EXPECT_EQ(parseAlert("a < 5").error,
              "Alert \"a < 5\": it does not begin with a path, such as /Cell/Level");
    EXPECT_EQ(parseAlert("< 5").error,
              "Alert \"< 5\": it does not begin with a path, such as /Cell/Level");
    EXPECT_EQ(parseAlert("/a < ").error, "Alert \"/a < \": \"\" is no number");
    for (const std::string_view number : {"x", "5 dB", "inf", "nan", "1e999", "=5"})
        EXPECT_FALSE(parseAlert("/a < " + std::string(number)).alert) << number;
}

TEST_F(AlertWatchTest, FiresWhenTheThresholdIsCrossed)
{
    AlertWatch watch(*parseAlert("/Cell/Level < -110").alert);
    EXPECT_FALSE(take(watch, level, -109));
    EXPECT_TRUE(take(watch, level, -111));
}

TEST_F(AlertWatchTest, FiresAgainOnlyAfterItCameBack)
{
    AlertWatch watch(*parseAlert("/Cell/Level < -110").alert);
    take(watch, level, -109);
    take(watch, level, -111);
    EXPECT_FALSE(take(watch, level, -112));
    EXPECT_FALSE(take(watch, level, -110));
    EXPECT_TRUE(take(watch, level, -110.5));
}

TEST_F(AlertWatchTest, DoesNotFireForWhatWasBeyondFromTheStart)
{
    AlertWatch watch(*parseAlert("/Cell/Level < -110").alert);
    EXPECT_FALSE(take(watch, level, -111));
}

TEST_F(AlertWatchTest, FollowsEachOfItsPlacesByItself)
{
    AlertWatch watch(*parseAlert("/Cell/* < -110").alert);
    take(watch, level, -109);
    EXPECT_FALSE(take(watch, other, -111));
    EXPECT_TRUE(take(watch, level, -111));
}

TEST_F(AlertWatchTest, IgnoresOtherPlacesAndWhatIsNoNumber)
{
    AlertWatch watch(*parseAlert("/Cell/Level < -110").alert);
    take(watch, other, -109);
    EXPECT_FALSE(take(watch, other, -111));
    take(watch, level, -109);
    EXPECT_FALSE(watch.take(level, places, {.text = "-"}));
    EXPECT_TRUE(take(watch, level, -111));
}

TEST_F(AlertWatchTest, ReadsTheNumberOfATextThatNoFieldShows)
{
    AlertWatch watch(*parseAlert("/Cell/Level < -110").alert);
    watch.take(level, places, {.text = "-109 dBm"});
    EXPECT_TRUE(watch.take(level, places, {.text = "-111 dBm"}));
}

TEST_F(AlertWatchTest, ComparesALevelThatLeavesOutItsSignAsItIsDrawn)
{
    const PlaceId serving =
        places.add(PlaceTable::root, HolderKind::Dictionary, "Serving Cell", {});
    const PlaceId cell = places.add(serving, HolderKind::Dictionary, "GSM Serving Cell", {});
    const PlaceId rssi = places.add(cell, HolderKind::Dictionary, "RSSI", {});
    AlertWatch watch(*parseAlert("/Serving Cell/GSM Serving Cell/RSSI < -100").alert);
    EXPECT_FALSE(take(watch, rssi, 99));
    EXPECT_TRUE(take(watch, rssi, 101));
    EXPECT_FALSE(take(watch, rssi, -99));
    EXPECT_TRUE(take(watch, rssi, -101));
}

TEST_F(AlertWatchTest, KnowsPlacesThatCameLater)
{
    AlertWatch watch(*parseAlert("/Late < 0").alert);
    take(watch, level, 1);
    const PlaceId late = places.add(PlaceTable::root, HolderKind::Dictionary, "Late", {});
    take(watch, late, 1);
    EXPECT_TRUE(take(watch, late, -1));
}

} // namespace ventrik
