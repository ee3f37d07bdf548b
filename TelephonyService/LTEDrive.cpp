#include "TelephonyService/LTEDrive.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double roadLength = 4200;     // metres
constexpr double metresPerStep = 1.25;  // 25 m/s, 90 km/h
constexpr double reselectionMargin = 4; // dB

// Two operators' worth of bands along one road: band 3 in the town, band 20 across the fields,
// band 7 at the junction.
constexpr std::array<LTECell, 6> roadCells{{
    {301, 1300, 19300, 50, 3, 0x01A2D003, 4711, 2, 5, 100},
    {302, 1300, 19300, 50, 3, 0x01A2D103, 4711, 2, 5, 900},
    {118, 6300, 24300, 25, 20, 0x01A2D21E, 4711, 2, 3, 1700},
    {119, 6300, 24300, 25, 20, 0x01A2E01E, 4712, 1, 3, 2600},
    {47, 3050, 21050, 100, 7, 0x01A2E10B, 4712, 4, 6, 3300},
    {415, 1300, 19300, 75, 3, 0x01A2E203, 4712, 2, 5, 4100},
}};

} // namespace

LTEDrive::LTEDrive(std::uint32_t seed) : _random(seed)
{
    _position = _random.uniform(0, 400);
}

std::span<const LTECell> LTEDrive::cells()
{
    return roadCells;
}

bool LTEDrive::step()
{
    _position += _direction * metresPerStep;
    if (_position > roadLength || _position < 0)
        _direction = -_direction;
    fade();
    changeMode();
    return reselect();
}

// Shadowing that wanders slowly, and quick fading on top of it.
void LTEDrive::fade()
{
    for (std::size_t i = 0; i < cellCount; ++i) {
        _smoothed[i] = 0.995 * _smoothed[i] + _random.uniform(-0.35, 0.35);
        _fading[i] = _smoothed[i] + _random.uniform(-2.0, 2.0);
    }
}

void LTEDrive::changeMode()
{
    constexpr int idleSteps = 400;      // 20 s
    constexpr int connectedSteps = 240; // 12 s
    if (++_stepsInMode < (_isConnected ? connectedSteps : idleSteps))
        return;
    _isConnected = !_isConnected;
    _stepsInMode = 0;
}

bool LTEDrive::reselect()
{
    const auto level = [this](const LTECell& cell) { return averageRsrp(cell); };
    const auto best = std::ranges::max_element(roadCells, {}, level);
    if (averageRsrp(*best) < averageRsrp(servingCell()) + reselectionMargin)
        return false;
    _serving = indexOf(*best);
    return true;
}

double LTEDrive::averageRsrp(const LTECell& cell) const
{
    const double distance = std::hypot(_position - cell.position, 60.0);
    return -62.0 - 35.0 * std::log10(distance / 60.0) + _smoothed[indexOf(cell)];
}

double LTEDrive::measuredRsrp(const LTECell& cell) const
{
    const std::size_t index = indexOf(cell);
    return averageRsrp(cell) - _smoothed[index] + _fading[index];
}

double LTEDrive::rsrq(const LTECell& cell, double rsrp) const
{
    double interference = 0;
    for (const LTECell& other : roadCells)
        if (&other != &cell && other.downlinkEarfcn == cell.downlinkEarfcn)
            interference += std::pow(10.0, (averageRsrp(other) - rsrp) / 10.0);
    return std::clamp(-6.0 - 10.0 * std::log10(1.0 + interference), -19.5, -3.0);
}

// RSRQ is the number of resource blocks times RSRP over RSSI.
double LTEDrive::rssi(const LTECell& cell, double rsrp, double rsrq) const
{
    return rsrp + 10.0 * std::log10(cell.resourceBlocks) - rsrq;
}

std::size_t LTEDrive::indexOf(const LTECell& cell) const
{
    return static_cast<std::size_t>(&cell - roadCells.data());
}

} // namespace ventrik
