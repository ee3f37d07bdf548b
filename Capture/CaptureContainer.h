#pragma once

#include "Platform/Clock.h"
#include "PropertyList/Bytes.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// One message of the log channel, as it was captured.
struct CapturedMessage {
    Clock::TimePoint time;
    ByteView data; ///< lives until the next one is read
    /// Of the phone's two, where the container tells it.
    std::optional<std::uint32_t> subscription = {};
};

/// A kind of file that messages are kept in, read one after the other in constant memory.
///
/// Damage that can be skipped is skipped, counted and told in the notes, a line for each kind.
class CaptureContainer
{
  public:
    virtual ~CaptureContainer() = default;

    /// None at the end, and at damage that nothing can be read behind.
    virtual std::optional<CapturedMessage> next() = 0;
    /// Why the reading ended before the end, in one line that says where and what; empty when it
    /// did not.
    virtual std::string error() const { return {}; }
    /// Of the damage in the file, uncompressed, where that is known.
    virtual std::optional<std::uint64_t> errorOffset() const { return std::nullopt; }
    /// What was skipped so far.
    virtual std::vector<std::string> notes() const { return {}; }
    /// A pcap capture's link type, which names the technology.
    virtual std::optional<int> linkType() const { return std::nullopt; }
};

/// When a packet was logged: its 64-bit timestamp counts, in its upper 48 bits, units of 1.25 ms
/// since 1980-01-06 00:00 UTC. None where that cannot be counted, beyond the year 2255.
std::optional<Clock::TimePoint> timeOfTimestamp(std::uint64_t timestamp);

} // namespace ventrik
