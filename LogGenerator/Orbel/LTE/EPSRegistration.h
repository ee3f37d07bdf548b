#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The state of the mobility management, the network and what names the phone in it.
class EPSRegistration : public Base
{
  public:
    explicit EPSRegistration(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
