#pragma once

#include <optional>
#include <span>
#include <vector>

namespace ventrik
{

/// The middles of labels of one height that stand as near as can be to the wanted ones, between two
/// edges, in their order and without overlaps. Those that have no room, the last ones, get none.
std::vector<std::optional<double>> spreadLabels(std::span<const double> wanted, double height,
                                                double low, double high);

/// From where to where a label goes.
struct LabelExtent {
    double from;
    double to;
};

/// The row of each label, those that come first having the choice: the first of so many rows in
/// which it overlaps no former one. None for a label that has no room.
std::vector<std::optional<int>> labelRows(std::span<const LabelExtent> labels, int rows);

} // namespace ventrik
