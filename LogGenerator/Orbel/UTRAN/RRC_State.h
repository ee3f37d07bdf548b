#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The state of the radio resource control connection.
class RRC_State : public Base
{
  public:
    explicit RRC_State(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
