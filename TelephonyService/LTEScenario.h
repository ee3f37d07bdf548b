#pragma once

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
    explicit LTEScenario(std::uint32_t seed) : _drive(seed) {}

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
    std::vector<const LTECell*> neighborsOfServingCell() const;

    LTEDrive _drive;
    bool _wasConnected = false;
};

} // namespace ventrik
