#pragma once

#include "Model/CellTable.h"
#include "Model/ChangeStore.h"

#include <chrono>
#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// What was measured of a cell over time.
struct CellLevels {
    std::string name; ///< such as "RSRP"; empty where nothing was measured
    std::string unit;
    double best = 0;
    double last = 0;
    double sum = 0;     ///< over the seconds
    double seconds = 0; ///< for which levels stood

    void take(const CellLevel& level);
    void stay(std::chrono::nanoseconds duration);
    /// Of the levels as long as each stood; that of the last one where none stood for a while.
    double mean() const { return seconds > 0 ? sum / seconds : last; }
};

/// A cell that was seen, whatever it was to the phone.
struct SeenCell {
    CellSystem system;
    CellKind kind; ///< the closest to the phone that it was
    std::optional<std::int64_t> channel = {};
    std::string identity = {}; ///< empty where it was not told
    std::string band = {};
    Clock::TimePoint first = {};
    Clock::TimePoint last = {}; ///< when it was told, or served, last
    std::chrono::nanoseconds served = {};
    CellLevels level = {};
    CellLevels quality = {};
};

/// All cells of a display over time, from its first value on. A cell counts for as long as it is
/// told, and for as long after as a value is held good; nothing counts while messages stay away for
/// longer than that.
class CellHistory
{
  public:
    static constexpr std::size_t mostCells = 2000;

    /// The store outlives it.
    explicit CellHistory(const ChangeStore& store) : _store(store) {}

    /// After the store has taken a message.
    void update();

    /// Those that served longest first, then by when they were seen first.
    std::vector<SeenCell> cells() const;
    /// From the first value that the store took to the last message, whatever has gone from it.
    std::chrono::nanoseconds whole() const { return _whole; }
    /// For how long no messages came.
    std::chrono::nanoseconds silence() const { return _silence; }
    /// More than `mostCells` came: the others are left out.
    bool isFull() const { return _isFull; }
    /// How far apart the looks at the display were in the end: where displays are very large, not
    /// every message can be looked at.
    std::chrono::nanoseconds step() const { return _step; }

  private:
    /// A cell of the present display.
    struct Present {
        std::size_t cell;
        bool isServing;
        bool hasLevel;
        bool hasQuality;
        Clock::TimePoint told;
    };

    void pass(Clock::TimePoint now);
    bool isRelevant();
    bool matters(PlaceId place);
    void look(Clock::TimePoint now);
    void take(const CellRow& row, Clock::TimePoint now);
    std::optional<std::size_t> find(const CellRow& row, Clock::TimePoint now);
    void spend();

    const ChangeStore& _store;
    std::vector<SeenCell> _cells;
    std::vector<Present> _present;
    std::vector<std::optional<bool>> _matters; // by place
    std::size_t _generation = 0;
    std::uint64_t _next = 0;
    std::optional<Clock::TimePoint> _time; // of the last message
    bool _isOutdated = false;              // something changed since the last look
    Clock::TimePoint _lastLook = {};
    std::chrono::nanoseconds _whole = {};
    std::chrono::nanoseconds _silence = {};
    std::chrono::nanoseconds _step = {};
    std::size_t _spent = 0; // places looked at with the present step
    bool _isFull = false;
};

} // namespace ventrik
