#pragma once

#include "Platform/Clock.h"

#include <cstdint>
#include <string>

namespace ventrik
{

/// The times of a report, in one zone that it names. Days are told where there is more than one.
class ReportTimes
{
  public:
    ReportTimes(std::int32_t secondsFromUtc, Clock::TimePoint first, Clock::TimePoint last);

    std::int32_t secondsFromUtc() const { return _secondsFromUtc; }
    std::string zone() const;
    std::string withDate(Clock::TimePoint time) const; ///< "2026-11-22 14:03:27"
    std::string inTable(Clock::TimePoint time) const;  ///< "14:03:27.5"

  private:
    std::int32_t _secondsFromUtc;
    bool _hasDays;
};

} // namespace ventrik
