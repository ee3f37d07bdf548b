#include "Charts/LineThinning.h"
#include "Tests/Charts/ChartTimes.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

/// A pixel a second, a pixel a dB; 0 dB at the top.
LineRuns thinned(std::span<const SeriesPoint> points, double first = 0, double last = 100)
{
    return thinnedLine(points, TimeScale(at(first), at(last), 0, last - first),
                       ValueScale(-100, 0, 0, 100));
}

std::vector<SeriesPoint> dense(int count, double distance)
{
    std::vector<SeriesPoint> points;
    for (int i = 0; i < count; ++i)
        points.push_back(point(i * distance, (i + 0.5) * distance, -50 - i % 3));
    return points;
}

} // namespace

TEST(LineThinningTest, ALineIsDrawnAsSteps)
{
    const std::vector points{point(10, 12, -20), point(15, 20, -30)};
    EXPECT_THAT(thinned(points),
                ElementsAre(ElementsAre(Point{10, 20}, Point{12, 20}, Point{15, 20}, Point{15, 30},
                                        Point{20, 30})));
}

TEST(LineThinningTest, MoreThanTenSecondsAreAGap)
{
    const std::vector points{point(10, 12, -20), point(22, 30, -30), point(40.5, 41, -30)};
    EXPECT_THAT(thinned(points), ElementsAre(SizeIs(5), SizeIs(2)));
}

TEST(LineThinningTest, NoLineLeadsOnFromAnEnd)
{
    const std::vector points{point(10, 12, -20, true), point(15, 20, -30)};
    EXPECT_THAT(thinned(points), ElementsAre(ElementsAre(Point{10, 20}, Point{12, 20}),
                                             ElementsAre(Point{15, 30}, Point{20, 30})));
}

TEST(LineThinningTest, NoLineLeadsThroughWhatIsNoNumber)
{
    const std::vector points{point(10, 12, -20), point(13, 14, std::nan("")), point(16, 20, -30)};
    EXPECT_THAT(thinned(points), ElementsAre(ElementsAre(Point{10, 20}, Point{12, 20}),
                                             ElementsAre(Point{16, 30}, Point{20, 30})));
}

TEST(LineThinningTest, WhatIsNoNumberOnlyIsNoRun)
{
    EXPECT_THAT(thinned(std::vector{point(10, 12, INFINITY), point(13, 14, std::nan(""))}),
                IsEmpty());
}

TEST(LineThinningTest, APeakOfAColumnStays)
{
    auto points = dense(1000, 0.1);
    points[503].value = -3;
    points[507].value = -97;
    const LineRuns runs = thinned(points);
    ASSERT_THAT(runs, SizeIs(1));
    EXPECT_THAT(runs[0], testing::Contains(Point{50.3, 3}));
    EXPECT_THAT(runs[0], testing::Contains(testing::Field(&Point::y, 97)));
}

TEST(LineThinningTest, TheNextColumnIsReachedFromTheLastValueOfTheOneBefore)
{
    const std::vector points{point(10.1, 10.1, -50), point(10.2, 10.2, -60), point(10.3, 10.3, -20),
                             point(10.4, 10.4, -55), point(10.5, 10.5, -33), point(11.5, 12, -40)};
    const LineRuns runs = thinned(points);
    ASSERT_THAT(runs, SizeIs(1));
    std::vector<double> heights;
    for (const Point& corner : runs[0])
        heights.push_back(corner.y);
    EXPECT_THAT(heights, ElementsAre(50, 60, 20, 33, 33, 40, 40));
}

TEST(LineThinningTest, WhatIsDrawnGrowsWithThePixelsOnly)
{
    const LineRuns runs = thinned(dense(100000, 0.001));
    ASSERT_THAT(runs, SizeIs(1));
    EXPECT_LE(runs[0].size(), 4 * 102U);
}

TEST(LineThinningTest, GapsOfADenseLineStay)
{
    auto points = dense(1000, 0.1);
    points.erase(points.begin() + 400, points.begin() + 520);
    EXPECT_THAT(thinned(points), SizeIs(2));
}

TEST(LineThinningTest, ManyEndsWithinAColumnAreOneRun)
{
    auto points = dense(1000, 0.001);
    for (SeriesPoint& each : points)
        each.isEnd = true;
    EXPECT_THAT(thinned(points), SizeIs(1));
}

TEST(LineThinningTest, OnlyWhatShowsIsDrawn)
{
    const auto points = dense(1000, 1);
    const LineRuns runs = thinned(points, 500, 510);
    ASSERT_THAT(runs, SizeIs(1));
    EXPECT_LE(runs[0].size(), 40U);
    EXPECT_GE(runs[0].front().x, -1);
    EXPECT_LE(runs[0].back().x, 11);
}

TEST(LineThinningTest, NoPointsAreNoRuns)
{
    EXPECT_THAT(thinned({}), IsEmpty());
}

TEST(TimeScaleTest, MapsThereAndBack)
{
    const TimeScale scale(at(0), at(100), 50, 250);
    EXPECT_DOUBLE_EQ(scale.x(at(25)), 100);
    EXPECT_NEAR(std::chrono::duration<double>(scale.time(100) - at(25)).count(), 0, 1e-6);
    EXPECT_DOUBLE_EQ(scale.x(at(-25)), 0);
}

} // namespace ventrik
