#include "TelephonyService/GSMRide.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double lineLength = 2400;     // metres
constexpr double metresPerStep = 0.6;   // 12 m/s, 43 km/h: a tram
constexpr double reselectionMargin = 4; // dB
constexpr double detectableRssi = -105; // dBm
constexpr double detectableRscp = -115; // dBm

// 900 MHz along the whole line and 1800 MHz in the middle of the town; the second half of the line
// is another location area.
constexpr std::array<GSMRideCell, 6> lineGsmCells{{
    {62, 41, 20301, 4711, 17, 100},
    {71, 45, 20302, 4711, 17, 600},
    {548, 12, 20417, 4711, 17, 1000},
    {561, 14, 20420, 4712, 18, 1400},
    {66, 43, 20303, 4712, 18, 1800},
    {79, 47, 20304, 4712, 18, 2300},
}};

// One carrier, and a second one in the middle of the town.
constexpr std::array<UMTSRideCell, 5> lineUmtsCells{{
    {10713, 301, 0x0053101, 4721, 21, 7, 150},
    {10713, 117, 0x0053102, 4721, 21, 7, 700},
    {10713, 422, 0x0053203, 4721, 21, 8, 1250},
    {10738, 58, 0x0053311, 4722, 22, 8, 1750},
    {10713, 9, 0x0053404, 4722, 22, 9, 2250},
}};

struct Phase {
    GSMRidePhase phase;
    int steps;
};

constexpr std::array<Phase, 13> phases{{
    {GSMRidePhase::cellSelection, 20}, // 1 s
    {GSMRidePhase::camping, 160},
    {GSMRidePhase::callSetup, 20},
    {GSMRidePhase::call, 120},
    {GSMRidePhase::callRelease, 20},
    {GSMRidePhase::dataSession, 160},
    {GSMRidePhase::handoverToUMTS, 20},
    {GSMRidePhase::hsdpa, 160},
    {GSMRidePhase::dualCarrierHSDPA, 160},
    {GSMRidePhase::forwardAccess, 60},
    {GSMRidePhase::paging, 60},
    {GSMRidePhase::umtsCamping, 160},
    {GSMRidePhase::reselectionToGSM, 20},
}};

// The phone searches for its first cell only once.
constexpr std::size_t firstRepeatedPhase = 1;

/// The index of the best cell, or of the serving one while no other is clearly better.
template <typename Cells, typename Level>
std::size_t reselected(const Cells& cells, std::size_t serving, Level level)
{
    const auto best = std::ranges::max_element(cells, {}, level);
    return level(*best) < level(cells[serving]) + reselectionMargin
               ? serving
               : static_cast<std::size_t>(best - cells.begin());
}

template <typename Cell, typename Level>
std::vector<const Cell*> neighborsOf(std::span<const Cell> cells, const Cell* serving,
                                     double detectable, Level level)
{
    std::vector<const Cell*> found;
    for (const Cell& cell : cells)
        if (&cell != serving && level(cell) > detectable)
            found.push_back(&cell);
    std::ranges::sort(found, std::greater(), [&](const Cell* cell) { return level(*cell); });
    return found;
}

double milliwatts(double dBm)
{
    return std::pow(10.0, dBm / 10.0);
}

} // namespace

GSMRide::GSMRide(std::uint32_t seed)
    : _random(seed),
      _gsmShadowing(lineGsmCells.size(), 0.99, 0.4),
      _umtsShadowing(lineUmtsCells.size(), 0.99, 0.4)
{
    _position = _random.uniform(0, 300);
}

std::span<const GSMRideCell> GSMRide::gsmCells()
{
    return lineGsmCells;
}

std::span<const UMTSRideCell> GSMRide::umtsCells()
{
    return lineUmtsCells;
}

GSMRide::Changes GSMRide::step()
{
    _position += _direction * metresPerStep;
    if (_position > lineLength || _position < 0)
        _direction = -_direction;
    _gsmShadowing.step(_random);
    _umtsShadowing.step(_random);

    const std::size_t gsmBefore = _gsmServing;
    const std::size_t umtsBefore = _umtsServing;
    _gsmServing = reselected(lineGsmCells, _gsmServing,
                             [this](const GSMRideCell& cell) { return rssi(cell); });
    _umtsServing = reselected(lineUmtsCells, _umtsServing,
                              [this](const UMTSRideCell& cell) { return rscp(cell); });
    return {changePhase(), _gsmServing != gsmBefore, _umtsServing != umtsBefore};
}

bool GSMRide::changePhase()
{
    if (++_stepsInPhase < phases.at(_phase).steps)
        return false;
    _phase = _phase + 1 < phases.size() ? _phase + 1 : firstRepeatedPhase;
    _stepsInPhase = 0;
    return true;
}

GSMRidePhase GSMRide::phase() const
{
    return phases.at(_phase).phase;
}

bool GSMRide::isOnUMTS() const
{
    switch (phase()) {
    case GSMRidePhase::hsdpa:
    case GSMRidePhase::dualCarrierHSDPA:
    case GSMRidePhase::forwardAccess:
    case GSMRidePhase::paging:
    case GSMRidePhase::umtsCamping:
        return true;
    default:
        return false;
    }
}

bool GSMRide::hasDataConnection() const
{
    switch (phase()) {
    case GSMRidePhase::dataSession:
    case GSMRidePhase::handoverToUMTS:
    case GSMRidePhase::hsdpa:
    case GSMRidePhase::dualCarrierHSDPA:
    case GSMRidePhase::forwardAccess:
        return true;
    default:
        return false;
    }
}

std::vector<const GSMRideCell*> GSMRide::gsmNeighbors() const
{
    return neighborsOf(gsmCells(), isOnUMTS() ? nullptr : &gsmCell(), detectableRssi,
                       [this](const GSMRideCell& cell) { return rssi(cell); });
}

std::vector<const UMTSRideCell*> GSMRide::umtsNeighbors() const
{
    return neighborsOf(umtsCells(), isOnUMTS() ? &umtsCell() : nullptr, detectableRscp,
                       [this](const UMTSRideCell& cell) { return rscp(cell); });
}

double GSMRide::rssi(const GSMRideCell& cell) const
{
    const auto index = static_cast<std::size_t>(&cell - lineGsmCells.data());
    return -52.0 - pathLoss(_position - cell.position) + _gsmShadowing.level(index);
}

double GSMRide::rscp(const UMTSRideCell& cell) const
{
    const auto index = static_cast<std::size_t>(&cell - lineUmtsCells.data());
    return -60.0 - pathLoss(_position - cell.position) + _umtsShadowing.level(index);
}

// A pilot is a tenth of what its cell sends.
double GSMRide::carrierPower() const
{
    constexpr double noise = -104; // dBm
    double power = milliwatts(noise);
    for (const UMTSRideCell& cell : lineUmtsCells)
        if (cell.uarfcn == umtsCell().uarfcn)
            power += milliwatts(rscp(cell) + 7);
    return 10.0 * std::log10(power);
}

double GSMRide::ecno(const UMTSRideCell& cell) const
{
    return rscp(cell) - carrierPower();
}

// The weaker the cell comes in, the louder the phone must speak.
double GSMRide::transmitPower() const
{
    return std::clamp(-80.0 - rscp(umtsCell()), -50.0, 24.0);
}

unsigned GSMRide::receiveQuality() const
{
    const double interference = std::max(0.0, -70.0 - rssi(gsmCell())) / 5.0;
    return static_cast<unsigned>(std::clamp(interference, 0.0, 7.0));
}

double GSMRide::blockErrorRate() const
{
    return std::clamp(0.02 * std::exp((-8.0 - ecno(umtsCell())) / 3.0), 0.002, 0.4);
}

} // namespace ventrik
