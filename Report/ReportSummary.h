#pragma once

#include "Report/CellHistory.h"
#include "Report/HtmlWriter.h"
#include "Report/ReportTimes.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What a report tells of a capture beside its display.
struct ReportFacts {
    std::string capture = {};
    std::string technology = {}; ///< for people
    std::size_t recordCount = 0;
    std::size_t decodedCount = 0;
    std::vector<std::string> notes = {}; ///< what is to be said about the capture, such as damage
    std::int32_t secondsFromUtc = 0;     ///< of the zone that times are told in
    std::string program = {};            ///< with its version
};

/// When the display showed something, and from when on that is known.
struct ReportRange {
    Clock::TimePoint first;
    Clock::TimePoint last;
    bool hasValues = true;
    bool isWhole = true; ///< false: what came before went, for there was too much
};

/// The title and what there is in one look: the capture, and for how long which cells served.
void writeSummary(HtmlWriter& html, const ReportFacts& facts, const ReportRange& range,
                  const ReportTimes& times, const CellHistory& history);

} // namespace ventrik
