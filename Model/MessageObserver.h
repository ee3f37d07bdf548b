#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Platform/Clock.h"
#include "PropertyList/PlistValue.h"

#include <string_view>

namespace ventrik
{

/// Is told of each message after it was decoded. All calls come on the main queue.
class MessageObserver
{
  public:
    virtual ~MessageObserver() = default;

    /// From now on messages are decoded by this generator, of the technology of that name on the
    /// command line; null: by none, and the one before is about to go.
    virtual void useGenerator(const LogGenerator* generator, std::string_view technology) = 0;
    /// The state is what the message has made of it.
    virtual void messageTaken(Clock::TimePoint time, ByteView message,
                              const PlistDictionary& state) = 0;
};

} // namespace ventrik
