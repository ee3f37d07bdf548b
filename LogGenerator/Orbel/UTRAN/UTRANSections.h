#pragma once

#include "LogGenerator/Orbel/Base.h"
#include "Packets/UTRANRecords.h"

namespace ventrik
{

// The UTRAN sections that only show what the tables of their records say.

/// The neighbour cells of the same technology, one row each.
inline constexpr SectionTable utranNeighbhorMeasurements{
    .name = "Neighbor Cell List",
    .trace = "NeighbhorMeasurements List",
    .records = {{{&UTRANRecords::neighborMeasurements, {}, {{{&UTRANRecords::neighbors}}}}}},
    .unknownCode = UnknownCode::Ignored,
};
using UTRANNeighbhorMeasurements = TableSection<utranNeighbhorMeasurements>;

/// The GSM neighbour cells. The rows have never been put on display, and users know the list as
/// empty: every record empties it.
inline constexpr SectionTable gsmNeighbhorMeasurements{
    .name = "GSM Neighbor Cell List",
    .records = {{{.record = &UTRANRecords::gsmNeighborMeasurements, .emptiesRows = true}}},
    .unknownCode = UnknownCode::Ignored,
};
using GSMNeighbhorMeasurements = TableSection<gsmNeighbhorMeasurements>;

/// The block error rate of each transport channel.
inline constexpr SectionTable trchBLERMeasurement{
    .name = "TRCH BLER",
    .trace = "TRCH BLER Measurement",
    .records = {{{&UTRANRecords::transportChannelMeasurement,
                  {},
                  {{{&UTRANRecords::transportChannels}}}}}},
    .unknownCode = UnknownCode::Ignored,
    .tracePriority = LogPriority::notice,
};
using TRCHBLERMeasurement = TableSection<trchBLERMeasurement>;

} // namespace ventrik
