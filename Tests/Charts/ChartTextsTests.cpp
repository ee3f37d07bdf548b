#include "Charts/ChartTexts.h"
#include "Tests/Charts/ChartTimes.h"

#include <gtest/gtest.h>

#include <cmath>

namespace ventrik
{

TEST(ChartTextsTest, NumbersHaveNoDecimalsTheyDoNotNeed)
{
    EXPECT_EQ(shortNumber(-84), "-84");
    EXPECT_EQ(shortNumber(-63.75), "-63.75");
    EXPECT_EQ(shortNumber(-6.5), "-6.5");
    EXPECT_EQ(shortNumber(-0.001), "0");
    EXPECT_EQ(shortNumber(100), "100");
    EXPECT_EQ(shortNumber(1.2345, 3), "1.234");
    EXPECT_EQ(shortNumber(2.5e20), "2.5e+20");
    EXPECT_EQ(shortNumber(std::nan("")), "–");
}

TEST(ChartTextsTest, DifferencesHaveASign)
{
    EXPECT_EQ(signedNumber(3.5), "+3.5");
    EXPECT_EQ(signedNumber(-3.5), "-3.5");
    EXPECT_EQ(signedNumber(0.001), "0");
}

TEST(ChartTextsTest, TimesAreThoseOfTheZone)
{
    EXPECT_EQ(timeText(at(7.96), 0), "10:00:07");
    EXPECT_EQ(exactTimeText(at(7.96), -3600), "09:00:07.9");
    EXPECT_EQ(minuteText(at(61), 20700), "15:46");
    EXPECT_EQ(dayText(at(0), 14 * 3600), "23 Nov");
    EXPECT_EQ(dateText(at(0), -11 * 3600), "2026-11-21");
}

TEST(ChartTextsTest, ZonesAreToldByTheirDistance)
{
    EXPECT_EQ(zoneText(0), "UTC");
    EXPECT_EQ(zoneText(3600), "UTC+01:00");
    EXPECT_EQ(zoneText(-12600), "UTC-03:30");
}

TEST(ChartTextsTest, DurationsAreAsExactAsTheirLengthAsks)
{
    EXPECT_EQ(durationText(450ms), "0.4 s");
    EXPECT_EQ(durationText(59999ms), "59.9 s");
    EXPECT_EQ(durationText(60s), "1 min 00 s");
    EXPECT_EQ(durationText(3600s), "1 h 00 min");
    EXPECT_EQ(durationText(185s), "3 min 05 s");
    EXPECT_EQ(durationText(125min), "2 h 05 min");
    EXPECT_EQ(durationText(-1s), "0.0 s");
}

} // namespace ventrik
