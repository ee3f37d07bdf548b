#pragma once

#include "Platform/Clock.h"

#include <cstdint>
#include <string>
#include <vector>

namespace ventrik
{

struct ValueTick {
    double value;
    std::string text;
};

/// The values that an axis shows, between two round ones.
struct ValueAxis {
    double low;
    double high;
    std::vector<ValueTick> ticks;
};

/// Ticks 1, 2 or 5 times a power of ten apart, at most `most` of them (at least 2), so that the
/// axis has room for all from `least` to `greatest`, and is at least `span` long.
ValueAxis valueAxis(double least, double greatest, double span, int most);

struct TimeTick {
    Clock::TimePoint time;
    std::string text;
};

/// At most `most` ticks at round times of the zone: every 0.1, 0.2, 0.5, 1, 2, 5, 10, 15, 30 s or
/// min, 1, 2, 3, 6, 12 h, or so many days. Midnight shows its date.
std::vector<TimeTick> timeTicks(Clock::TimePoint first, Clock::TimePoint last, int most,
                                std::int32_t secondsFromUtc);

} // namespace ventrik
