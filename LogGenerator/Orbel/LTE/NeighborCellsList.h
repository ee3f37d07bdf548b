#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The neighbour cells measured in idle mode, one row each.
class NeighborCellsList : public Base
{
  public:
    explicit NeighborCellsList(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
