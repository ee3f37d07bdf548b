#include "LogGenerator/Core/DateText.h"

#include <gtest/gtest.h>

namespace ventrik
{

TEST(DateText, WritesDateTimeAndUtcOffset)
{
    // 1794809428 s: 2026-11-16 is day 20773 of 1970 on, 06:10:28 is 22228 s into it.
    EXPECT_EQ(dateText(Clock::TimePoint(std::chrono::seconds(20773LL * 86400 + 22228))),
              "2026-11-16 06:10:28 +0000");
}

TEST(DateText, DropsTheFractionDownward)
{
    EXPECT_EQ(dateText(Clock::TimePoint(std::chrono::milliseconds(59999))),
              "1970-01-01 00:00:59 +0000");
    EXPECT_EQ(dateText(Clock::TimePoint(std::chrono::milliseconds(-1))),
              "1969-12-31 23:59:59 +0000");
}

} // namespace ventrik
