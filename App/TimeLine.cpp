#include "App/TimeLine.h"

#include <algorithm>

namespace ventrik
{

void TimeLine::pause()
{
    if (!_store.isEmpty() && !isPaused())
        showMoment(_store.present(), _store.lastTime());
}

void TimeLine::togglePause()
{
    if (isPaused())
        goLive();
    else
        pause();
}

void TimeLine::showTime(Clock::TimePoint time)
{
    if (!_store.isEmpty())
        showMoment(_store.momentAt(time), std::clamp(time, _store.firstTime(), _store.lastTime()));
}

void TimeLine::showMoment(std::uint64_t moment, Clock::TimePoint time)
{
    // Nothing stands before the first change.
    const std::uint64_t shown = std::max(moment, _store.firstMoment() + 1);
    _pausedAt = time;
    if (!_past || _past->moment() != shown)
        _past = std::make_unique<DisplayMoment>(_store, shown);
    if (_momentChanged)
        _momentChanged();
}

void TimeLine::goLive()
{
    if (!isPaused())
        return;
    _past = nullptr;
    _pausedAt.reset();
    if (_momentChanged)
        _momentChanged();
}

void TimeLine::update()
{
    _series.update();
    _newest = nullptr;
}

DisplayMoment& TimeLine::shown()
{
    if (_past)
        return *_past;
    if (!_newest)
        _newest = std::make_unique<DisplayMoment>(_store, _store.present());
    return *_newest;
}

} // namespace ventrik
