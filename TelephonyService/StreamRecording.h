#pragma once

#include "Capture/CaptureRecorder.h"
#include "TelephonyService/LogChannel.h"

namespace ventrik
{

/// Records one log channel at a time, for the channels of a service tell the same story several
/// times: the one that streams first, and after its end the next one that streams.
class StreamRecording : public StreamObserver
{
  public:
    /// The recorder outlives this.
    explicit StreamRecording(CaptureRecorder& recorder) : _recorder(recorder) {}

    void messageStreams(const LogChannel& channel, ByteView message) override
    {
        if (!_channel)
            _channel = &channel;
        if (_channel == &channel)
            _recorder.record(message);
    }
    void streamEnds(const LogChannel& channel) override
    {
        if (_channel == &channel)
            _channel = nullptr;
    }

  private:
    CaptureRecorder& _recorder;
    const LogChannel* _channel = nullptr; // that is recorded
};

} // namespace ventrik
