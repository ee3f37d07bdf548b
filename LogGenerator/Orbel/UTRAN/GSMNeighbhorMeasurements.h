#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The GSM neighbour cells. The list on display is emptied by every record and never filled.
class GSMNeighbhorMeasurements : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;
};

/// The cells of a record of GSM neighbours, one row each.
PlistArray gsmNeighborRows(const LogPacket& packet);

} // namespace ventrik
