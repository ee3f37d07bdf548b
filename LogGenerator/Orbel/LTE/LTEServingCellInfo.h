#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The serving cell's identity, frequencies, bandwidths and band.
class LTEServingCellInfo : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromCellInfo(const LogPacket& packet);
    void updateFromAntennaCount(const LogPacket& packet, std::uint32_t logCode);
    void updateFromCellMonitor(const LogPacket& packet);
};

} // namespace ventrik
