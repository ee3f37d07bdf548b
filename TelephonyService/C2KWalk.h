#pragma once

#include "TelephonyService/Propagation.h"
#include "TelephonyService/ScenarioRandom.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace ventrik
{

/// An operator's network, on its own carriers.
struct C2KSystem {
    std::uint16_t systemId;
    std::uint16_t networkId;
    std::uint8_t packetZone;
    std::uint32_t roamingIndicator; ///< 0: off, at home; 1: on
    std::uint8_t oneXBandClass;
    std::uint16_t oneXChannel;
    std::uint8_t evdoBandClass;
    std::uint16_t evdoChannel; ///< 11 bits
    std::uint8_t colorCode;
};

struct C2KCell {
    std::uint16_t pnOffset; ///< in units of 64 chips
    std::uint16_t baseStation;
    std::size_t system;
    double position; ///< metres along the street
};

// As the baseband numbers them.
enum class OneXState : std::uint8_t {
    acquisition = 3,
    sync = 4,
    paging = 6,
    slottedSleep = 7,
    traffic = 8
};
enum class EVDOState : std::uint8_t { inactive, acquisition, sync, idle, access, connected };
enum class EVDOSession : std::uint8_t {
    closed,
    ampSetup,
    negotiationByTerminal,
    negotiationByNetwork,
    open
};

/// Packets since the start, by kind and by payload size, as the baseband counts them.
struct C2KTransfer {
    std::array<std::uint32_t, 56> forward{};
    std::array<std::uint32_t, 12> reverse{};
};

/// The world of the CDMA2000 scenario: somebody who goes up and down a street, fetches data and
/// makes a call now and then, and finds another operator in the other half of the street.
class C2KWalk
{
  public:
    explicit C2KWalk(std::uint32_t seed);

    struct Changes {
        bool cell = false;
        bool state = false;
    };
    /// Moves on by one step.
    Changes step();

    OneXState oneXState() const;
    EVDOState evdoState() const;
    EVDOSession session() const;
    /// The address in the EV-DO network, 24 bits; another one after each change of the system.
    std::uint32_t address() const { return _address; }

    const C2KSystem& system() const;
    const C2KCell& servingCell() const;
    /// The serving cell, and those of its system that are heard as well; the strongest first, and
    /// no more than the phone can follow.
    std::vector<const C2KCell*> heardCells() const;
    /// Of the heard cells those that the phone is joined with: one while idle.
    std::vector<const C2KCell*> joinedCells(bool isBusy) const;

    double oneXStrength(const C2KCell& cell) const; ///< Ec/Io in dB
    double evdoStrength(const C2KCell& cell) const; ///< Ec/Io in dB
    double receivedLevel(unsigned chain) const;     ///< dBm, in chain 0 or 1
    double transmittedLevel() const;                ///< dBm
    /// Was the frame of this step lost?
    bool isFrameErased() const { return _isFrameErased; }
    const C2KTransfer& transfer() const { return _transfer; }

  private:
    static constexpr std::size_t cellCount = 5;

    void fade();
    bool changeState();
    bool changeSystem();
    bool reselect();
    void transferData();
    double power(const C2KCell& cell) const; ///< mW
    double totalPower() const;               ///< mW, of the serving system and the noise
    const C2KCell& strongestCell() const;

    ScenarioRandom _random;
    double _position = 0;  ///< metres
    double _direction = 1; ///< 1 or -1
    std::size_t _phase = 0;
    int _stepsInPhase = 0;
    std::size_t _serving = 0;
    std::uint32_t _address = 0x0A1B00;
    bool _isFrameErased = false;
    Fading _shadowing{cellCount, 0.99, 0.4};
    Fading _chainNoise{2, 0.8, 1.0};
    C2KTransfer _transfer;
};

} // namespace ventrik
