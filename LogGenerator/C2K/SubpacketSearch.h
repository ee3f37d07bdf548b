#pragma once

#include "Packets/Subpackets.h"
#include "Platform/SystemLog.h"

#include <optional>
#include <span>

namespace ventrik
{

/// A kind of subpacket, and the first one of it with all of the packet behind it.
struct SoughtSubpacket {
    const Subpacket& kind;
    std::optional<LogPacket> found = {};
};

/// Finds the first subpacket of each kind, in one walk. A subpacket whose size leads too far ends
/// it, and is reported for each kind that was not found before.
void findSubpackets(const LogPacket& packet, std::span<SoughtSubpacket> sought, SystemLog& log);

/// The same for one kind.
std::optional<LogPacket> findSubpacket(const LogPacket& packet, const Subpacket& kind,
                                       SystemLog& log);

} // namespace ventrik
