#pragma once

#include "Model/EventLog.h"
#include "Report/CellHistory.h"
#include "Report/HtmlWriter.h"
#include "Report/ReportTimes.h"

#include <cstddef>
#include <span>

namespace ventrik
{

// The tables of a report. What does not fit into their bytes is counted.

void writeEvents(HtmlWriter& html, std::span<const Event> events, const ReportTimes& times,
                 std::size_t mostBytes);
void writeCells(HtmlWriter& html, const CellHistory& history, const ReportTimes& times,
                std::size_t mostBytes);

// Texts that tables and the summary share.

/// "LTE 1300 (B3)"
std::string channelText(const SeenCell& cell);
/// "PCI 301"
std::string identityText(const SeenCell& cell);

} // namespace ventrik
