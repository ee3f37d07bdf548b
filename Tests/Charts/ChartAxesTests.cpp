#include "Charts/ChartAxes.h"
#include "Tests/Charts/ChartTimes.h"

#include <gmock/gmock.h>

#include <limits>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::SizeIs;

std::vector<std::string> textsOf(const ValueAxis& axis)
{
    std::vector<std::string> texts;
    for (const ValueTick& tick : axis.ticks)
        texts.push_back(tick.text);
    return texts;
}

std::vector<std::string> timeTexts(double first, double last, int most, int secondsFromUtc = 0)
{
    std::vector<std::string> texts;
    for (const TimeTick& tick : timeTicks(at(first), at(last), most, secondsFromUtc))
        texts.push_back(tick.text);
    return texts;
}

} // namespace

TEST(ValueAxisTest, StepsOfOneTwoAndFive)
{
    EXPECT_THAT(textsOf(valueAxis(0, 4, 0, 5)), ElementsAre("0", "1", "2", "3", "4"));
    EXPECT_THAT(textsOf(valueAxis(0, 8, 0, 5)), ElementsAre("0", "2", "4", "6", "8"));
    EXPECT_THAT(textsOf(valueAxis(0, 20, 0, 5)), ElementsAre("0", "5", "10", "15", "20"));
    EXPECT_THAT(textsOf(valueAxis(-110, -70, 0, 5)),
                ElementsAre("-110", "-100", "-90", "-80", "-70"));
}

TEST(ValueAxisTest, EndsAtRoundValuesAroundAll)
{
    const ValueAxis axis = valueAxis(-107.25, -72.5, 0, 4);
    EXPECT_EQ(axis.low, -110);
    EXPECT_EQ(axis.high, -70);
    EXPECT_THAT(textsOf(axis), ElementsAre("-100", "-80"));
}

TEST(ValueAxisTest, FractionsHaveTheDecimalsOfTheirStep)
{
    EXPECT_THAT(textsOf(valueAxis(0.1, 0.5, 0, 5)), ElementsAre("0.1", "0.2", "0.3", "0.4", "0.5"));
    EXPECT_THAT(textsOf(valueAxis(0, 0.002, 0, 3)), ElementsAre("0", "0.001", "0.002"));
}

TEST(ValueAxisTest, OneValueStandsInTheMiddleOfTheLeastSpan)
{
    const ValueAxis axis = valueAxis(-85, -85, 10, 3);
    EXPECT_EQ(axis.low, -90);
    EXPECT_EQ(axis.high, -80);
}

TEST(ValueAxisTest, NeverHasMoreTicksThanAsked)
{
    for (double span = 0.01; span < 1e6; span *= 1.37)
        for (int most = 2; most < 12; ++most)
            EXPECT_LE(valueAxis(-span / 3, span, 0, most).ticks.size(), most) << span;
}

TEST(ValueAxisTest, ValuesBeyondAllReasonEnd)
{
    constexpr double huge = std::numeric_limits<double>::max();
    EXPECT_LE(valueAxis(-huge, huge, 0, 5).ticks.size(), 5U);
    const ValueAxis narrow = valueAxis(1e15, 1e15, 0, 5);
    EXPECT_LE(narrow.ticks.size(), 5U);
    EXPECT_LT(narrow.low, narrow.high);
}

TEST(TimeTicksTest, StandAtRoundTimes)
{
    EXPECT_THAT(timeTexts(0.4, 4.4, 6),
                ElementsAre("10:00:01", "10:00:02", "10:00:03", "10:00:04"));
    EXPECT_THAT(timeTexts(3, 44, 6), ElementsAre("10:00:10", "10:00:20", "10:00:30", "10:00:40"));
    EXPECT_THAT(timeTexts(0, 60, 5),
                ElementsAre("10:00:00", "10:00:15", "10:00:30", "10:00:45", "10:01:00"));
}

TEST(TimeTicksTest, LeaveTheSecondsOutFromMinutesOn)
{
    EXPECT_THAT(timeTexts(20, 320, 6), ElementsAre("10:01", "10:02", "10:03", "10:04", "10:05"));
    EXPECT_THAT(timeTexts(1, 7200, 5), ElementsAre("10:30", "11:00", "11:30", "12:00"));
}

TEST(TimeTicksTest, HaveTenthsBelowASecond)
{
    EXPECT_THAT(timeTexts(0.3, 1.1, 3), ElementsAre("10:00:00.5", "10:00:01.0"));
}

TEST(TimeTicksTest, AreRoundInTheirZone)
{
    // Nepal is 5:45 h ahead: 10:00 UTC is 15:45 there.
    EXPECT_THAT(timeTexts(0, 3 * 3600, 4, 20700), ElementsAre("16:00", "17:00", "18:00"));
    EXPECT_THAT(timeTexts(0, 7200, 3, -3600), ElementsAre("09:00", "10:00", "11:00"));
}

TEST(TimeTicksTest, MidnightShowsTheDate)
{
    EXPECT_THAT(timeTexts(0, 24 * 3600, 5), ElementsAre("12:00", "18:00", "23 Nov", "06:00"));
    EXPECT_THAT(timeTexts(0, 3 * 86400, 4), ElementsAre("23 Nov", "24 Nov", "25 Nov"));
}

TEST(TimeTicksTest, AreOneWhereThereIsRoomForNoMore)
{
    EXPECT_THAT(timeTexts(3, 44, 1), ElementsAre("10:00:30"));
    for (double span = 0.5; span < 4e8; span *= 1.7)
        EXPECT_THAT(timeTicks(at(0.05), at(0.05 + span), 1, 3600), SizeIs(1)) << span;
}

TEST(TimeTicksTest, NeverAreMoreThanAsked)
{
    for (double span = 0.5; span < 4e8; span *= 1.7)
        for (int most = 1; most < 20; most += 3)
            EXPECT_LE(timeTicks(at(0), at(span), most, 3600).size(), most) << span;
}

TEST(TimeTicksTest, TheEndsOfTimeDoNotOverflow)
{
    EXPECT_THAT(timeTicks(Clock::TimePoint::min(), Clock::TimePoint::max(), 5, 50400),
                SizeIs(testing::Le(5U)));
    EXPECT_THAT(timeTicks(at(10), at(0), 5, 0), SizeIs(testing::Le(1U)));
}

} // namespace ventrik
