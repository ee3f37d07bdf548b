#include "Tools/OfflineDecoder.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr std::chrono::nanoseconds tickInterval = std::chrono::seconds(2);

} // namespace

void OfflineDecoder::take(const CapturedMessage& message)
{
    if (_history == History::Kept)
        runTicksUntil(message.time);
    _clock.set(message.time);
    _generator.updateState(_state, message.data);
    _updated = true;
}

void OfflineDecoder::runTicksUntil(Clock::TimePoint time)
{
    if (!_nextTick) {
        _nextTick = time + tickInterval;
    } else if (time < _lastTime - tickInterval) {
        generate();
        _nextTick = time + tickInterval;
    } else {
        runTicksBefore(time);
    }
    _lastTime = time;
}

void OfflineDecoder::runTicksBefore(Clock::TimePoint time)
{
    if (*_nextTick >= time)
        return;
    _clock.set(*_nextTick);
    generate();
    // Only the first tick after a message finds something new; the others in a gap are passed over.
    const auto passed =
        (time - *_nextTick + tickInterval - std::chrono::nanoseconds(1)) / tickInterval;
    *_nextTick += passed * tickInterval;
}

void OfflineDecoder::generate()
{
    if (_updated)
        _generator.generateLogUsingState(_state);
    _updated = false;
}

void OfflineDecoder::finish()
{
    generate();
}

} // namespace ventrik
