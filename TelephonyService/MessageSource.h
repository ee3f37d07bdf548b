#pragma once

#include "Packets/WantedCodes.h"
#include "PropertyList/PlistValue.h"

#include <chrono>
#include <functional>
#include <memory>
#include <optional>

namespace ventrik
{

/// One message for the log channel.
struct TimedMessage {
    std::chrono::nanoseconds due{}; ///< counted from the start of the streaming
    Bytes data;
};

/// Where a log channel's messages come from. Each channel has a source of its own while it streams.
///
/// A scenario and a capture are pulled, so that every viewer sees the whole story from its start; a
/// device pushes what it measures, to all channels that want it.
class MessageSource
{
  public:
    /// Takes a message that is pushed; it lives as long as the call.
    using Receiver = std::function<void(ByteView message)>;

    /// The streaming stops: nothing is wanted and nothing is pushed any more.
    virtual ~MessageSource() = default;

    /// The streaming starts, before anything is pulled. Messages of other codes may come as well.
    /// A source that is pushed hands its messages to the receiver, never within this call.
    virtual void start(const WantedCodes& /*wanted*/, Receiver /*receiver*/) {}
    /// The next message, in order of the due times; none when there are no more to be pulled.
    virtual std::optional<TimedMessage> next() = 0;
    /// Messages come at their due times, and a receiver that does not keep up loses the oldest. A
    /// source without pace gives as much as the receiver takes, and nothing is lost.
    virtual bool isPaced() const { return true; }
    /// What is to be told of where the messages come from, as rows of a display.
    virtual PlistDictionary report() const { return {}; }
};

} // namespace ventrik
