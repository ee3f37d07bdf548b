#pragma once

#include "TelephonyService/Propagation.h"
#include "TelephonyService/ScenarioRandom.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace ventrik
{

struct GSMRideCell {
    std::uint16_t arfcn;
    std::uint8_t bsic;
    std::uint16_t cellIdentity;
    std::uint16_t locationAreaCode;
    std::uint8_t routingAreaCode;
    double position; ///< metres along the line
};

struct UMTSRideCell {
    std::uint16_t uarfcn; ///< of the downlink
    std::uint16_t scramblingCode;
    std::uint32_t cellIdentity;
    std::uint16_t locationAreaCode;
    std::uint8_t routingAreaCode;
    std::uint16_t uraId;
    double position; ///< metres along the line
};

/// What the phone is doing.
enum class GSMRidePhase {
    cellSelection,
    camping,
    callSetup,
    call,
    callRelease,
    dataSession,
    handoverToUMTS,
    hsdpa,
    dualCarrierHSDPA,
    forwardAccess,
    paging,
    umtsCamping,
    reselectionToGSM,
};

/// The world of the GSM/UMTS scenario: a tram ride past cells of both technologies. The phone camps
/// on GSM, makes a call, loads data, is handed over to UMTS and loads more there, rests, and goes
/// back to GSM.
class GSMRide
{
  public:
    explicit GSMRide(std::uint32_t seed);

    struct Changes {
        bool phase = false;
        bool gsmCell = false;
        bool umtsCell = false;
    };
    /// Moves on by one step.
    Changes step();

    GSMRidePhase phase() const;
    bool isOnUMTS() const;
    /// Whether data flows.
    bool hasDataConnection() const;
    /// Steps since the phase began.
    int stepsInPhase() const { return _stepsInPhase; }

    // The best cell of each technology, whichever of the two the phone is on.
    const GSMRideCell& gsmCell() const { return gsmCells()[_gsmServing]; }
    const UMTSRideCell& umtsCell() const { return umtsCells()[_umtsServing]; }
    static std::span<const GSMRideCell> gsmCells();
    static std::span<const UMTSRideCell> umtsCells();

    /// The cells that the phone can receive beside the one it is on, the strongest first.
    std::vector<const GSMRideCell*> gsmNeighbors() const;
    std::vector<const UMTSRideCell*> umtsNeighbors() const;

    // Where the phone is.
    double rssi(const GSMRideCell& cell) const;  ///< dBm
    double rscp(const UMTSRideCell& cell) const; ///< dBm
    double carrierPower() const;                 ///< of all UMTS cells and the noise, dBm
    double ecno(const UMTSRideCell& cell) const; ///< dB
    double transmitPower() const;                ///< of the phone on UMTS, dBm
    /// From 0, good, to 7.
    unsigned receiveQuality() const;
    /// The share of blocks that come in error.
    double blockErrorRate() const;

  private:
    bool changePhase();

    ScenarioRandom _random;
    double _position = 0;  ///< metres
    double _direction = 1; ///< 1 or -1
    std::size_t _phase = 0;
    int _stepsInPhase = 0;
    std::size_t _gsmServing = 0;
    std::size_t _umtsServing = 0;
    Fading _gsmShadowing;
    Fading _umtsShadowing;
};

} // namespace ventrik
