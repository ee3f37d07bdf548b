#pragma once

#include "Packets/LogPacket.h"
#include "Platform/SystemLog.h"

#include <optional>

namespace ventrik
{

// A record of subpackets, at least 17 bytes
//   14 u8 number of subpackets | 17 the first one, the others right behind it
// Subpacket
//   0 u8 identifier | 2 u16 size, these bytes included
namespace Subpackets
{
inline constexpr std::size_t minimumSize = 17;

/// The first subpacket of that identifier, with all of the packet behind it. One whose size leads
/// too far is reported and ends the search.
std::optional<LogPacket> find(const LogPacket& packet, std::uint8_t identifier, SystemLog& log);
} // namespace Subpackets

} // namespace ventrik
