#pragma once

#include "LogGenerator/Orbel/Base.h"
#include "Packets/LTESignalRecords.h"

namespace ventrik
{

/// A response of a neighbour measurement in a record of subpackets.
struct NeighborResponse {
    PlacedSubpacket subpacket;
    const LTESignalRecords::NeighborLayout* layout;
};

/// Those of the record's packet whose versions are known.
std::vector<NeighborResponse> neighborResponses(const Record& record, const LogPacket& packet);

/// Shows a row for each cell of all of them, with these of its fields.
void showNeighborSignal(RowList::Rewrite rows, const Record& record, std::span<const Field> fields,
                        const LogPacket& packet);

/// What the neighbour measurements of one record have in common: the carrier that was measured.
class NeighborSignalMisc : public Base
{
  public:
    using Base::Base;

  protected:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

/// That of the idle mode, from either of its records.
class NeighborMeasurementMisc : public NeighborSignalMisc
{
  public:
    explicit NeighborMeasurementMisc(SystemLog& log);
};

/// That of the connected mode.
class ConnectedNeighbors : public NeighborSignalMisc
{
  public:
    explicit ConnectedNeighbors(SystemLog& log);
};

/// The signal of the neighbour cells while connected, one row each: levels as they were measured,
/// not filtered.
class ConnectedNeighborCells : public Base
{
  public:
    explicit ConnectedNeighborCells(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik
