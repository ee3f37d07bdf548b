#pragma once

#include "LogGenerator/Orbel/GSM/MobilityProcess.h"

namespace ventrik
{

/// The circuit-switched mobility states.
class ProcessCS : public MobilityProcess
{
  public:
    explicit ProcessCS(SystemLog& log);

    std::string_view getSectionName() const override;

  private:
    void updateFromState(const LogPacket& packet) override;
};

} // namespace ventrik
