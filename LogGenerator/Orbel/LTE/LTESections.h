#pragma once

#include "LogGenerator/Orbel/Base.h"
#include "Packets/LTERecords.h"
#include "Packets/LTEStateRecords.h"

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

/// The serving cell from which the reselection candidates were ranked.
inline constexpr SectionTable reselectionCandidatesMisc{
    .name = "Reselection Candidates",
    .records = {{{&LTERecords::reselection, LTERecords::reselectionFields}}},
};
using ReselectionCandidatesMisc = TableSection<reselectionCandidatesMisc>;

/// The last message of the radio resource layer: what stands in front of it.
inline constexpr SectionTable lastRRCMessage{
    .name = "Last RRC Message",
    .records = {{{&LTEStateRecords::message2, LTEStateRecords::messageFields2}}},
};
using LastRRCMessage = TableSection<lastRRCMessage>;

} // namespace ventrik
