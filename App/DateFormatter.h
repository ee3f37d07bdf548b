#pragma once

#include "Platform/Clock.h"

#include <QString>

#include <string>

namespace ventrik
{

/// Writes times as local time, the same in every language. The format is that of QDateTime: letters
/// stand for the parts of the time, what is quoted stands for itself.
class DateFormatter
{
  public:
    explicit DateFormatter(const Clock& clock) : _clock(clock) {}

    void setDateFormat(const QString& format) { _format = format; }
    std::string stringFromDate(Clock::TimePoint date) const;

  private:
    const Clock& _clock;
    QString _format;
};

} // namespace ventrik
