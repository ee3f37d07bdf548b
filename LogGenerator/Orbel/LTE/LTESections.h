#pragma once

#include "LogGenerator/Orbel/Base.h"
#include "Packets/LTERecords.h"

namespace ventrik
{

// The LTE sections that only show what the tables of their records say.

/// The serving cell's filtered measurements while connected.
inline constexpr SectionTable connectedModeMeasurementMisc{
    .name = "Connected mode LTE Intra-frequency Measurement",
    .records = {{{&LTERecords::connectedMode, LTERecords::connectedModeFields}}},
};
using ConnectedModeMeasurementMisc = TableSection<connectedModeMeasurementMisc>;

/// The cells that were detected while connected but are in no neighbour list, one row each.
inline constexpr SectionTable detectedCells{
    .name = "Detected Cells",
    .records = {{{&LTERecords::connectedMode, {}, {{{&LTERecords::detectedCells}}}}}},
};
using DetectedCells = TableSection<detectedCells>;

/// The serving cell's idle-mode measurements and cell-selection values.
inline constexpr SectionTable servingCellMeasurement{
    .name = "Serving Cell Measurements",
    .records = {{{&LTERecords::servingCellMeasurement, LTERecords::servingCellMeasurementFields}}},
};
using ServingCellMeasurement = TableSection<servingCellMeasurement>;

/// What the idle-mode measurements of the neighbour cells have in common.
inline constexpr SectionTable neighborMeasurementMisc{
    .name = "Neighbor Measurements",
    .records = {{{&LTERecords::idleNeighbors, LTERecords::idleNeighborFields}}},
};
using NeighborMeasurementMisc = TableSection<neighborMeasurementMisc>;

/// The serving cell from which the reselection candidates were ranked.
inline constexpr SectionTable reselectionCandidatesMisc{
    .name = "Reselection Candidates",
    .records = {{{&LTERecords::reselection, LTERecords::reselectionFields}}},
};
using ReselectionCandidatesMisc = TableSection<reselectionCandidatesMisc>;

} // namespace ventrik
