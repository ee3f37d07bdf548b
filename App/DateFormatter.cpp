#include "App/DateFormatter.h"

#include <QDateTime>
#include <QLocale>

namespace ventrik
{

std::string DateFormatter::stringFromDate(Clock::TimePoint date) const
{
    const auto sinceEpoch = std::chrono::floor<std::chrono::milliseconds>(date.time_since_epoch());
    const auto local = QDateTime::fromMSecsSinceEpoch(sinceEpoch.count(), Qt::OffsetFromUTC,
                                                      _clock.timeZone(date).secondsFromUtc);
    return QLocale::c().toString(local, _format).toStdString();
}

} // namespace ventrik
