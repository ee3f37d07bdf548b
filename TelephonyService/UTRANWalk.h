#pragma once

#include "TelephonyService/Propagation.h"
#include "TelephonyService/ScenarioRandom.h"

#include <cstddef>
#include <cstdint>
#include <span>

namespace ventrik
{

struct UTRANCell {
    std::uint16_t uarfcn; ///< of both directions
    std::uint8_t parameterId;
    std::uint8_t band;
    std::uint32_t cellIdentity;
    std::uint16_t locationAreaCode;
    std::uint8_t uraId;
    double position; ///< metres along the street
};

struct GSMCell {
    std::uint16_t arfcn;
    std::uint8_t ncc;
    std::uint8_t bcc;
    std::uint16_t cellIdentity;
    bool isHighBand;
    double position; ///< metres along the street
};

/// As the baseband numbers them.
enum class RRCState : std::uint8_t { disconnected, connecting, cellFach, cellDch, cellPch, uraPch };

/// The world of the UTRAN scenario: somebody who goes up and down a street, makes a call now and
/// then, and whose phone rests a while before it lets go of the connection.
class UTRANWalk
{
  public:
    explicit UTRANWalk(std::uint32_t seed);

    struct Changes {
        bool cell = false;
        bool state = false;
    };
    /// Moves on by one step.
    Changes step();

    RRCState state() const;
    const UTRANCell& servingCell() const { return cells()[_serving]; }
    static std::span<const UTRANCell> cells();
    static std::span<const GSMCell> gsmCells();

    double rscp(const UTRANCell& cell) const; ///< dBm, where the phone is
    double rssi(const GSMCell& cell) const;   ///< dBm, where the phone is
    static constexpr unsigned slotCount = 6;
    /// What the receiver gets of a channel in a slot, in dB; a little different in each.
    double signalToInterference(unsigned slot) const;
    /// In percent; the worse the reception, the higher.
    double blockErrorRate(unsigned channel) const;

  private:
    static constexpr std::size_t cellCount = 5;
    static constexpr std::size_t gsmCellCount = 4;

    void fade();
    bool changeState();
    bool reselect();

    ScenarioRandom _random;
    double _position = 0;  ///< metres
    double _direction = 1; ///< 1 or -1
    std::size_t _phase = 0;
    int _stepsInPhase = 0;
    std::size_t _serving = 0;
    Fading _shadowing{cellCount, 0.99, 0.4};
    Fading _gsmShadowing{gsmCellCount, 0.99, 0.4};
    Fading _slotNoise{slotCount, 0.8, 1.0};
};

} // namespace ventrik
