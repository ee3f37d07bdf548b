#include "LogGenerator/Core/DateText.h"

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

void appendTwoDigits(std::string& text, std::int64_t number, char separator)
{
    text += static_cast<char>('0' + number / 10);
    text += static_cast<char>('0' + number % 10);
    text += separator;
}

} // namespace

// The history asks for one at every tick, and a capture of a day has many.
std::string dateText(Clock::TimePoint time)
{
    const auto days = std::chrono::floor<std::chrono::days>(time);
    const std::chrono::year_month_day date(days);
    const std::chrono::hh_mm_ss clock(std::chrono::floor<std::chrono::seconds>(time - days));
    std::string text = fmt::format(FMT_COMPILE("{:04}-"), static_cast<int>(date.year()));
    text.reserve(sizeof "2026-11-16 06:10:28 +0000");
    appendTwoDigits(text, static_cast<unsigned>(date.month()), '-');
    appendTwoDigits(text, static_cast<unsigned>(date.day()), ' ');
    appendTwoDigits(text, clock.hours().count(), ':');
    appendTwoDigits(text, clock.minutes().count(), ':');
    appendTwoDigits(text, clock.seconds().count(), ' ');
    return text += "+0000";
}

} // namespace ventrik
