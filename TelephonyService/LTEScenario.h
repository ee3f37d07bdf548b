#pragma once

#include "Packets/Layouts.h"
#include "TelephonyService/LTEDrive.h"
#include "TelephonyService/Scenario.h"

#include <cstdint>
#include <vector>

namespace ventrik
{

/// A drive along a road of LTE cells, as the baseband would report it: idle and connected
/// stretches, reselections and handovers with a burst of records each, and a cell-monitor array
/// every few seconds. About 20 messages a second; endless; the same for the same seed.
class LTEScenario : public Scenario
{
  public:
    explicit LTEScenario(std::uint32_t seed, RecordsMode records = RecordsMode::Base)
        : _records(records), _drive(seed)
    {
    }

  private:
    void reportStep() override;
    void reportIdleStep();
    void reportNewCell();
    void reportCellInfo();
    void reportAntennaCount();
    void reportIdleMeasurement();
    void reportConnectedMeasurement();
    void reportIdleNeighbors();
    void reportReselectionCandidates();
    void reportCellMonitor();

    // Records that have no base layout
    void reportServingCellSignal();
    void reportNeighborSignal(const Record& record, std::uint8_t request, std::uint8_t version);
    void reportConnection();
    void reportRegistration(std::uint8_t state);
    void reportMessage(std::uint8_t bearer, std::uint8_t channel, std::uint16_t length);

    bool isNewer() const { return _records != RecordsMode::Base; }
    bool isExtended() const { return _records == RecordsMode::Extended; }
    std::int64_t frame() const;
    std::vector<const LTECell*> neighborsOfServingCell() const;

    const RecordsMode _records;
    LTEDrive _drive;
    bool _wasConnected = false;
};

} // namespace ventrik
