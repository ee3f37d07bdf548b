#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The reselection candidates of any radio technology, one row each.
class ReselectionCandidatesList : public Base
{
  public:
    explicit ReselectionCandidatesList(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
