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
    /// So many points only say that a number came again behind a gap. One record can tell of
    /// thousands of numbers, and come again and again: behind more gaps none shows.
    static constexpr std::size_t mostBehindGaps = 500000;

    explicit NumberSeries(const ChangeStore& store);

    /// In the order in which they came first.
    std::span<const NumberLine> lines() const { return _lines; }

  private:
    static constexpr std::uint32_t none = 0xFFFFFFFF;

    void changed(const StoredChange& change) override;
    void heard(Clock::TimePoint time, std::uint32_t logCode) override;
    void take(PlaceId place, const StoredChange& change);
    void settle(std::size_t line);
    void beginBehindGap(std::uint32_t logCode, Clock::TimePoint time);
    void hear(std::vector<SeriesPoint>& points, Clock::TimePoint time);

    const PlaceTable& _places;
    std::vector<NumberLine> _lines;
    std::vector<std::uint32_t> _codes;                // of each line's last change
    std::vector<bool> _leaveOutSign;                  // of each line: a level, drawn below 0
    std::vector<std::uint32_t> _lineAt;               // by place
    std::map<std::uint32_t, Clock::TimePoint> _heard; // last, by code
    std::size_t _pointsBehindGaps = 0;
};

} // namespace ventrik
