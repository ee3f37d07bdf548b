#pragma once

#include "Packets/Record.h"

#include <vector>

namespace ventrik
{

// A record of subpackets, at least 17 bytes
//   14 u8 number of subpackets | 17 the first one, the others right behind it
// Subpacket
//   0 u8 identifier | 1 u8 version | 2 u16 size, these bytes included
namespace Subpackets
{
inline constexpr std::size_t minimumSize = 17;
inline constexpr Place count = u8(14);
inline constexpr std::size_t first = 17;
inline constexpr Place identifier = u8(0);
inline constexpr Place version = u8(1);
inline constexpr Place size = u16(2);
inline constexpr std::size_t headSize = 4;
} // namespace Subpackets

/// A kind of subpacket; the places of its fields count from its own first byte.
struct Subpacket {
    std::uint8_t identifier;
    std::span<const Field> fields = {};
};

/// A subpacket in a packet: its own bytes only.
struct PlacedSubpacket {
    LogPacket bytes;
    std::size_t start; ///< in the packet
    std::uint8_t version;
};

/// The subpackets of that identifier, up to the first of any kind that is none or is cut.
std::vector<PlacedSubpacket> subpacketsOf(const LogPacket& packet, std::uint8_t identifier);

} // namespace ventrik
