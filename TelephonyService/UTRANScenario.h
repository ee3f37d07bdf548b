#pragma once

#include "TelephonyService/Scenario.h"
#include "TelephonyService/UTRANWalk.h"

#include <cstdint>
#include <vector>

namespace ventrik
{

/// A ride along a street of UTRAN cells with time slots, as the baseband would report it: camping,
/// a call on a dedicated channel and the way down from it, cell changes with a burst of records
/// each, and a cell-monitor array every few seconds. About 20 messages a second; the same for the
/// same seed.
class UTRANScenario : public Scenario
{
  public:
    explicit UTRANScenario(std::uint32_t seed) : _walk(seed) {}

  private:
    void reportStep() override;
    void reportNewCell();
    void reportNewState();
    void reportRegularly();
    void reportState();
    void reportCellInfo();
    void reportNeighbors();
    void reportGsmNeighbors();
    void reportTransportChannels();
    void reportCellMonitor();
    bool isInCall() const { return _walk.state() == RRCState::cellDch; }
    std::vector<const UTRANCell*> neighbors() const;
    std::vector<const GSMCell*> gsmNeighbors() const;

    UTRANWalk _walk;
};

} // namespace ventrik
