#pragma once

#include "LogGenerator/Orbel/Base.h"

#include <unordered_map>

namespace ventrik
{

/// The GSM neighbour cells, from the idle measurements or the cell monitor, whichever came last;
/// one row each, in the order of the source.
class NeighboringCells : public Base
{
  public:
    explicit NeighboringCells(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
    void updateFromIdleMeasurements(const LogPacket& packet);
    void updateFromBSICList(const LogPacket& packet);

    /// What the last BSIC list told.
    std::unordered_map<std::int64_t, std::int64_t> arfcnToBsic;
};

} // namespace ventrik
