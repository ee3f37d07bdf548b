#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The neighbour cells measured while connected, one row each.
class MeasuredNeighborCells : public Base
{
  public:
    explicit MeasuredNeighborCells(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
