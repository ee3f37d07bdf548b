#include "App/CaptureReading.h"

#include <chrono>
#include <utility>

namespace ventrik
{

namespace
{

constexpr std::chrono::milliseconds updateInterval{500};

} // namespace

CaptureReading::CaptureReading(std::shared_ptr<OpenedSource> source, const Platform& platform,
                               ChangeStore& store, TimeLine& timeLine)
    : _source(std::move(source)),
      _platform(platform),
      _store(store),
      _timeLine(timeLine),
      _times(platform.clock)
{
    _times.setDateFormat(QStringLiteral("yyyy-MM-dd HH:mm:ss"));
}

void CaptureReading::start(std::function<void()> progressed)
{
    _progressed = std::move(progressed);
    _source->setObserver(_store);
    _isReading = true;
    readOnLater();
}

void CaptureReading::readOnLater()
{
    _platform.mainQueue.async([this, life = std::weak_ptr(_life)] {
        if (!life.expired())
            readOn();
    });
}

void CaptureReading::readOn()
{
    _isReading = _source->readOn();
    if (_isReading)
        readOnLater();
    const Clock::TimePoint now = _platform.clock.now();
    if (_isReading && _lastUpdate && now - *_lastUpdate < updateInterval)
        return;
    _lastUpdate = now;
    _timeLine.update();
    if (_timeLine.pausedAt() == _shownEnd)
        showEnd();
    _progressed();
}

void CaptureReading::showEnd()
{
    _timeLine.showTime(_store.lastTime());
    _shownEnd = _timeLine.pausedAt();
}

std::string CaptureReading::status() const
{
    if (_isReading)
        return "Reading " + name() + ": " + _source->progress();
    if (!_timeLine.pausedAt())
        return name();
    return name() + " at " + _times.stringFromDate(*_timeLine.pausedAt());
}

std::string CaptureReading::note() const
{
    if (_isReading)
        return {};
    std::string note = _source->fault();
    if (_store.firstMoment() > 0) {
        note += note.empty() ? "" : "; ";
        note += "what was before " + _times.stringFromDate(_store.firstTime()) +
                " is gone: --history keeps more";
    }
    return note;
}

} // namespace ventrik
