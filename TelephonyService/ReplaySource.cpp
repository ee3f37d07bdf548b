#include "TelephonyService/ReplaySource.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

// Between the end of a capture and its next round.
constexpr std::chrono::milliseconds roundPause{50};
// A pause as long as this (ten years) is one that nobody waits for; it also keeps the sum in range.
constexpr double longestPauseInSeconds = 3.0e8;

std::chrono::nanoseconds scaledPause(std::chrono::nanoseconds pause, double speed)
{
    const double seconds = std::chrono::duration<double>(pause).count() / speed;
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
        std::chrono::duration<double>(std::clamp(seconds, 0.0, longestPauseInSeconds)));
}

} // namespace

std::unique_ptr<ReplaySource> ReplaySource::open(const ReplayOptions& options, std::string& error)
{
    auto reader = CaptureReader::open(options.capture, error);
    if (!reader)
        return nullptr;
    return std::unique_ptr<ReplaySource>(new ReplaySource(options, std::move(*reader)));
}

PlistDictionary ReplaySource::report() const
{
    PlistDictionary report{{"Capture", _options.capture}};
    PlistArray notes;
    for (const std::string& note : _reader.notes())
        notes.append(note);
    if (!notes.empty())
        report.set("Skipped", notes);
    if (const std::string error = _reader.error(); !error.empty())
        report.set("Damage", error);
    return report;
}

std::optional<TimedMessage> ReplaySource::next()
{
    auto message = _reader.next();
    if (!message && _options.loop && rewind())
        message = _reader.next();
    if (!message)
        return std::nullopt;
    // Times that run backward count as no pause.
    if (_last && _options.speed)
        _due += scaledPause(message->time - *_last, *_options.speed);
    _last = message->time;
    _gaveSomething = true;
    return TimedMessage{_due, Bytes(message->data.begin(), message->data.end())};
}

bool ReplaySource::rewind()
{
    std::string error;
    auto reader = _gaveSomething ? CaptureReader::open(_options.capture, error) : std::nullopt;
    if (!reader)
        return false;
    _reader = std::move(*reader);
    _last.reset();
    _gaveSomething = false;
    _due += roundPause;
    return true;
}

} // namespace ventrik
