#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The UMTS cells that the baseband ranks for reselection, or the UMTS neighbours of the cell
/// monitor, whichever came last; one row each.
class UMTSSet : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromRankedCells(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
};

} // namespace ventrik
