#include "PropertyList/IsoDate.h"

#include <chrono>
#include <cmath>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using std::chrono::sys_days;
using std::chrono::sys_seconds;

constexpr sys_seconds firstSecond = sys_days(std::chrono::year(1) / 1 / 1);
constexpr sys_seconds pastLastSecond = sys_days(std::chrono::year(10000) / 1 / 1);

constexpr std::string_view dateForm = "dddd-dd-ddTdd:dd:ddZ";

constexpr bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

bool hasDateForm(std::string_view text)
{
    if (text.size() != dateForm.size())
        return false;
    for (std::size_t i = 0; i < text.size(); ++i)
        if (dateForm[i] == 'd' ? !isDigit(text[i]) : text[i] != dateForm[i])
            return false;
    return true;
}

int number(std::string_view digits)
{
    int value = 0;
    for (const char digit : digits)
        value = value * 10 + (digit - '0');
    return value;
}

} // namespace

std::optional<std::string> formatIsoDate(PlistDate date)
{
    const double seconds = std::floor(date.secondsSince1970);
    // Compared as reals, so that neither infinities nor not-a-number reach the conversion.
    if (!(seconds >= static_cast<double>(firstSecond.time_since_epoch().count()) &&
          seconds < static_cast<double>(pastLastSecond.time_since_epoch().count())))
        return std::nullopt;
    const sys_seconds moment{std::chrono::seconds(static_cast<std::int64_t>(seconds))};
    const auto midnight = std::chrono::floor<std::chrono::days>(moment);
    const std::chrono::year_month_day day(midnight);
    const std::chrono::hh_mm_ss time(moment - midnight);
    return fmt::format("{:04}-{:02}-{:02}T{:02}:{:02}:{:02}Z", static_cast<int>(day.year()),
                       static_cast<unsigned>(day.month()), static_cast<unsigned>(day.day()),
                       time.hours().count(), time.minutes().count(), time.seconds().count());
}

std::optional<PlistDate> parseIsoDate(std::string_view text)
{
    if (!hasDateForm(text))
        return std::nullopt;
    const std::chrono::year_month_day day(
        std::chrono::year(number(text.substr(0, 4))),
        std::chrono::month(static_cast<unsigned>(number(text.substr(5, 2)))),
        std::chrono::day(static_cast<unsigned>(number(text.substr(8, 2)))));
    const int hours = number(text.substr(11, 2));
    const int minutes = number(text.substr(14, 2));
    const int seconds = number(text.substr(17, 2));
    if (!day.ok() || day.year() < std::chrono::year(1) || hours > 23 || minutes > 59 ||
        seconds > 59)
        return std::nullopt;
    const sys_seconds moment = sys_days(day) + std::chrono::hours(hours) +
                               std::chrono::minutes(minutes) + std::chrono::seconds(seconds);
    return PlistDate{static_cast<double>(moment.time_since_epoch().count())};
}

} // namespace ventrik
