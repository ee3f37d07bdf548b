#pragma once

#include "LogGenerator/Orbel/LogPacket.h"
#include "Platform/SystemLog.h"

#include <cstdint>
#include <optional>

namespace ventrik
{

// Cell-monitor array, extra code 1
//   13 a serialised property list: an array of cell dictionaries, keyed kQXCellMonitor...
inline constexpr std::uint32_t cellMonitorLogCode = 0xFF0001;

/// The cells of a cell-monitor packet; none, with an error line, when there is no such array.
std::optional<PlistArray> parseCellMonitorArray(const LogPacket& packet, SystemLog& log);

/// The number under a key of a cell as a signed 32-bit number: an integer's low 32 bits, a finite
/// real truncated toward zero first. None when the key is missing or is no number.
std::optional<std::int32_t> cellNumber(const PlistDictionary& cell, std::string_view key);

/// A number of a cell, where a section shows it and how the log names it when it is missing.
struct CellField {
    std::string_view cellKey;
    std::string_view displayKey;
    std::string_view nameInLog;
};

/// Whether the cell's entry under the key is that string.
bool cellEntryIs(const PlistDictionary& cell, std::string_view key, std::string_view value);

} // namespace ventrik
