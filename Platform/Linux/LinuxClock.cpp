#include "Platform/Linux/LinuxClock.h"

#include <ctime>

namespace ventrik
{

Clock::TimePoint LinuxClock::now() const
{
    return std::chrono::time_point_cast<TimePoint::duration>(std::chrono::system_clock::now());
}

Clock::TimeZone LinuxClock::timeZone(TimePoint time) const
{
    const std::time_t seconds =
        std::chrono::floor<std::chrono::seconds>(time).time_since_epoch().count();
    std::tm local{};
    tzset(); // localtime_r need not look at TZ by itself
    if (localtime_r(&seconds, &local) == nullptr)
        return {};
    return {static_cast<std::int32_t>(local.tm_gmtoff), local.tm_isdst > 0};
}

} // namespace ventrik
