#pragma once

#include <chrono>
#include <cstdint>

namespace ventrik
{

/// The wall clock and the local time zone.
class Clock
{
  public:
    using TimePoint = std::chrono::sys_time<std::chrono::nanoseconds>;

    struct TimeZone {
        std::int32_t secondsFromUtc = 0; ///< east positive
        bool isDaylightSaving = false;
    };

    virtual ~Clock() = default;
    virtual TimePoint now() const = 0;
    /// The zone in force at that time.
    virtual TimeZone timeZone(TimePoint time) const = 0;
};

} // namespace ventrik
