#include "TelephonyService/C2KWalk.h"

#include <algorithm>
#include <cmath>
#include <functional>

namespace ventrik
{

namespace
{

constexpr double streetLength = 1500;   // metres
constexpr double metresPerStep = 0.4;   // 8 m/s, 29 km/h: a bus
constexpr double reselectionMargin = 3; // dB
constexpr double systemMargin = 6;      // dB
constexpr double noisePower = 1e-10;    // mW, -100 dBm
constexpr double pilotShare = 0.3;      // of a 1x cell's power
constexpr double weakestPilot = -16;    // dB
constexpr std::size_t mostPilots = 3;
constexpr double highestTransmitted = 23; // dBm
constexpr double lowestTransmitted = -50; // dBm

constexpr std::array<C2KSystem, 2> systems{{
    {4139, 7, 12, 0, 1, 425, 1, 475, 37},
    {5120, 31, 3, 1, 0, 283, 0, 630, 112},
}};

constexpr std::array<C2KCell, 5> streetCells{{
    {12, 1201, 0, 100},
    {180, 1202, 0, 420},
    {348, 1207, 0, 760},
    {24, 310, 1, 1080},
    {192, 311, 1, 1430},
}};

struct Phase {
    OneXState oneX;
    EVDOState evdo;
    EVDOSession session;
    int steps;
};

// First the way into a system; then data and a call take turns.
constexpr std::array<Phase, 14> phases{{
    {OneXState::acquisition, EVDOState::inactive, EVDOSession::closed, 8},
    {OneXState::sync, EVDOState::inactive, EVDOSession::closed, 8},
    {OneXState::paging, EVDOState::acquisition, EVDOSession::closed, 8},
    {OneXState::paging, EVDOState::sync, EVDOSession::closed, 8},
    {OneXState::paging, EVDOState::access, EVDOSession::ampSetup, 8},
    {OneXState::paging, EVDOState::access, EVDOSession::negotiationByTerminal, 10},
    {OneXState::paging, EVDOState::access, EVDOSession::negotiationByNetwork, 10},
    {OneXState::paging, EVDOState::idle, EVDOSession::open, 60},
    {OneXState::slottedSleep, EVDOState::idle, EVDOSession::open, 60},
    {OneXState::paging, EVDOState::access, EVDOSession::open, 10},
    {OneXState::paging, EVDOState::connected, EVDOSession::open, 300}, // 15 s
    {OneXState::paging, EVDOState::idle, EVDOSession::open, 60},
    {OneXState::traffic, EVDOState::idle, EVDOSession::open, 300}, // 15 s
    {OneXState::slottedSleep, EVDOState::idle, EVDOSession::open, 60},
}};
constexpr std::size_t firstIdlePhase = 7;

// What the network sends and the phone sends in a step of 50 ms.
struct ForwardPackets {
    double strength; // dB, from which on
    std::size_t kind;
    std::uint32_t count;
};

constexpr std::array<ForwardPackets, 5> forwardPackets{{
    {-1, 52, 15}, // of 5120 bits
    {-2, 45, 12}, // 4096
    {-4, 39, 10}, // 3072
    {-7, 27, 8},  // 2048
    {-1e9, 3, 4}, // 1024
}};

struct ReversePackets {
    double transmitted; // dBm, up to which
    std::size_t payloadSize;
    std::uint32_t count;
};

constexpr std::array<ReversePackets, 4> reversePackets{{
    {-10, 9, 2}, // of 6144 bits
    {0, 8, 2},   // 4096
    {10, 6, 2},  // 2048
    {1e9, 4, 2}, // 1024
}};

double decibels(double ratio)
{
    return 10.0 * std::log10(ratio);
}

bool isIdle(const Phase& phase)
{
    return phase.evdo == EVDOState::idle && phase.oneX != OneXState::traffic;
}

} // namespace

C2KWalk::C2KWalk(std::uint32_t seed) : _random(seed)
{
    _position = _random.uniform(0, 200);
}

C2KWalk::Changes C2KWalk::step()
{
    _position += _direction * metresPerStep;
    if (_position > streetLength || _position < 0)
        _direction = -_direction;
    fade();
    Changes changes;
    changes.state = changeState();
    if (changeSystem())
        changes = {true, true};
    else
        changes.cell = reselect();
    transferData();
    return changes;
}

OneXState C2KWalk::oneXState() const
{
    return phases.at(_phase).oneX;
}

EVDOState C2KWalk::evdoState() const
{
    return phases.at(_phase).evdo;
}

EVDOSession C2KWalk::session() const
{
    return phases.at(_phase).session;
}

const C2KSystem& C2KWalk::system() const
{
    return systems.at(servingCell().system);
}

const C2KCell& C2KWalk::servingCell() const
{
    return streetCells.at(_serving);
}

std::vector<const C2KCell*> C2KWalk::heardCells() const
{
    std::vector<const C2KCell*> cells;
    for (const C2KCell& cell : streetCells)
        if (&cell != &servingCell() && cell.system == servingCell().system &&
            oneXStrength(cell) > weakestPilot)
            cells.push_back(&cell);
    std::ranges::sort(cells, std::greater{}, [this](const C2KCell* cell) { return power(*cell); });
    cells.insert(cells.begin(), &servingCell());
    cells.resize(std::min(cells.size(), mostPilots));
    return cells;
}

std::vector<const C2KCell*> C2KWalk::joinedCells(bool isBusy) const
{
    auto cells = heardCells();
    if (!isBusy)
        cells.resize(1);
    return cells;
}

void C2KWalk::fade()
{
    _shadowing.step(_random);
    _chainNoise.step(_random);

    double strength = 0;
    for (const C2KCell* cell : heardCells())
        strength += std::pow(10.0, oneXStrength(*cell) / 10.0);
    const double erasureRate = 0.005 + 0.3 * std::exp(-(decibels(strength) + 12.0) / 2.0);
    _isFrameErased = _random.uniform(0, 1) < erasureRate;
}

bool C2KWalk::changeState()
{
    if (++_stepsInPhase < phases.at(_phase).steps)
        return false;
    _phase = _phase + 1 < phases.size() ? _phase + 1 : firstIdlePhase;
    _stepsInPhase = 0;
    return true;
}

// The phone leaves for another system only while nothing is going on, and begins anew there.
bool C2KWalk::changeSystem()
{
    const C2KCell& best = strongestCell();
    if (best.system == servingCell().system || !isIdle(phases.at(_phase)) ||
        decibels(power(best) / power(servingCell())) < systemMargin)
        return false;
    _serving = static_cast<std::size_t>(&best - streetCells.data());
    _phase = 0;
    _stepsInPhase = 0;
    ++_address;
    return true;
}

bool C2KWalk::reselect()
{
    const C2KCell* best = &servingCell();
    for (const C2KCell& cell : streetCells)
        if (cell.system == best->system && power(cell) > power(*best))
            best = &cell;
    if (decibels(power(*best) / power(servingCell())) < reselectionMargin)
        return false;
    _serving = static_cast<std::size_t>(best - streetCells.data());
    return true;
}

void C2KWalk::transferData()
{
    if (evdoState() != EVDOState::connected)
        return;
    const double strength = evdoStrength(servingCell());
    const auto* forward = std::ranges::find_if(
        forwardPackets, [=](double from) { return strength >= from; }, &ForwardPackets::strength);
    _transfer.forward.at(forward->kind) += forward->count;

    const double level = transmittedLevel();
    const auto* reverse = std::ranges::find_if(
        reversePackets, [=](double upTo) { return level <= upTo; }, &ReversePackets::transmitted);
    _transfer.reverse.at(reverse->payloadSize) += reverse->count;
}

const C2KCell& C2KWalk::strongestCell() const
{
    return *std::ranges::max_element(streetCells, {},
                                     [this](const C2KCell& cell) { return power(cell); });
}

double C2KWalk::power(const C2KCell& cell) const
{
    const auto index = static_cast<std::size_t>(&cell - streetCells.data());
    const double level = -58.0 - pathLoss(_position - cell.position) + _shadowing.level(index);
    return std::pow(10.0, level / 10.0);
}

double C2KWalk::totalPower() const
{
    double total = noisePower;
    for (const C2KCell& cell : streetCells)
        if (cell.system == servingCell().system)
            total += power(cell);
    return total;
}

double C2KWalk::oneXStrength(const C2KCell& cell) const
{
    return decibels(pilotShare * power(cell) / totalPower());
}

double C2KWalk::evdoStrength(const C2KCell& cell) const
{
    return decibels(power(cell) / totalPower());
}

double C2KWalk::receivedLevel(unsigned chain) const
{
    return decibels(totalPower()) + _chainNoise.level(chain);
}

// Open loop: the weaker the network is heard, the louder the phone.
double C2KWalk::transmittedLevel() const
{
    return std::clamp(-76.0 - receivedLevel(0), lowestTransmitted, highestTransmitted);
}

} // namespace ventrik
