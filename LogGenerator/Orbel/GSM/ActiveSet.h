#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The cells of the active set with their signal levels, one row each.
class ActiveSet : public Base
{
  public:
    explicit ActiveSet(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
