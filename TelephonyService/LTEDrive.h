#pragma once

#include "TelephonyService/ScenarioRandom.h"

#include <array>
#include <cstdint>
#include <span>

namespace ventrik
{

struct LTECell {
    std::uint16_t physicalCellId;
    std::uint16_t downlinkEarfcn;
    std::uint16_t uplinkEarfcn;
    std::uint8_t resourceBlocks;
    std::uint32_t band;
    std::uint32_t cellIdentity;
    std::uint16_t trackingAreaCode;
    std::uint8_t antennas;
    std::uint8_t layerPriority;
    double position; ///< metres along the road
};

/// The world of the LTE scenario: a car that goes up and down a road with cells beside it.
class LTEDrive
{
  public:
    explicit LTEDrive(std::uint32_t seed);

    /// Moves on by one step. True when the serving cell has changed.
    bool step();

    bool isConnected() const { return _isConnected; }
    const LTECell& servingCell() const { return cells()[_serving]; }
    static std::span<const LTECell> cells();

    // Levels of a cell where the car is, with the fading of the moment or smoothed.
    double measuredRsrp(const LTECell& cell) const;                   ///< dBm
    double averageRsrp(const LTECell& cell) const;                    ///< dBm
    double rsrq(const LTECell& cell, double rsrp) const;              ///< dB
    double rssi(const LTECell& cell, double rsrp, double rsrq) const; ///< dBm

  private:
    static constexpr std::size_t cellCount = 6;

    std::size_t indexOf(const LTECell& cell) const;
    void fade();
    void changeMode();
    bool reselect();

    ScenarioRandom _random;
    double _position = 0;  ///< metres
    double _direction = 1; ///< 1 or -1
    bool _isConnected = false;
    int _stepsInMode = 0;
    std::size_t _serving = 0;
    std::array<double, cellCount> _fading{};   ///< dB, now
    std::array<double, cellCount> _smoothed{}; ///< dB, averaged
};

} // namespace ventrik
