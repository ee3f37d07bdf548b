#pragma once

#include "Platform/Clock.h"

#include <chrono>
#include <optional>
#include <vector>

namespace ventrik
{

/// For how long a value is held good that has not been told again.
inline constexpr std::chrono::seconds longestHold{10};

/// A number that stood for a while: from when it came until it was last told again.
struct SeriesPoint {
    Clock::TimePoint from;
    Clock::TimePoint until; ///< not before `from`
    double value;
    bool isEnd = false; ///< it went away then: no line leads to the next one
};

/// From that time on the number stands, or none does. What one message tells, it tells at once: of
/// several numbers at one time the last one stays.
void takeNumber(std::vector<SeriesPoint>& points, Clock::TimePoint time,
                std::optional<double> number);
/// What stands was told again then: it goes on, or begins anew where it was not held good so long.
void hearAgain(std::vector<SeriesPoint>& points, Clock::TimePoint time);

} // namespace ventrik
