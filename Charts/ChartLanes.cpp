#include "Charts/ChartLanes.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double gap = 8;

ChartLane& laneFor(std::vector<ChartLane>& lanes, const ChartLine& line,
                   const std::optional<BandLimits>& limits)
{
    const auto found = std::ranges::find_if(lanes, [&](const ChartLane& lane) {
        return lane.unit == line.unit && lane.bands == limits;
    });
    if (found != lanes.end())
        return *found;
    lanes.push_back({.unit = line.unit, .bands = limits, .lines = {}});
    return lanes.back();
}

double weightOf(const ChartLane& lane)
{
    return 2 + static_cast<double>(std::min<std::size_t>(lane.lines.size(), 8));
}

// A level that only trembles shall not fill its lane from top to bottom.
double leastSpan(const ChartLane& lane, const ValueRange& values)
{
    if (lane.unit.starts_with("dB"))
        return 10;
    return std::max({std::abs(values.least) * 0.01, std::abs(values.greatest) * 0.01, 1.0});
}

// Where nothing shows between the times, what the lines had last.
ValueRange valuesOf(const ChartLane& lane, std::span<const ChartLine> lines, Clock::TimePoint first,
                    Clock::TimePoint last)
{
    std::optional<ValueRange> all;
    for (const std::size_t line : lane.lines) {
        const auto values = valuesWithin(lines[line].points, first, last);
        if (!values)
            continue;
        all = all ? ValueRange{std::min(all->least, values->least),
                               std::max(all->greatest, values->greatest)}
                  : *values;
    }
    const double newest = lines[lane.lines.front()].points.back().value;
    const double usual = std::isfinite(newest) ? newest : 0;
    return all.value_or(ValueRange{usual, usual});
}

} // namespace

std::vector<ChartLane> lanesOf(std::span<const ChartLine> lines, const QualityBands& bands)
{
    std::vector<ChartLane> lanes;
    for (std::size_t place = 0; place < lines.size(); ++place)
        if (!lines[place].points.empty())
            laneFor(lanes, lines[place], bands.find(lines[place].name, lines[place].unit))
                .lines.push_back(place);
    return lanes;
}

std::size_t layOutLanes(std::vector<ChartLane>& lanes, const Rect& area, double lowest)
{
    const auto room = static_cast<std::size_t>(std::max(1.0, (area.height + gap) / (lowest + gap)));
    const std::size_t kept = std::min(room, lanes.size());
    const std::size_t left = lanes.size() - kept;
    lowest = std::min(lowest, std::max(0.0, area.height));
    lanes.resize(kept);
    double weights = 0;
    for (const ChartLane& lane : lanes)
        weights += weightOf(lane);
    const double count = static_cast<double>(kept);
    const double free = std::max(0.0, area.height - gap * (count - 1) - lowest * count);
    double y = area.y;
    for (ChartLane& lane : lanes) {
        lane.area = {area.x, y, area.width, lowest + free * weightOf(lane) / weights};
        y = lane.area.bottom() + gap;
    }
    return left;
}

void chooseAxis(ChartLane& lane, std::span<const ChartLine> lines, Clock::TimePoint first,
                Clock::TimePoint last, double tickDistance)
{
    const ValueRange values = valuesOf(lane, lines, first, last);
    const int most = static_cast<int>(lane.area.height / tickDistance) + 1;
    lane.axis = valueAxis(values.least, values.greatest, leastSpan(lane, values), most);
}

} // namespace ventrik
