#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The packet data contexts: one row each, with whatever keys the telephony service gives.
class PDPContextList : public Base
{
  public:
    explicit PDPContextList(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
