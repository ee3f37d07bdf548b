#pragma once

#include "Packets/Record.h"
#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <optional>
#include <span>

namespace ventrik
{

/// A number of a cell-monitor cell: under which of the cell's keys it stands, how it shows, and how
/// the log names it when it is missing.
struct CellField {
    std::string_view cellKey;
    Field field; ///< its place is in the number itself
    std::string_view nameInLog;
};

/// The cells of the cell monitor that a section shows.
struct MonitoredCells {
    enum class Kind {
        Serving,   ///< the first one, in the section's dictionary
        Neighbors, ///< all, as the section's rows
    } kind;
    std::span<const std::string_view> technologies;
    std::span<const CellField> fields;
    std::string_view nameInLog; ///< of the section
};

/// The cells of a cell-monitor packet; none, with an error line, when there is no such array.
std::optional<PlistArray> parseCellMonitorArray(const LogPacket& packet, SystemLog& log);

/// The number under a key of a cell as a signed 32-bit number: an integer's low 32 bits, a finite
/// real truncated toward zero first. None when the key is missing or is no number.
std::optional<std::int32_t> cellNumber(const PlistDictionary& cell, std::string_view key);

/// The raw number of a field; a missing one is reported in a line that begins with the section's
/// name.
std::optional<std::int64_t> cellFieldNumber(const PlistDictionary& cell, const CellField& field,
                                            std::string_view sectionNameInLog, SystemLog& log);

/// Whether the cell is of one of those radio access technologies and of that type.
bool isCell(const PlistDictionary& cell, std::span<const std::string_view> technologies,
            std::string_view type);

/// The first serving cell of one of the technologies; null when there is none.
const PlistDictionary* servingCell(const PlistArray& cells,
                                   std::span<const std::string_view> technologies);

// How fields say a cell's numbers. Of a level the low 16 bits count, and nothing shows in its place
// when they say that it was not measured.
inline constexpr Place cellNumberPlace = i32(0);
inline constexpr Place cellLevelPlace = i16(0);
inline constexpr std::array<Mark, 1> notMeasured{{{32767, ""}}};

} // namespace ventrik
