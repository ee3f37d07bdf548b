#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The serving cell's identity, frequencies, bandwidths and band.
class LTEServingCellInfo : public Base
{
  public:
    explicit LTEServingCellInfo(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
