#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The GSM cell that the phone camps on: its identity, its level and its reselection criteria.
class GSMServingCell : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromIdentity(const LogPacket& packet);
    void updateFromIdleMeasurements(const LogPacket& packet);
    void updateFromDedicatedChannel(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
};

} // namespace ventrik
