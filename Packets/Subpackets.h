#pragma once

#include "Packets/Record.h"

namespace ventrik
{

// A record of subpackets, at least 17 bytes
//   14 u8 number of subpackets | 17 the first one, the others right behind it
// Subpacket
//   0 u8 identifier | 2 u16 size, these bytes included
namespace Subpackets
{
inline constexpr std::size_t minimumSize = 17;
inline constexpr Place count = u8(14);
inline constexpr std::size_t first = 17;
inline constexpr Place identifier = u8(0);
inline constexpr Place size = u16(2);
} // namespace Subpackets

/// A kind of subpacket; the places of its fields count from its own first byte.
struct Subpacket {
    std::uint8_t identifier;
    std::span<const Field> fields = {};
};

} // namespace ventrik
