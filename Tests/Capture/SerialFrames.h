#pragma once

#include "Capture/HdlcFrames.h"
#include "Tests/Capture/ContainerReading.h"

namespace ventrik
{

// Frames of a serial stream.

inline constexpr std::uint8_t endMark = 0x7E;

inline Bytes escaped(const Bytes& bytes)
{
    Bytes result;
    for (const std::uint8_t byte : bytes) {
        if (byte == 0x7E || byte == 0x7D)
            result.push_back(0x7D);
        result.push_back(byte == 0x7E || byte == 0x7D ? byte ^ 0x20 : byte);
    }
    return result;
}

inline Bytes frame(const Bytes& content)
{
    const Bytes whole = ByteRow().bytes(content).number(2, frameChecksum(content));
    return ByteRow().bytes(escaped(whole)).number(1, endMark);
}

inline Bytes logContent(const Bytes& record)
{
    return ByteRow().number(2, 0x10).number(2, record.size()).bytes(record);
}

inline Bytes logFrame(const Bytes& record)
{
    return frame(logContent(record));
}

inline Bytes wrapped(std::uint32_t subscription, const Bytes& content)
{
    return ByteRow().number(4, 0x98).number(4, subscription).bytes(content);
}

} // namespace ventrik
