#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The state of the UMTS radio resource layer, its serving cell and its transmit power.
class UMTSRRInfo : public Base
{
  public:
    explicit UMTSRRInfo(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
    void updateFromTransmitPower(const LogPacket& packet);
};

} // namespace ventrik
