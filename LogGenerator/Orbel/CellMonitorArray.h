#pragma once

#include "LogGenerator/Orbel/LogPacket.h"
#include "Platform/SystemLog.h"

#include <cstdint>
#include <initializer_list>
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

/// A number of a cell as a list of cells shows it; the row's key names it in the log as well.
struct CellRowField {
    std::string_view cellKey;
    std::string_view rowKey;
    std::string (*text)(std::int32_t);
};

/// A level of a cell: the low 16 bits of its number; none when they say that it was not measured.
std::optional<std::int16_t> cellLevel(std::int32_t number);

/// Whether the cell is of that radio access technology and of that type.
bool isCell(const PlistDictionary& cell, std::string_view technology, std::string_view type);

/// The first serving cell of one of the technologies; null when there is none.
const PlistDictionary* servingCell(const PlistArray& cells,
                                   std::initializer_list<std::string_view> technologies);

} // namespace ventrik
