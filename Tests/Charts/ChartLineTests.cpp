#include "Charts/ChartLine.h"
#include "Tests/Charts/ChartTimes.h"

#include <gmock/gmock.h>

#include <cmath>

namespace ventrik
{

namespace
{

using testing::Optional;

const std::vector<SeriesPoint> series{point(0, 2, -80), point(3, 5, -90), point(15, 16, -70, true),
                                      point(17, 20, -60), point(30.5, 31, -50)};

} // namespace

TEST(ChartLineTest, AValueStandsFromItsTimeOn)
{
    EXPECT_EQ(valueAt(series, at(-0.1)), std::nullopt);
    EXPECT_THAT(valueAt(series, at(0)), Optional(-80));
    EXPECT_THAT(valueAt(series, at(2.9)), Optional(-80));
    EXPECT_THAT(valueAt(series, at(3)), Optional(-90));
}

TEST(ChartLineTest, AValueIsHeldOverTenSeconds)
{
    EXPECT_THAT(valueAt(series, at(14.9)), Optional(-90));
    EXPECT_THAT(valueAt(series, at(20)), Optional(-60));
    EXPECT_EQ(valueAt(series, at(20.1)), std::nullopt);
}

TEST(ChartLineTest, NothingStandsBehindAnEnd)
{
    EXPECT_THAT(valueAt(series, at(16)), Optional(-70));
    EXPECT_EQ(valueAt(series, at(16.1)), std::nullopt);
}

TEST(ChartLineTest, TheNewestValueIsHeldForTenSeconds)
{
    EXPECT_THAT(valueAt(series, at(41)), Optional(-50));
    EXPECT_EQ(valueAt(series, at(41.1)), std::nullopt);
    EXPECT_EQ(valueAt({}, at(0)), std::nullopt);
}

TEST(ChartLineTest, WhatIsNoNumberIsNoValue)
{
    const std::vector<SeriesPoint> odd{point(0, 1, std::nan("")), point(2, 3, INFINITY)};
    EXPECT_EQ(valueAt(odd, at(0.5)), std::nullopt);
    EXPECT_EQ(valueAt(odd, at(2.5)), std::nullopt);
    EXPECT_FALSE(valuesWithin(odd, at(0), at(3)));
}

TEST(ChartLineTest, LeastAndGreatestAreThoseThatShow)
{
    const auto range = valuesWithin(series, at(4), at(16));
    ASSERT_TRUE(range);
    EXPECT_EQ(range->least, -90);
    EXPECT_EQ(range->greatest, -70);
}

TEST(ChartLineTest, AValueThatIsHeldIntoTheRangeShows)
{
    const auto range = valuesWithin(series, at(7), at(8));
    ASSERT_TRUE(range);
    EXPECT_EQ(range->least, -90);
    EXPECT_FALSE(valuesWithin(series, at(22), at(28)));
    EXPECT_EQ(valuesWithin(series, at(3), at(4))->greatest, -90) << "the step is at the edge";
}

TEST(ChartLineTest, TheNewestValueShowsWhileItIsHeld)
{
    const auto range = valuesWithin(series, at(32), at(35));
    ASSERT_TRUE(range);
    EXPECT_EQ(range->least, -50);
    EXPECT_FALSE(valuesWithin(series, at(42), at(45)));
}

TEST(ChartLineTest, OnlyThePointsAroundAreLookedAt)
{
    const auto near = pointsWithin(series, at(4), at(4.5));
    ASSERT_EQ(near.size(), 3U);
    EXPECT_EQ(near.front().value, -80);
    EXPECT_EQ(near.back().value, -70);
}

} // namespace ventrik
