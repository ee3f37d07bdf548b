#pragma once

#include "TelephonyService/MessageSource.h"

#include <deque>

namespace ventrik
{

/// A source that gives what the test lists.
class ListSource : public MessageSource
{
  public:
    explicit ListSource(std::deque<TimedMessage> messages, bool isPaced = true)
        : _messages(std::move(messages)), _isPaced(isPaced)
    {
    }

    std::optional<TimedMessage> next() override
    {
        if (_messages.empty())
            return std::nullopt;
        TimedMessage message = std::move(_messages.front());
        _messages.pop_front();
        return message;
    }
    bool isPaced() const override { return _isPaced; }

  private:
    std::deque<TimedMessage> _messages;
    bool _isPaced;
};

} // namespace ventrik
