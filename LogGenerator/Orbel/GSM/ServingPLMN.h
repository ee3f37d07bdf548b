#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The network that the phone is registered on, its areas and its service.
class ServingPLMN : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromServingPLMN(const LogPacket& packet);
    void updateFromRegistration(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
};

} // namespace ventrik
