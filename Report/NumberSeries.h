#pragma once

#include "Model/ChangeStore.h"
#include "Model/SeriesPoint.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// A value of the display as numbers over time.
struct NumberLine {
    PlaceId place;
    std::string unit;        ///< the last one; empty where there is none
    std::size_t changeCount; ///< how often it became another number
    std::vector<SeriesPoint> points;
};

/// Every value of a store that was a number, with all numbers that it had.
class NumberSeries : private StoreVisitor
{
  public:
    explicit NumberSeries(const ChangeStore& store);

    /// In the order in which they came first.
    std::span<const NumberLine> lines() const { return _lines; }

  private:
    static constexpr std::uint32_t none = 0xFFFFFFFF;

    void changed(const StoredChange& change) override;
    void heard(Clock::TimePoint time, std::uint32_t logCode) override;
    void take(PlaceId place, const StoredChange& change);
    void settle(std::size_t line);

    const PlaceTable& _places;
    std::vector<NumberLine> _lines;
    std::vector<std::uint32_t> _codes;                // of each line's last change
    std::vector<std::uint32_t> _lineAt;               // by place
    std::map<std::uint32_t, Clock::TimePoint> _heard; // last, by code
};

} // namespace ventrik
