#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The signal-to-interference ratios of each coded composite transport channel, one row each.
class CCTRCHSIRMeasurement : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;
};

} // namespace ventrik
