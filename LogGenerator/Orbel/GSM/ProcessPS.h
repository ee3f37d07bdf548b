#pragma once

#include "LogGenerator/Orbel/GSM/MobilityProcess.h"

namespace ventrik
{

/// The packet-switched mobility states.
class ProcessPS : public MobilityProcess
{
  public:
    explicit ProcessPS(SystemLog& log);

    std::string_view getSectionName() const override;

  private:
    void updateFromState(const LogPacket& packet) override;
};

} // namespace ventrik
