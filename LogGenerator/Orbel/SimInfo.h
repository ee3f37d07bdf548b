#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The contents of the SIM's elementary files, shown as the telephony service gives them.
class SimInfo : public Base
{
  public:
    explicit SimInfo(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
