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
    if (!_nextTick) {
        _nextTick = message.time + tickInterval;
    } else if (message.time < _lastTime - tickInterval) {
        generate();
        _nextTick = message.time + tickInterval;
    } else {
        runTicksBefore(message.time);
    }
    _lastTime = message.time;
    _clock.set(message.time);
    _generator.updateState(_state, message.data);
    _updated = true;
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
