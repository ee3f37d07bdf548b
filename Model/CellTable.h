#pragma once

#include "Model/DisplayMoment.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

enum class CellSystem : std::uint8_t { LTE, UMTS, TimeDividedUMTS, GSM, OneX, EVDO };
std::string_view nameOf(CellSystem system);
/// What tells the cells of one channel apart, such as "PCI".
std::string_view identityNameOf(CellSystem system);

/// What a cell is to the phone, from the one that serves it on down.
enum class CellKind : std::uint8_t {
    Serving,
    Secondary, ///< serves on a further carrier
    Active,
    Monitored,
    Measured,
    Detected,
    Ranked, ///< for reselection
    Neighbor,
    Candidate, ///< for reselection, without a level
};
std::string_view nameOf(CellKind kind);

struct CellLevel {
    std::string_view name; ///< what was measured, such as "RSRP"
    double number;
    std::string unit; ///< empty where there is none
};

/// A cell of a display.
struct CellRow {
    CellSystem system;
    CellKind kind;
    std::optional<std::int64_t> channel = {};
    std::string band = {}; ///< empty where it is not known
    std::optional<double> megahertz = {};
    std::string identity = {}; ///< empty where it was not told
    std::optional<CellLevel> level = {};
    std::optional<CellLevel> quality = {}; ///< a second level, against noise and interference
    std::optional<double> difference = {}; ///< of the level to that of the serving cell, in dB
    /// When its level was told last, to about a second; of a cell without one, when it was named.
    Clock::TimePoint told = {};
    std::chrono::nanoseconds age = {}; ///< since then
    std::string path = {};             ///< of the pane that shows the cell
};

/// The cells of a display, each once however many lists it is in: the serving ones first, then by
/// what they are to the phone, the strongest first. Ages are those at the display's time.
std::vector<CellRow> cellsOf(DisplayMoment& display);
std::vector<CellRow> cellsOf(DisplayMoment& display, Clock::TimePoint now);

} // namespace ventrik
