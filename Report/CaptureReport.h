#pragma once

#include "Model/ChangeStore.h"
#include "Packets/WantedCodes.h"
#include "Platform/Technology.h"
#include "Report/CellHistory.h"
#include "Report/ReportSummary.h"

#include <string>

namespace ventrik
{

/// A capture as one page to hand on: a summary, charts, events, cells and the values at the end.
/// The page stands by itself: it loads nothing, has no scripts, and is XML as well.
class CaptureReport
{
  public:
    /// The generator outlives it.
    CaptureReport(const LogGenerator& generator, const Technology& technology, RecordsMode records);

    /// After a message was decoded.
    void take(Clock::TimePoint time, ByteView message, const PlistDictionary& state);

    /// Of what came so far. What is told above of records and the technology need not be given.
    std::string page(ReportFacts facts) const;

    /// The time from which the page tells; none without values.
    std::optional<Clock::TimePoint> firstTime() const;

  private:
    ReportRange range() const;

    const LogGenerator& _generator;
    Technology _technology;
    WantedCodes _wanted;
    ChangeStore _store;
    CellHistory _cells{_store};
    std::size_t _recordCount = 0;
    std::size_t _decodedCount = 0;
};

} // namespace ventrik
