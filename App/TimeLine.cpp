#include "App/TimeLine.h"

#include <algorithm>
#include <sstream>
#include <utility>

namespace ventrik
{

namespace
{

std::string pinsKey(const std::string& technology)
{
    return "Pins." + technology;
}

} // namespace

void TimeLine::pause()
{
    if (!_store.isEmpty() && !isPaused())
        showMoment(_store.present(), end());
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
        showMoment(_store.momentAt(time), std::clamp(time, _store.firstTime(), end()));
}

void TimeLine::showEvent(const Event& event)
{
    if (!_store.isEmpty())
        showMoment(event.moment, std::max(event.time, _store.firstTime()));
}

Clock::TimePoint TimeLine::end() const
{
    return _clock ? std::max(_store.lastTime(), _clock->now()) : _store.lastTime();
}

void TimeLine::showMoment(std::uint64_t moment, Clock::TimePoint time)
{
    // Nothing stands before the first change.
    const std::uint64_t shown =
        std::min(std::max(moment, _store.firstMoment() + 1), _store.present());
    if (!_past || _past->moment() != shown || _pausedAt != time)
        _past = std::make_unique<DisplayMoment>(_store, shown, time);
    _pausedAt = time;
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

std::vector<Event> TimeLine::update()
{
    usePins();
    _series.update();
    ++_version;
    _newest = nullptr;
    return _events.update();
}

// Those of the preferences, where there are any; a line each.
void TimeLine::usePins()
{
    const std::string_view technology = _store.technologyAt(_store.present());
    if (technology == _technology)
        return;
    _technology = technology;
    std::vector<Pin> pins = defaultPins(technology);
    if (const auto kept = _preferences.text(preferenceDomain, pinsKey(_technology))) {
        const std::vector<Pin> defaults = std::exchange(pins, {});
        std::istringstream lines(*kept);
        for (std::string path; std::getline(lines, path);) {
            const auto known = std::ranges::find(defaults, path, &Pin::path);
            pins.push_back(known == defaults.end() ? Pin::of(path) : *known);
        }
    }
    setPins(std::move(pins));
}

void TimeLine::setPins(std::vector<Pin> pins)
{
    _pins = std::move(pins);
    _series.setPins(_pins);
    ++_version;
}

void TimeLine::keepPins() const
{
    std::string lines;
    for (const Pin& pin : _pins)
        lines += pin.path + "\n";
    _preferences.setText(preferenceDomain, pinsKey(_technology), lines);
    _preferences.synchronize(preferenceDomain);
}

bool TimeLine::canPin(const std::string& path)
{
    const DisplayMoment::Value* value = shown().valueAt(path);
    return isPinned(path) ||
           (value && value->shown.number && _pins.size() < PinnedSeries::mostPins &&
            path.find('\n') == path.npos);
}

bool TimeLine::isPinned(const std::string& path) const
{
    return std::ranges::find(_pins, path, &Pin::path) != _pins.end();
}

void TimeLine::togglePin(const std::string& path)
{
    std::vector<Pin> pins = _pins;
    if (isPinned(path))
        std::erase_if(pins, [&](const Pin& pin) { return pin.path == path; });
    else if (canPin(path))
        pins.push_back(Pin::of(path));
    else
        return;
    setPins(std::move(pins));
    keepPins();
}

void TimeLine::resetPins()
{
    setPins(defaultPins(_technology));
    keepPins();
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
