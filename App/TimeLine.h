#pragma once

#include "Model/ChangeStore.h"
#include "Model/DisplayMoment.h"
#include "Model/EventLog.h"
#include "Model/PinnedSeries.h"
#include "Platform/Clock.h"
#include "Platform/Preferences.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// Which moment the screens show: the present, or one of the past while data run on. It follows a
/// store; whoever shows something asks it for the display as it stands at that moment.
class TimeLine
{
  public:
    /// All outlive it. Without a clock the last change is the end, as in a capture.
    TimeLine(const ChangeStore& store, Preferences& preferences, const Clock* clock,
             std::vector<ValueAlert> alerts = {})
        : _store(store),
          _preferences(preferences),
          _clock(clock),
          _series(store),
          _events(store, std::move(alerts))
    {
    }

    /// Called when another moment is to be shown.
    void setCallback(std::function<void()> momentChanged)
    {
        _momentChanged = std::move(momentChanged);
    }

    bool isPaused() const { return _past != nullptr; }
    /// At the present; does nothing where there is nothing to show, or while it is paused.
    void pause();
    void togglePause();
    void showTime(Clock::TimePoint time);
    /// After what happened there; of what the store holds no more the oldest moment.
    void showEvent(const Event& event);
    void goLive();
    /// What is shown while it is paused; null otherwise.
    DisplayMoment* past() const { return _past.get(); }
    /// The moment to which the user has gone, which may lie between two changes.
    std::optional<Clock::TimePoint> pausedAt() const { return _pausedAt; }
    /// The present, also where nothing comes.
    Clock::TimePoint end() const;

    /// Takes what is new in the store, and tells what happened.
    std::vector<Event> update();
    /// Another number when series or events may be others.
    std::uint64_t version() const { return _version; }
    /// The display as it is shown: that of the pause, or as it was at the last update.
    DisplayMoment& shown();
    const ChangeStore& store() const { return _store; }
    const PinnedSeries& series() const { return _series; }
    const EventLog& events() const { return _events; }

    /// Whether a number stands at a path that can be drawn over time.
    bool canPin(const std::string& path);
    bool isPinned(const std::string& path) const;
    /// Draws the value there from now on, or no more. Kept as a preference of the technology.
    void togglePin(const std::string& path);
    const std::vector<Pin>& pins() const { return _pins; }
    /// Draws what is drawn from the start.
    void resetPins();

  private:
    void showMoment(std::uint64_t moment, Clock::TimePoint time);

    void usePins();
    void setPins(std::vector<Pin> pins);
    void keepPins() const;

    const ChangeStore& _store;
    Preferences& _preferences;
    const Clock* _clock;
    PinnedSeries _series;
    EventLog _events;
    std::vector<Pin> _pins;
    std::uint64_t _version = 0;
    std::string _technology; // whose pins these are
    std::function<void()> _momentChanged;
    std::unique_ptr<DisplayMoment> _past;
    std::unique_ptr<DisplayMoment> _newest; // made when it is asked for
    std::optional<Clock::TimePoint> _pausedAt;
};

} // namespace ventrik
