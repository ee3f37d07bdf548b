#pragma once

#include "Capture/CaptureReader.h"
#include "LogGenerator/Core/LogGenerator.h"
#include "LogGenerator/Core/StateKeys.h"

#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

/// The clock of a capture: time is where the decoder has come to in it.
class CaptureClock : public Clock
{
  public:
    explicit CaptureClock(const Clock& zones) : _zones(zones) {}

    TimePoint now() const override { return _now; }
    TimeZone timeZone(TimePoint time) const override { return _zones.timeZone(time); }
    void set(TimePoint time) { _now = time; }

  private:
    const Clock& _zones;
    TimePoint _now;
};

/// Runs captured messages through a generator as the viewer would have at that time: a display is
/// generated at every tick of 2 seconds from the first message on, when something arrived since the
/// last one. A message at a tick's time still belongs to it. Where times run back by more than a
/// tick, one passes there and then, and ticks are counted from the message on. Where nobody wants
/// the history, which is all that the ticks make, a display is generated at the end alone.
class OfflineDecoder
{
  public:
    enum class History { Kept, NotWanted };

    OfflineDecoder(LogGenerator& generator, CaptureClock& clock, History history = History::Kept)
        : _generator(generator), _clock(clock), _history(history)
    {
    }

    void take(const CapturedMessage& message);
    /// After the last message: generates once more if something arrived since the last tick.
    void finish();

    /// The display as it stands; null while the generator has none.
    const PlistValue* display() const { return _state.find(StateKey::display); }
    const PlistDictionary& state() const { return _state; }
    const LogGenerator& generator() const { return _generator; }
    /// How the records of all sections were read, the last one of each code.
    std::vector<ReadLayout> layouts() const { return _generator.layouts(); }
    std::string displayFault() const { return _generator.displayFault(); }
    PlistValue saveContents() const { return _generator.getSaveContentsFromState(_state); }

  private:
    void runTicksUntil(Clock::TimePoint time);
    void runTicksBefore(Clock::TimePoint time);
    void generate();

    LogGenerator& _generator;
    CaptureClock& _clock;
    History _history;
    PlistDictionary _state;
    Clock::TimePoint _lastTime; // of the last message
    std::optional<Clock::TimePoint> _nextTick;
    bool _updated = false;
};

} // namespace ventrik
