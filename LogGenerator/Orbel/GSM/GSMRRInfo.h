#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The state of the GSM radio resource layer and the quality of its link.
class GSMRRInfo : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromState(const LogPacket& packet);
    void updateFromIdleMeasurements(const LogPacket& packet);
    void updateFromDTX(const LogPacket& packet);
    void updateFromCellOptions(const LogPacket& packet);
};

} // namespace ventrik
