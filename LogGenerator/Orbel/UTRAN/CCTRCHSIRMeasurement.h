#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The signal-to-interference ratios of each coded composite transport channel, one row each.
class CCTRCHSIRMeasurement : public Base
{
  public:
    explicit CCTRCHSIRMeasurement(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
