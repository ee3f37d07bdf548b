#pragma once

#include "Capture/CaptureReader.h"
#include "TelephonyService/MessageSource.h"

#include <optional>
#include <string>

namespace ventrik
{

struct ReplayOptions {
    std::string capture;
    std::optional<double> speed = 1.0; ///< greater than 0; none: as fast as the receiver takes
    bool loop = false;
};

/// Replays a capture with the pauses it was recorded with, divided by the speed. It is read as it
/// goes, so a long capture takes no memory.
class ReplaySource : public MessageSource
{
  public:
    /// None when the capture cannot be read; `error` then says why.
    static std::unique_ptr<ReplaySource> open(const ReplayOptions& options, std::string& error);

    std::optional<TimedMessage> next() override;
    bool isPaced() const override { return _options.speed.has_value(); }
    PlistDictionary report() const override;

  private:
    ReplaySource(ReplayOptions options, CaptureReader reader)
        : _options(std::move(options)), _reader(std::move(reader))
    {
    }

    bool rewind();

    ReplayOptions _options;
    CaptureReader _reader;
    std::optional<Clock::TimePoint> _last;
    std::chrono::nanoseconds _due{};
    bool _gaveSomething = false;
};

} // namespace ventrik
