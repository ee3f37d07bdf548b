#include "TelephonyService/CellMonitorScenario.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <functional>
#include <vector>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::uint64_t messageSteps = 10;    // every 0.5 s
constexpr std::uint64_t callCycleSteps = 600; // every 30 s
constexpr std::uint64_t callSteps = 240;      // of 12 s
constexpr double streetLength = 1200;         // metres
constexpr double metresPerStep = 0.15;        // 3 m/s: a bicycle
constexpr double reselectionMargin = 4;       // dB
constexpr double detectableLevel = -104;      // dBm

struct GSMStreetCell {
    int arfcn;
    const char* bsic;
    int locationArea;
    int cellIdentity;
    double position; // metres along the street
};

constexpr std::array<GSMStreetCell, 5> gsmCells{{
    {18, "2-1", 4711, 1201, 60},
    {31, "2-5", 4711, 1202, 340},
    {57, "2-6", 4711, 1209, 600},
    {712, "3-2", 4715, 2044, 860},
    {725, "3-4", 4715, 2047, 1150},
}};

struct UMTSStreetCell {
    int uarfcn;
    int scramblingCode;
    double position; // metres along the street
};

constexpr std::array<UMTSStreetCell, 3> umtsCells{{
    {10762, 301, 200},
    {10762, 14, 650},
    {10787, 87, 1050},
}};

std::string levelText(double level)
{
    return fmt::format("{} dBm", static_cast<int>(std::round(level)));
}

std::string countText(std::size_t count)
{
    return fmt::format("{} cells", count);
}

} // namespace

CellMonitorScenario::CellMonitorScenario(std::uint32_t seed) : _random(seed)
{
    _position = _random.uniform(0, 200);
}

void CellMonitorScenario::reportStep()
{
    move();
    if (step() % messageSteps != 0)
        return;
    PlistDictionary message{{"Registration", registration()}, {"Serving Cell", servingCell()}};
    if (isInCall())
        message.set("Call", call());
    message.set("GSM Neighbor Cells", gsmNeighbors());
    message.set("UMTS Neighbor Cells", umtsNeighbors());
    reportBarePropertyList(message);
}

void CellMonitorScenario::move()
{
    _position += _direction * metresPerStep;
    if (_position > streetLength || _position < 0)
        _direction = -_direction;
    _gsmShadowing.step(_random);
    _umtsShadowing.step(_random);
    for (std::size_t cell = 0; cell < gsmCellCount; ++cell)
        if (gsmLevel(cell) > gsmLevel(_serving) + reselectionMargin)
            _serving = cell;
}

bool CellMonitorScenario::isInCall() const
{
    return step() % callCycleSteps >= callCycleSteps - callSteps;
}

double CellMonitorScenario::gsmLevel(std::size_t cell) const
{
    return -55.0 - pathLoss(_position - gsmCells.at(cell).position) + _gsmShadowing.level(cell);
}

double CellMonitorScenario::umtsLevel(std::size_t cell) const
{
    return -65.0 - pathLoss(_position - umtsCells.at(cell).position) + _umtsShadowing.level(cell);
}

double CellMonitorScenario::bitErrors() const
{
    return std::clamp((-80.0 - gsmLevel(_serving)) / 4.0, 0.0, 7.0);
}

// One entry alone, as the service sends every state.
PlistValue CellMonitorScenario::registration() const
{
    return PlistDictionary{{"State", isInCall() ? "Registered, busy" : "Registered, home"}};
}

PlistDictionary CellMonitorScenario::servingCell() const
{
    const GSMStreetCell& cell = gsmCells.at(_serving);
    return {{"MCC", "262"},
            {"MNC", "07"},
            {"LAC", fmt::format("{}", cell.locationArea)},
            {"Cell ID", fmt::format("{}", cell.cellIdentity)},
            {"ARFCN", fmt::format("{}", cell.arfcn)},
            {"BSIC", cell.bsic},
            {"RxLev", levelText(gsmLevel(_serving))}};
}

PlistDictionary CellMonitorScenario::call() const
{
    constexpr double metresPerAdvance = 550;
    const double distance = std::abs(_position - gsmCells.at(_serving).position);
    return {{"Channel", "TCH/F"},
            {"Time Slot", fmt::format("{}", 2 + _serving)},
            {"Timing Advance", fmt::format("{}", static_cast<int>(distance / metresPerAdvance))},
            {"RxQual", fmt::format("{}", static_cast<int>(bitErrors()))},
            {"Codec", "AMR 12.2"}};
}

PlistArray CellMonitorScenario::gsmNeighbors() const
{
    std::vector<std::size_t> cells;
    for (std::size_t cell = 0; cell < gsmCellCount; ++cell)
        if (cell != _serving && gsmLevel(cell) > detectableLevel)
            cells.push_back(cell);
    std::ranges::sort(cells, std::greater{}, [this](std::size_t cell) { return gsmLevel(cell); });
    PlistArray list{countText(cells.size())};
    for (const std::size_t cell : cells)
        list.append(PlistDictionary{{"ARFCN", fmt::format("{}", gsmCells.at(cell).arfcn)},
                                    {"BSIC", gsmCells.at(cell).bsic},
                                    {"RxLev", levelText(gsmLevel(cell))}});
    return list;
}

PlistArray CellMonitorScenario::umtsNeighbors() const
{
    PlistArray cells;
    for (std::size_t cell = 0; cell < umtsCellCount; ++cell)
        if (umtsLevel(cell) > detectableLevel)
            cells.append(PlistDictionary{
                {"UARFCN", fmt::format("{}", umtsCells.at(cell).uarfcn)},
                {"Scrambling Code", fmt::format("{}", umtsCells.at(cell).scramblingCode)},
                {"RSCP", levelText(umtsLevel(cell))}});
    PlistArray list{countText(cells.size())};
    for (const PlistValue& cell : cells)
        list.append(cell);
    return list;
}

} // namespace ventrik
