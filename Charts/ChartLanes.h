#pragma once

#include "Charts/Canvas.h"
#include "Charts/ChartAxes.h"
#include "Charts/ChartLine.h"
#include "Charts/ChartScales.h"
#include "Charts/QualityBands.h"

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// The part of a chart with its own values' axis, for lines of one unit. Lines that are told apart
/// by different limits, or by none, have lanes of their own, for the bands behind are all lines'.
struct ChartLane {
    std::string unit;
    std::optional<BandLimits> bands;
    std::vector<std::size_t> lines; ///< places among the chart's

    Rect area = {};
    ValueAxis axis = {};
    /// A line at the axis's end is not cut by the lane's edge.
    ValueScale scale() const { return {axis.low, axis.high, area.y + 3, area.bottom() - 3}; }
};

/// The lanes of the lines that have points, in the order of their first lines.
std::vector<ChartLane> lanesOf(std::span<const ChartLine> lines, const QualityBands& bands);

/// Shares the area out, the more to a lane the more lines it has, with gaps between. What is too
/// low for all lanes keeps the first ones; the others go, and are counted.
std::size_t layOutLanes(std::vector<ChartLane>& lanes, const Rect& area, double lowest);

/// Gives the lane an axis for what its lines show between the times.
void chooseAxis(ChartLane& lane, std::span<const ChartLine> lines, Clock::TimePoint first,
                Clock::TimePoint last, double tickDistance);

} // namespace ventrik
