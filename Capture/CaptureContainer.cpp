#include "Capture/CaptureContainer.h"

namespace ventrik
{

std::optional<Clock::TimePoint> timeOfTimestamp(std::uint64_t timestamp)
{
    constexpr unsigned subCountBits = 16;
    constexpr std::chrono::microseconds unit{1250};
    constexpr std::chrono::seconds epoch{315964800}; // 1980-01-06, counted from 1970
    constexpr std::chrono::seconds latest{9'000'000'000};
    const auto sinceEpoch = unit * static_cast<std::int64_t>(timestamp >> subCountBits);
    if (sinceEpoch > latest - epoch)
        return std::nullopt;
    return Clock::TimePoint(epoch + sinceEpoch);
}

} // namespace ventrik
