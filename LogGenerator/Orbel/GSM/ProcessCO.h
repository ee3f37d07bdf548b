#pragma once

#include "LogGenerator/Orbel/GSM/MobilityProcess.h"

namespace ventrik
{

/// The mobility state on its own, without its sub-state and its update status.
class ProcessCO : public MobilityProcess
{
  public:
    explicit ProcessCO(SystemLog& log);

    std::string_view getSectionName() const override;

  private:
    void updateFromState(const LogPacket& packet) override;
};

} // namespace ventrik
