#pragma once

#include "Platform/Clock.h"

namespace ventrik
{

/// A number that stood for a while: from when it came until it was last told again.
struct SeriesPoint {
    Clock::TimePoint from;
    Clock::TimePoint until; ///< not before `from`
    double value;
    bool isEnd = false; ///< it went away then: no line leads to the next one
};

} // namespace ventrik
