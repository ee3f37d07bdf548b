#pragma once

#include "Platform/Clock.h"

#include <chrono>
#include <cstdint>
#include <string>

namespace ventrik
{

/// At most that many decimals (0 to 17) and none that are 0: "-84", "-63.75". A dash for what is no
/// number.
std::string shortNumber(double value, int decimals = 2);

/// The same with a sign also in front of positive ones: "+3.5".
std::string signedNumber(double value);

// Times of day and dates east of UTC by that many seconds.

std::string timeText(Clock::TimePoint time, std::int32_t secondsFromUtc);      ///< "14:03:27"
std::string exactTimeText(Clock::TimePoint time, std::int32_t secondsFromUtc); ///< "14:03:27.5"
std::string minuteText(Clock::TimePoint time, std::int32_t secondsFromUtc);    ///< "14:03"
std::string dayText(Clock::TimePoint time, std::int32_t secondsFromUtc);       ///< "22 Nov"
std::string dateText(Clock::TimePoint time, std::int32_t secondsFromUtc);      ///< "2026-11-22"
std::string zoneText(std::int32_t secondsFromUtc);                             ///< "UTC+01:00"

/// "0.4 s", "12.5 s", "3 min 05 s", "2 h 05 min"; never negative.
std::string durationText(std::chrono::nanoseconds duration);

} // namespace ventrik
