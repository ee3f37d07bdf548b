#pragma once

#include "Platform/Clock.h"

#include <algorithm>
#include <chrono>
#include <cstdint>

namespace ventrik
{

/// Where times stand between two edges; times outside stand outside.
class TimeScale
{
  public:
    TimeScale() = default;
    /// `last` after `first`, `right` to the right of `left`; the least that makes sense is taken
    /// where they are not.
    TimeScale(Clock::TimePoint first, Clock::TimePoint last, double left, double right)
        : _first(count(first)),
          _span(std::max(1.0, count(last) - count(first))),
          _left(left),
          _width(std::max(1.0, right - left))
    {
    }

    double left() const { return _left; }
    double right() const { return _left + _width; }
    double x(Clock::TimePoint time) const
    {
        return _left + (count(time) - _first) / _span * _width;
    }
    Clock::TimePoint time(double x) const
    {
        constexpr double farthest = 9.2e18; // nanoseconds
        const double count = _first + (x - _left) / _width * _span;
        return Clock::TimePoint(std::chrono::nanoseconds(
            static_cast<std::int64_t>(std::clamp(count, -farthest, farthest))));
    }

  private:
    // A quarter of a microsecond is lost, and nothing overflows.
    static double count(Clock::TimePoint time)
    {
        return static_cast<double>(time.time_since_epoch().count());
    }

    double _first = 0;
    double _span = 1;
    double _left = 0;
    double _width = 1;
};

/// Where values stand, the higher the further up.
class ValueScale
{
  public:
    /// `high` above `low`.
    ValueScale(double low, double high, double top, double bottom)
        : _low(low), _span(high > low ? high - low : 1), _bottom(bottom), _height(bottom - top)
    {
    }
    double y(double value) const { return _bottom - (value - _low) / _span * _height; }

  private:
    double _low;
    double _span;
    double _bottom;
    double _height;
};

} // namespace ventrik
