#pragma once

#include "Model/SeriesPoint.h"

#include <optional>
#include <span>
#include <string>

namespace ventrik
{

/// A value over time. Its points stand in the order of their times and belong to somebody else.
struct ChartLine {
    std::string name;
    std::string unit;
    std::span<const SeriesPoint> points;
};

/// A moment with something to say about it, such as "301 → 302".
struct ChartMark {
    Clock::TimePoint time;
    std::string text;
    bool isMinor = false; ///< the first to give way where there are many
};

/// Whether a line leads from the one point to the next one.
bool leadsOn(const SeriesPoint& point, const SeriesPoint& next);

/// What stood at that time: also while a line leads on to the next point, and for as long after the
/// newest one as a line could still lead on from it.
std::optional<double> valueAt(std::span<const SeriesPoint> points, Clock::TimePoint time);

/// The points of which something shows between the two times, with the ones before and after, from
/// and to which lines lead.
std::span<const SeriesPoint> pointsWithin(std::span<const SeriesPoint> points,
                                          Clock::TimePoint first, Clock::TimePoint last);

struct ValueRange {
    double least;
    double greatest;
};

/// Of the values that stood at some time between the two; none where there were none.
std::optional<ValueRange> valuesWithin(std::span<const SeriesPoint> points, Clock::TimePoint first,
                                       Clock::TimePoint last);

} // namespace ventrik
