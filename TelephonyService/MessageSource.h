#pragma once

#include "PropertyList/PlistValue.h"

#include <chrono>
#include <memory>
#include <optional>

namespace ventrik
{

/// One message for the log channel.
struct TimedMessage {
    std::chrono::nanoseconds due{}; ///< counted from the start of the streaming
    Bytes data;
};

/// Where a log channel's messages come from: a scenario or a capture. Each channel has its own, so
/// that every viewer sees the whole story from its start.
class MessageSource
{
  public:
    virtual ~MessageSource() = default;

    /// The next message, in order of the due times; none when there are no more.
    virtual std::optional<TimedMessage> next() = 0;
    /// Messages come at their due times, and a receiver that does not keep up loses the oldest. A
    /// source without pace gives as much as the receiver takes, and nothing is lost.
    virtual bool isPaced() const { return true; }
};

} // namespace ventrik
