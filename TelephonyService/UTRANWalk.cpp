#include "TelephonyService/UTRANWalk.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double streetLength = 1500;   // metres
constexpr double metresPerStep = 0.4;   // 8 m/s, 29 km/h: a bus
constexpr double reselectionMargin = 3; // dB

// Band 34 along the street, and one cell of band 39 in the station; the second half of the street
// is another location area.
constexpr std::array<UTRANCell, 5> streetCells{{
    {10054, 12, 34, 0x00A3101, 4711, 21, 50},
    {10054, 47, 34, 0x00A3102, 4711, 21, 400},
    {10062, 83, 34, 0x00A3205, 4711, 22, 750},
    {9500, 31, 39, 0x00A4310, 4712, 40, 1050},
    {10062, 118, 34, 0x00A4402, 4712, 41, 1450},
}};

constexpr std::array<GSMCell, 4> streetGsmCells{{
    {62, 3, 1, 1201, false, 100},
    {71, 3, 5, 1202, false, 600},
    {548, 3, 2, 1317, true, 900},
    {561, 3, 7, 1320, true, 1400},
}};

struct Phase {
    RRCState state;
    int steps;
};

// From camping to a call, and down again as the network sees less and less to do.
constexpr std::array<Phase, 8> phases{{
    {RRCState::disconnected, 300}, // 15 s
    {RRCState::connecting, 12},
    {RRCState::cellFach, 20},
    {RRCState::cellDch, 400}, // 20 s
    {RRCState::cellFach, 60},
    {RRCState::cellPch, 80},
    {RRCState::uraPch, 80},
    {RRCState::connecting, 12},
}};

} // namespace

UTRANWalk::UTRANWalk(std::uint32_t seed) : _random(seed)
{
    _position = _random.uniform(0, 200);
}

std::span<const UTRANCell> UTRANWalk::cells()
{
    return streetCells;
}

std::span<const GSMCell> UTRANWalk::gsmCells()
{
    return streetGsmCells;
}

UTRANWalk::Changes UTRANWalk::step()
{
    _position += _direction * metresPerStep;
    if (_position > streetLength || _position < 0)
        _direction = -_direction;
    fade();
    const bool hasNewState = changeState();
    return {reselect(), hasNewState};
}

RRCState UTRANWalk::state() const
{
    return phases.at(_phase).state;
}

void UTRANWalk::fade()
{
    _shadowing.step(_random);
    _gsmShadowing.step(_random);
    _slotNoise.step(_random);
}

bool UTRANWalk::changeState()
{
    if (++_stepsInPhase < phases.at(_phase).steps)
        return false;
    _phase = (_phase + 1) % phases.size();
    _stepsInPhase = 0;
    return true;
}

bool UTRANWalk::reselect()
{
    const auto level = [this](const UTRANCell& cell) { return rscp(cell); };
    const auto best = std::ranges::max_element(streetCells, {}, level);
    if (rscp(*best) < rscp(servingCell()) + reselectionMargin)
        return false;
    _serving = static_cast<std::size_t>(best - streetCells.begin());
    return true;
}

double UTRANWalk::rscp(const UTRANCell& cell) const
{
    const auto index = static_cast<std::size_t>(&cell - streetCells.data());
    return -58.0 - pathLoss(_position - cell.position) + _shadowing.level(index);
}

double UTRANWalk::rssi(const GSMCell& cell) const
{
    const auto index = static_cast<std::size_t>(&cell - streetGsmCells.data());
    return -55.0 - pathLoss(_position - cell.position) + _gsmShadowing.level(index);
}

double UTRANWalk::signalToInterference(unsigned slot) const
{
    constexpr double floor = 1e-8; // mW, -80 dBm: noise and the far cells together
    constexpr double spreadingGain = 10;
    double interference = floor;
    for (const UTRANCell& other : streetCells)
        if (&other != &servingCell() && other.uarfcn == servingCell().uarfcn)
            interference += std::pow(10.0, rscp(other) / 10.0);
    return rscp(servingCell()) - 10.0 * std::log10(interference) + spreadingGain +
           _slotNoise.level(slot % slotCount);
}

double UTRANWalk::blockErrorRate(unsigned channel) const
{
    return 30.0 * std::exp(-signalToInterference(channel) / 9.0);
}

} // namespace ventrik
