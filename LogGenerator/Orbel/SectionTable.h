#pragma once

#include "LogGenerator/Orbel/CellMonitor.h"
#include "Packets/Record.h"
#include "Platform/SystemLog.h"

#include <array>
#include <span>
#include <string_view>

namespace ventrik
{

/// A list of a record as a section shows it: as its rows, or as rows under the list's key.
struct ShownList {
    const List* list = nullptr;
    /// The rows that stood there stay when the record counts none.
    bool isKeptWhileEmpty = false;
};

/// What a section shows of one record.
struct ShownRecord {
    const Record* record = nullptr;
    /// In the section's dictionary, in this order.
    std::span<const Field> fields = {};
    std::array<ShownList, 2> lists = {};
    /// Of a cell-monitor record.
    const MonitoredCells* cells = nullptr;
    /// The key of another record that this one supersedes.
    std::string_view superseded = {};
    /// Such a record empties the section's rows.
    bool emptiesRows = false;
};

/// What happens to a packet whose code is none of the section's.
enum class UnknownCode {
    Reported, ///< at error level
    Ignored,
};

/// A section as its description says it: once, and in one place.
struct SectionTable {
    std::string_view name;       ///< also its key in the display template
    std::string_view trace = {}; ///< the system log's line at each packet, where it is not the name
    /// In the order in which the section registers their codes, up to the first empty one.
    std::array<ShownRecord, 7> records = {};
    UnknownCode unknownCode = UnknownCode::Reported;
    int tracePriority = LogPriority::warning;
    bool decodesShortRecords = false; ///< a record below its minimum size is decoded all the same

    constexpr std::span<const ShownRecord> shownRecords() const
    {
        std::size_t count = 0;
        while (count < records.size() && records[count].record)
            ++count;
        return std::span(records).first(count);
    }
};

} // namespace ventrik
