#pragma once

#include "LogGenerator/Orbel/Base.h"

#include <unordered_map>

namespace ventrik
{

/// The GSM neighbour cells, from the idle measurements or the cell monitor, whichever came last;
/// one row each, in the order of the source.
class NeighboringCells : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromIdleMeasurements(const LogPacket& packet);
    void updateFromBSICList(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
    PlistDictionary row(const LogPacket& neighbor) const;

    /// What the last BSIC list told.
    std::unordered_map<std::uint16_t, std::uint8_t> arfcnToBsic;
};

} // namespace ventrik
