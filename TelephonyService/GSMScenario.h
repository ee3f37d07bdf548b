#pragma once

#include "Packets/Layouts.h"
#include "TelephonyService/GSMRide.h"
#include "TelephonyService/Scenario.h"

#include <array>
#include <cstdint>

namespace ventrik
{

/// A tram ride through GSM and UMTS cells, as the baseband would report it: camping, a call and a
/// data session on GSM, the handover to UMTS, HSDPA on one carrier and on two, and the way back.
/// Each change of cell or phase is a burst of records, and every few seconds the cell monitor sends
/// its array. About 20 messages a second; the same for the same seed.
class GSMScenario : public Scenario
{
  public:
    explicit GSMScenario(std::uint32_t seed, RecordsMode records = RecordsMode::Base)
        : _isNewer(records != RecordsMode::Base), _ride(seed)
    {
    }

  private:
    static constexpr std::size_t transportChannelCount = 3;
    static constexpr std::size_t harqProcessCount = 6;

    struct BlockCounter {
        std::uint32_t received = 0;
        std::uint32_t inError = 0;
    };

    void reportStep() override;
    void reportNewCell();
    void reportNewPhase();
    void reportRegularlyOnGSM();
    void reportRegularlyOnUMTS();

    // The network and the registration
    void reportServingPLMN();
    void reportEquivalentPLMNs();
    void reportEquivalentPLMNsInNibbles();
    void reportRegistration();
    void reportMobilityManagement();

    // GSM
    void reportGSMState();
    void reportGSMCell();
    void reportPacketInformation();
    void reportIdleMeasurements();
    void reportBSICs();
    void reportDedicatedChannel();

    // UMTS
    void reportUMTSState();
    void reportUMTSCell();
    void reportCellEnergies();
    void reportTransmitPower();
    void reportRankedCells();
    void addRankedUMTSCells(RecordWriter& record, const List& list);
    void addRankedGSMCells(RecordWriter& record, const List& list);
    void reportBlockErrors();
    void reportHSDPA();

    void reportCellMonitor();

    const bool _isNewer; // the layouts of its records
    GSMRide _ride;
    std::array<BlockCounter, transportChannelCount> _blocks{};
};

} // namespace ventrik
