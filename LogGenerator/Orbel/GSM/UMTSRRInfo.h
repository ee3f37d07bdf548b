#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The state of the UMTS radio resource layer, its serving cell and its transmit power.
class UMTSRRInfo : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromState(const LogPacket& packet);
    void updateFromTransmitPower(const LogPacket& packet);
    void updateFromServingCell(const LogPacket& packet);
    void updateFromSecurity(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
};

} // namespace ventrik
