#include "Report/ReportTimes.h"

#include "Charts/ChartTexts.h"

namespace ventrik
{

ReportTimes::ReportTimes(std::int32_t secondsFromUtc, Clock::TimePoint first, Clock::TimePoint last)
    : _secondsFromUtc(secondsFromUtc),
      _hasDays(dateText(first, secondsFromUtc) != dateText(last, secondsFromUtc))
{
}

std::string ReportTimes::zone() const
{
    return zoneText(_secondsFromUtc);
}

std::string ReportTimes::withDate(Clock::TimePoint time) const
{
    return dateText(time, _secondsFromUtc) + " " + timeText(time, _secondsFromUtc);
}

std::string ReportTimes::inTable(Clock::TimePoint time) const
{
    const std::string exact = exactTimeText(time, _secondsFromUtc);
    return _hasDays ? dateText(time, _secondsFromUtc) + " " + exact : exact;
}

} // namespace ventrik
