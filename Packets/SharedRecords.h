#pragma once

#include "Packets/Record.h"

namespace ventrik
{

// Records of all packet-based technologies. Those of the telephony service itself carry a
// serialised property list behind the header.

namespace SharedRecords
{

// SIM files: a dictionary of kSimFile_... keys
inline constexpr Record simFiles{extraCodeBase + 0, "SIM files", 0};

// Cell monitor: an array of cell dictionaries, keyed kQXCellMonitor...
inline constexpr Record cellMonitor{extraCodeBase + 1, "Cell monitor", 0};

// PDP contexts: an array, its elements the rows as they are
inline constexpr Record pdpContexts{extraCodeBase + 2, "PDP contexts", 0};

// What begins a DLF file; no channel streams it.
inline constexpr Record versionReport{0x1FFD, "DLF version report", 0};

} // namespace SharedRecords

} // namespace ventrik
