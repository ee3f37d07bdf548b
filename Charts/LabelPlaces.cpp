#include "Charts/LabelPlaces.h"

#include <algorithm>
#include <cstddef>
#include <numeric>

namespace ventrik
{

namespace
{

/// Neighbors that touch each other, with the mean of where they would all like to begin.
struct Cluster {
    double sum;
    int count;
    double mean() const { return sum / count; }
};

std::vector<Cluster> clustersOf(std::span<const double> starts)
{
    std::vector<Cluster> clusters;
    for (const double start : starts) {
        clusters.push_back({start, 1});
        while (clusters.size() > 1 && clusters.back().mean() < clusters.end()[-2].mean()) {
            clusters.end()[-2].sum += clusters.back().sum;
            clusters.end()[-2].count += clusters.back().count;
            clusters.pop_back();
        }
    }
    return clusters;
}

} // namespace

std::vector<std::optional<double>> spreadLabels(std::span<const double> wanted, double height,
                                                double low, double high)
{
    std::vector<std::optional<double>> places(wanted.size());
    const auto room = static_cast<std::size_t>(std::max(0.0, (high - low) / height));
    std::vector<std::size_t> order(std::min(room, wanted.size()));
    std::iota(order.begin(), order.end(), 0U);
    std::ranges::stable_sort(order, {}, [&](std::size_t label) { return wanted[label]; });

    // With the heights of those above taken off, labels that do not overlap are in order.
    std::vector<double> starts;
    starts.reserve(order.size());
    for (const std::size_t label : order)
        starts.push_back(wanted[label] - static_cast<double>(starts.size()) * height);
    const double farthest = high - height / 2 - height * static_cast<double>(order.size()) + height;
    std::size_t place = 0;
    for (const Cluster& cluster : clustersOf(starts)) {
        const double start = std::clamp(cluster.mean(), low + height / 2, farthest);
        for (int member = 0; member < cluster.count; ++member, ++place)
            places[order[place]] = start + static_cast<double>(place) * height;
    }
    return places;
}

std::vector<std::optional<int>> labelRows(std::span<const LabelExtent> labels, int rows)
{
    std::vector<std::vector<LabelExtent>> taken(static_cast<std::size_t>(std::max(0, rows)));
    std::vector<std::optional<int>> found;
    for (const LabelExtent& label : labels) {
        const auto row = std::ranges::find_if(taken, [&](const auto& others) {
            return std::ranges::none_of(others, [&](const LabelExtent& other) {
                return other.from < label.to && label.from < other.to;
            });
        });
        if (row == taken.end()) {
            found.emplace_back();
            continue;
        }
        row->push_back(label);
        found.emplace_back(static_cast<int>(row - taken.begin()));
    }
    return found;
}

} // namespace ventrik
