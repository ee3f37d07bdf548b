#include "Charts/ChartTexts.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>
#include <limits>
#include <string_view>

namespace ventrik
{

namespace
{

using namespace std::chrono;

constexpr std::array<std::string_view, 12> monthNames{"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                                      "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};

// Seconds carry every zone; nanoseconds near the ends of their range do not.
sys_time<milliseconds> localTime(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    return floor<milliseconds>(time) + seconds(secondsFromUtc);
}

auto timeOfDay(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    const auto local = localTime(time, secondsFromUtc);
    return hh_mm_ss(local - floor<days>(local));
}

year_month_day dayOf(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    return floor<days>(localTime(time, secondsFromUtc));
}

} // namespace

std::string shortNumber(double value, int decimals)
{
    if (!std::isfinite(value))
        return "–";
    if (std::abs(value) >= 1e15)
        return fmt::format("{:.6g}", value);
    std::string text = fmt::format("{:.{}f}", value, decimals);
    if (text.find('.') != std::string::npos) {
        text.erase(text.find_last_not_of('0') + 1);
        if (text.back() == '.')
            text.pop_back();
    }
    return text == "-0" ? "0" : text;
}

std::string signedNumber(double value)
{
    std::string text = shortNumber(value);
    return value > 0 && text != "0" ? "+" + text : text;
}

std::string timeText(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    const auto day = timeOfDay(time, secondsFromUtc);
    return fmt::format("{:02}:{:02}:{:02}", day.hours().count(), day.minutes().count(),
                       day.seconds().count());
}

std::string exactTimeText(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    const auto day = timeOfDay(time, secondsFromUtc);
    return fmt::format("{}.{}", timeText(time, secondsFromUtc), day.subseconds().count() / 100);
}

std::string minuteText(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    return timeText(time, secondsFromUtc).substr(0, 5);
}

std::string dayText(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    const auto date = dayOf(time, secondsFromUtc);
    return fmt::format("{} {}", static_cast<unsigned>(date.day()),
                       monthNames[static_cast<unsigned>(date.month()) - 1]);
}

std::string dateText(Clock::TimePoint time, std::int32_t secondsFromUtc)
{
    const auto date = dayOf(time, secondsFromUtc);
    return fmt::format("{:04}-{:02}-{:02}", static_cast<int>(date.year()),
                       static_cast<unsigned>(date.month()), static_cast<unsigned>(date.day()));
}

std::string zoneText(std::int32_t secondsFromUtc)
{
    if (secondsFromUtc == 0)
        return "UTC";
    const auto minutes = std::abs(secondsFromUtc / 60);
    return fmt::format("UTC{}{:02}:{:02}", secondsFromUtc < 0 ? '-' : '+', minutes / 60,
                       minutes % 60);
}

std::string durationText(nanoseconds duration)
{
    const auto tenths = std::max<std::int64_t>(0, duration.count() / 100'000'000);
    if (tenths < 600)
        return fmt::format("{}.{} s", tenths / 10, tenths % 10);
    const auto seconds = tenths / 10;
    if (seconds < 3600)
        return fmt::format("{} min {:02} s", seconds / 60, seconds % 60);
    return fmt::format("{} h {:02} min", seconds / 3600, seconds / 60 % 60);
}

} // namespace ventrik
