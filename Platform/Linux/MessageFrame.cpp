#include "Platform/Linux/MessageFrame.h"

#include <algorithm>
#include <utility>

namespace ventrik
{

namespace
{

void putU32(FrameHeaderBytes& bytes, std::size_t offset, std::uint32_t value)
{
    for (std::size_t i = 0; i < 4; ++i)
        bytes[offset + i] = static_cast<std::uint8_t>(value >> (8 * i));
}

std::uint32_t u32(std::span<const std::uint8_t, frameHeaderSize> bytes, std::size_t offset)
{
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < 4; ++i)
        value |= std::uint32_t{bytes[offset + i]} << (8 * i);
    return value;
}

bool makesSense(const FrameHeader& header, std::size_t maximumPayload)
{
    using namespace FrameFlag;
    switch (header.flags) {
    case 0:
    case wantsReply:
    case isReply:
        return header.length <= maximumPayload;
    case isReply | replyHasNoData:
        return header.length == 0;
    default:
        return false;
    }
}

} // namespace

FrameHeaderBytes encodeFrameHeader(const FrameHeader& header)
{
    FrameHeaderBytes bytes{};
    putU32(bytes, 0, header.length);
    putU32(bytes, 4, static_cast<std::uint32_t>(header.id));
    putU32(bytes, 8, header.flags);
    putU32(bytes, 12, header.serial);
    return bytes;
}

std::optional<FrameHeader> decodeFrameHeader(std::span<const std::uint8_t, frameHeaderSize> bytes,
                                             std::size_t maximumPayload)
{
    const FrameHeader header{u32(bytes, 0), static_cast<std::int32_t>(u32(bytes, 4)), u32(bytes, 8),
                             u32(bytes, 12)};
    return makesSense(header, maximumPayload) ? std::optional(header) : std::nullopt;
}

FrameReader::Status FrameReader::consume(ByteView& input)
{
    if (_headerCount < frameHeaderSize) {
        if (!consumeHeader(input))
            return Status::NeedsMore;
        const auto header = decodeFrameHeader(_headerBytes, _maximumPayload);
        if (!header)
            return Status::Malformed;
        _header = *header;
    }
    const auto count = std::min(input.size(), _header.length - _payload.size());
    _payload.insert(_payload.end(), input.begin(), input.begin() + std::ptrdiff_t(count));
    input = input.subspan(count);
    return _payload.size() == _header.length ? Status::HasFrame : Status::NeedsMore;
}

bool FrameReader::consumeHeader(ByteView& input)
{
    const auto count = std::min(input.size(), frameHeaderSize - _headerCount);
    std::copy_n(input.begin(), count, _headerBytes.begin() + std::ptrdiff_t(_headerCount));
    _headerCount += count;
    input = input.subspan(count);
    return _headerCount == frameHeaderSize;
}

Bytes FrameReader::takePayload()
{
    _headerCount = 0;
    return std::exchange(_payload, {});
}

} // namespace ventrik
