#include "Charts/ChartAxes.h"

#include "Charts/ChartTexts.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

using namespace std::chrono;

constexpr double largest = 1e15; // what whole numbers in a double are still apart at
constexpr double tiny = 1e-9;    // of a step: no end is missed by rounding
constexpr int mostEnds = 12;

struct Step {
    double length;
    int decimals;
};

// The step of that number: 1, 2, 5, 10, 20, ... for 0, 1, 2, ..., and 0.5, 0.2, ... for -1, -2, ...
Step stepAt(int number)
{
    constexpr std::array digits{1.0, 2.0, 5.0};
    const int power = number >= 0 ? number / 3 : (number - 2) / 3;
    const double digit = digits[static_cast<std::size_t>(number - 3 * power)];
    const double length = power >= 0 ? digit * std::pow(10, power) : digit / std::pow(10, -power);
    return {length, std::max(0, -power)};
}

// How many ticks stand between the two, both included.
double ticksBetween(const Step& step, double low, double high)
{
    return std::floor(high / step.length + tiny) - std::ceil(low / step.length - tiny) + 1;
}

// The shortest step with no more ticks than that. A double must be able to tell them apart.
Step stepFor(double low, double high, int most)
{
    const double finest = std::max(std::abs(low), std::abs(high)) * 1e-12;
    int number = -36;
    while (number < 60 &&
           (stepAt(number).length < finest || ticksBetween(stepAt(number), low, high) > most))
        ++number;
    return stepAt(number);
}

constexpr std::array<nanoseconds, 20> timeSteps{100ms, 200ms, 500ms, 1s,   2s,   5s,    10s,
                                                15s,   30s,   1min,  2min, 5min, 10min, 15min,
                                                30min, 1h,    2h,    3h,   6h,   12h};

nanoseconds timeStep(double span, int most)
{
    for (const nanoseconds step : timeSteps)
        if (span / static_cast<double>(step.count()) + 1 <= most)
            return step;
    std::int64_t length = 1;
    const double day = static_cast<double>(nanoseconds(24h).count());
    while (span / (static_cast<double>(length) * day) + 1 > most && length < 20000)
        length *= 2;
    return 24h * length;
}

std::string labelOf(Clock::TimePoint time, nanoseconds step, std::int32_t secondsFromUtc)
{
    const bool isMidnight =
        (time.time_since_epoch() + seconds(secondsFromUtc)) % nanoseconds(24h) == 0ns;
    if (step >= 1min && isMidnight)
        return dayText(time, secondsFromUtc);
    if (step >= 1min)
        return minuteText(time, secondsFromUtc);
    return step >= 1s ? timeText(time, secondsFromUtc) : exactTimeText(time, secondsFromUtc);
}

// Leaves room for a zone and a step on both sides.
Clock::TimePoint inRange(Clock::TimePoint time)
{
    constexpr auto margin = duration_cast<nanoseconds>(days(30000));
    return std::clamp(time, Clock::TimePoint::min() + margin, Clock::TimePoint::max() - margin);
}

std::vector<TimeTick> ticksOf(Clock::TimePoint first, Clock::TimePoint last, int most,
                              std::int32_t secondsFromUtc)
{
    const nanoseconds zone = seconds(secondsFromUtc);
    const auto start = inRange(first);
    const auto end = inRange(last);
    const double span = static_cast<double>(end.time_since_epoch().count()) -
                        static_cast<double>(start.time_since_epoch().count());
    const nanoseconds step = timeStep(span, std::max(1, most));
    auto tick = start + zone;
    const auto over = ((tick.time_since_epoch() % step) + step) % step;
    tick += over == 0ns ? 0ns : step - over;
    std::vector<TimeTick> ticks;
    for (; tick - zone <= end && static_cast<int>(ticks.size()) < most; tick += step)
        ticks.push_back({tick - zone, labelOf(tick - zone, step, secondsFromUtc)});
    return ticks;
}

} // namespace

ValueAxis valueAxis(double least, double greatest, double span, int most)
{
    double low = std::clamp(std::min(least, greatest), -largest, largest);
    double high = std::clamp(std::max(least, greatest), -largest, largest);
    const double missing = std::max(0.0, span - (high - low));
    low -= missing / 2;
    high += missing / 2;
    // Ends at round values stay where they are while the line trembles.
    const Step ends = stepFor(low, high, mostEnds);
    low = std::floor(low / ends.length) * ends.length;
    high = std::max(std::ceil(high / ends.length) * ends.length, low + ends.length);
    const Step step = stepFor(low, high, std::max(2, most));
    ValueAxis axis{low, high, {}};
    const double last = std::floor(high / step.length + tiny);
    for (double place = std::ceil(low / step.length - tiny); place <= last; ++place)
        axis.ticks.push_back(
            {place * step.length, shortNumber(place * step.length, step.decimals)});
    return axis;
}

std::vector<TimeTick> timeTicks(Clock::TimePoint first, Clock::TimePoint last, int most,
                                std::int32_t secondsFromUtc)
{
    if (most != 1)
        return ticksOf(first, last, most, secondsFromUtc);
    // A step with one tick at most may well have none: of some, that in the middle stays.
    constexpr int some = 4;
    const auto ticks = ticksOf(first, last, some, secondsFromUtc);
    return ticks.empty() ? ticks : std::vector{ticks[ticks.size() / 2]};
}

} // namespace ventrik
