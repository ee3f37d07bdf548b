#include "App/Strip/StripRange.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

void StripRange::setExtent(Clock::TimePoint first, Clock::TimePoint last)
{
    _extentFirst = first;
    _extentLast = std::max(first, last);
    if (_fits)
        fitNow();
    else if (_isFollowing)
        followNow();
    else
        settle();
}

void StripRange::followNow()
{
    _last = _extentLast;
    if (_grows)
        _length = std::clamp<Duration>(_extentLast - _extentFirst, shortestAtFirst, longestAtFirst);
}

void StripRange::setExtent(Clock::TimePoint first, Clock::TimePoint last, Clock::TimePoint kept)
{
    const bool wasInView = kept >= this->first() && kept <= _last;
    setExtent(first, last);
    if (!_isFollowing || _fits || !wasInView || kept >= this->first())
        return;
    _last = kept + _length;
    _isFollowing = false;
}

// At the newest it follows; older than the oldest there is nothing to show.
void StripRange::settle()
{
    _fits = false;
    _last = std::min(std::max(_last, _extentFirst + _length), _extentLast);
    _isFollowing = _last == _extentLast;
}

void StripRange::pan(Duration by)
{
    _last += std::clamp<Duration>(by, -longest, longest);
    settle();
}

void StripRange::moveTo(Clock::TimePoint first)
{
    _last = first + _length;
    settle();
}

void StripRange::zoom(double factor, Clock::TimePoint around)
{
    const double wanted = static_cast<double>(_length.count()) * factor;
    const double length = std::clamp(wanted, static_cast<double>(shortest.count()),
                                     static_cast<double>(longest.count()));
    if (!std::isfinite(length))
        return;
    _grows = false;
    const auto before = std::clamp(around, first(), _last);
    const double share =
        static_cast<double>((_last - before).count()) / static_cast<double>(_length.count());
    _length = Duration(static_cast<Duration::rep>(length));
    _last = before + Duration(static_cast<Duration::rep>(share * length));
    settle();
}

void StripRange::fit()
{
    _fits = true;
    _grows = false;
    _isFollowing = true;
    fitNow();
}

void StripRange::fitNow()
{
    _length = std::clamp<Duration>(_extentLast - _extentFirst, shortest, longest);
    _last = _extentLast;
}

void StripRange::follow()
{
    _fits = false;
    _isFollowing = true;
    followNow();
}

void StripRange::reveal(Clock::TimePoint time)
{
    if (time >= first() && time <= _last)
        return;
    const Duration margin = _length / 10;
    moveTo(time < first() ? time - margin : time + margin - _length);
}

} // namespace ventrik
