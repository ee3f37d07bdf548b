#pragma once

#include "Model/SeriesPoint.h"

#include <chrono>
#include <cstdint>

namespace ventrik
{

using namespace std::chrono_literals;

/// 10:00 UTC on the 22nd of November 2026.
inline constexpr Clock::TimePoint morning{
    std::chrono::sys_days{std::chrono::year_month_day{
        std::chrono::year{2026}, std::chrono::November, std::chrono::day{22}}} +
    10h};

/// So many seconds later.
constexpr Clock::TimePoint at(double seconds)
{
    return morning + std::chrono::nanoseconds(static_cast<std::int64_t>(seconds * 1e9));
}

constexpr SeriesPoint point(double from, double until, double value, bool isEnd = false)
{
    return {at(from), at(until), value, isEnd};
}

} // namespace ventrik
