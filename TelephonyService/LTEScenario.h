#pragma once

#include "TelephonyService/LTEDrive.h"
#include "TelephonyService/MessageSource.h"

#include <cstdint>
#include <deque>
#include <vector>

namespace ventrik
{

class PacketBuilder;

/// A drive along a road of LTE cells, as the baseband would report it: idle and connected
/// stretches, reselections and handovers with a burst of records each, and a cell-monitor array
/// every few seconds. About 20 messages a second; endless; the same for the same seed.
class LTEScenario : public MessageSource
{
  public:
    explicit LTEScenario(std::uint32_t seed) : _drive(seed) {}

    std::optional<TimedMessage> next() override;

  private:
    void reportStep();
    void reportIdleStep();
    void reportNewCell();
    void reportCellInfo();
    void reportAntennaCount();
    void reportIdleMeasurement();
    void reportConnectedMeasurement();
    void reportIdleNeighbors();
    void reportReselectionCandidates();
    void reportCellMonitor();
    void reportSimFiles();
    void reportPdpContexts();
    std::vector<const LTECell*> neighborsOfServingCell() const;
    void reportList(std::uint32_t logCode, const PlistValue& root);
    void report(PacketBuilder packet);

    LTEDrive _drive;
    std::uint64_t _step = 0;
    std::uint64_t _messageCount = 0;
    bool _wasConnected = false;
    std::deque<TimedMessage> _messages;
};

} // namespace ventrik
