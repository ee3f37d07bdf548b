#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// What the GSM cell's system information says about packet data.
class GPRSInformation : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromPacketOptions(const LogPacket& packet);
    void updateFromNetworkMode(const LogPacket& packet);
    void updateFromCellOptions(const LogPacket& packet);
    void updateFromBroadcastChannel(const LogPacket& packet);
    void updateFromMeasurementOrder(const LogPacket& packet);
    void updateFromSI13Position(const LogPacket& packet);
    void updateFromIdleMeasurements(const LogPacket& packet);
};

} // namespace ventrik
