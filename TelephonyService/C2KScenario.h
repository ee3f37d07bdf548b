#pragma once

#include "TelephonyService/C2KWalk.h"
#include "TelephonyService/Scenario.h"

#include <cstdint>

namespace ventrik
{

/// A ride along a street of CDMA2000 cells, as the baseband would report it: the way into a 1x and
/// an EV-DO system, data over the one and calls over the other, pilots that come and go, and
/// another operator's system half way. About 20 messages a second, and one more for each frame of a
/// call; the same for the same seed.
class C2KScenario : public Scenario
{
  public:
    explicit C2KScenario(std::uint32_t seed) : _walk(seed) {}

  private:
    void reportStep() override;
    void reportRegularly();
    void reportServingSystem();
    void reportOneXStatus();
    void reportFingers();
    void reportTrafficFrame();
    void reportEVDOStatus();
    void reportActiveSetPilots();
    void reportForwardData();
    void reportReverseData();
    bool isInCall() const { return _walk.oneXState() == OneXState::traffic; }
    /// The record's sequence number: seconds from the start.
    std::uint32_t second() const;

    C2KWalk _walk;
};

} // namespace ventrik
