#include "Charts/ChartLine.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

// The first point that begins after the time.
auto firstAfter(std::span<const SeriesPoint> points, Clock::TimePoint time)
{
    return std::ranges::upper_bound(points, time, {}, &SeriesPoint::from);
}

bool isHeld(const SeriesPoint& point, Clock::TimePoint time)
{
    return time <= point.until || (!point.isEnd && time - point.until <= longestHold);
}

} // namespace

bool leadsOn(const SeriesPoint& point, const SeriesPoint& next)
{
    return !point.isEnd && next.from - point.until <= longestHold && std::isfinite(point.value) &&
           std::isfinite(next.value);
}

std::optional<double> valueAt(std::span<const SeriesPoint> points, Clock::TimePoint time)
{
    const auto after = firstAfter(points, time);
    if (after == points.begin())
        return std::nullopt;
    const SeriesPoint& point = *std::prev(after);
    const bool stands = time <= point.until ||
                        (after == points.end() ? isHeld(point, time) : leadsOn(point, *after));
    return stands && std::isfinite(point.value) ? std::optional(point.value) : std::nullopt;
}

std::span<const SeriesPoint> pointsWithin(std::span<const SeriesPoint> points,
                                          Clock::TimePoint first, Clock::TimePoint last)
{
    auto begin = std::ranges::lower_bound(points, first, {}, &SeriesPoint::until);
    auto end = firstAfter(points, last);
    if (begin != points.begin())
        --begin;
    if (end != points.end())
        ++end;
    return begin < end ? std::span(begin, end) : std::span<const SeriesPoint>();
}

std::optional<ValueRange> valuesWithin(std::span<const SeriesPoint> points, Clock::TimePoint first,
                                       Clock::TimePoint last)
{
    std::optional<ValueRange> range;
    const auto near = pointsWithin(points, first, last);
    const auto leadsIn = [&](std::size_t place) {
        if (place + 1 == near.size())
            return isHeld(near[place], first);
        return near[place + 1].from > first && leadsOn(near[place], near[place + 1]);
    };
    for (std::size_t place = 0; place < near.size(); ++place) {
        const SeriesPoint& point = near[place];
        const bool isSeen = point.from <= last && (point.until >= first || leadsIn(place));
        if (!isSeen || !std::isfinite(point.value))
            continue;
        if (!range)
            range = ValueRange{point.value, point.value};
        range->least = std::min(range->least, point.value);
        range->greatest = std::max(range->greatest, point.value);
    }
    return range;
}

} // namespace ventrik
