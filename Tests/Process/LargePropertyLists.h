#pragma once

#include "Packets/PacketBuilder.h"
#include "Tests/PropertyList/BinaryPlistBuilder.h"

#include <algorithm>

namespace ventrik
{

// Small messages whose property lists stand for much: what is shared stands in them once.

/// A packet of PDP contexts.
inline Bytes pdpMessage(const Bytes& propertyList)
{
    return PacketBuilder(0xFF0002).bytes(13, propertyList).build();
}

/// The object of an array of that many references to one object, or of an ASCII text.
inline Bytes arrayOf(std::uint32_t count, std::uint8_t object)
{
    return joined({{0xAF, 0x12}, bigEndianBytes(count, 4), Bytes(count, object)});
}
inline Bytes text(std::uint32_t length, char character)
{
    return joined({{0x5F, 0x12},
                   bigEndianBytes(length, 4),
                   Bytes(length, static_cast<std::uint8_t>(character))});
}

/// 100 MB of text in 101 kB.
inline Bytes oneTextManyTimes()
{
    return BinaryPlistBuilder().object(arrayOf(100'000, 1)).object(text(1000, 't')).build();
}

/// One row with a key of 100,000 characters, under which 50,000 values stand: 150 kB.
inline Bytes longNameOverManyValues()
{
    return BinaryPlistBuilder()
        .object({0xA1, 0x01})
        .object({0xD1, 0x02, 0x03})
        .object(text(100'000, 'n'))
        .object(arrayOf(50'000, 4))
        .object({0x51, 'v'})
        .build();
}

} // namespace ventrik
