#pragma once

#include "Platform/Clock.h"

namespace ventrik
{

/// A clock that stands still until it is moved: 2026-11-16 06:10:28 UTC, in UTC, at first.
class FixedClock : public Clock
{
  public:
    FixedClock() = default;
    explicit FixedClock(TimePoint time) : _now(time) {}

    TimePoint now() const override { return _now; }
    /// The same zone at all times.
    TimeZone timeZone(TimePoint) const override { return _zone; }

    void set(TimePoint time) { _now = time; }
    void advance(std::chrono::nanoseconds duration) { _now += duration; }
    void setTimeZone(TimeZone zone) { _zone = zone; }

  private:
    TimePoint _now = std::chrono::sys_days{std::chrono::year{2026} / 11 / 16} +
                     std::chrono::hours{6} + std::chrono::minutes{10} + std::chrono::seconds{28};
    TimeZone _zone;
};

} // namespace ventrik
