#pragma once

#include "PropertyList/PlistValue.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace ventrik
{

// A message on a port's stream: the header, then `length` bytes of data.
//   0 u32 length | 4 i32 id | 8 u32 flags | 12 u32 serial       (little-endian)

inline constexpr std::size_t frameHeaderSize = 16;
inline constexpr std::size_t frameMaximumPayload = std::size_t{64} << 20;
// No reply of the protocol is larger; whoever waits for one is held up by reading it.
inline constexpr std::size_t frameMaximumReply = std::size_t{64} << 10;

namespace FrameFlag
{
inline constexpr std::uint32_t wantsReply = 1;
inline constexpr std::uint32_t isReply = 2;
inline constexpr std::uint32_t replyHasNoData = 4;
} // namespace FrameFlag

struct FrameHeader {
    std::uint32_t length = 0;
    std::int32_t id = 0;
    std::uint32_t flags = 0;
    std::uint32_t serial = 0; ///< a reply carries its message's
    bool operator==(const FrameHeader&) const = default;
};

using FrameHeaderBytes = std::array<std::uint8_t, frameHeaderSize>;

FrameHeaderBytes encodeFrameHeader(const FrameHeader& header);
/// None for a length above the maximum and for flags that make no sense.
std::optional<FrameHeader> decodeFrameHeader(std::span<const std::uint8_t, frameHeaderSize> bytes,
                                             std::size_t maximumPayload = frameMaximumPayload);

/// Cuts a stream into frames. It holds only bytes that came in, whatever a header announces.
class FrameReader
{
  public:
    enum class Status { NeedsMore, HasFrame, Malformed };

    /// A frame with a larger payload is malformed, which shows at its header.
    explicit FrameReader(std::size_t maximumPayload = frameMaximumPayload)
        : _maximumPayload(maximumPayload)
    {
    }

    /// Takes bytes off the front of the input, to the end of one frame at most. Each frame must be
    /// taken (`header`, `takePayload`) before the next call; after `Malformed` no call may follow.
    Status consume(ByteView& input);

    /// The input ended within a frame.
    bool isWithinFrame() const { return _headerCount > 0; }
    const FrameHeader& header() const { return _header; }
    Bytes takePayload();

  private:
    bool consumeHeader(ByteView& input);

    std::size_t _maximumPayload;
    FrameHeaderBytes _headerBytes{};
    std::size_t _headerCount = 0;
    FrameHeader _header;
    Bytes _payload;
};

} // namespace ventrik
