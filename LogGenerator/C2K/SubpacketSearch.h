#pragma once

#include "Packets/Subpackets.h"
#include "Platform/SystemLog.h"

#include <optional>

namespace ventrik
{

/// The first subpacket of that kind, with all of the packet behind it. One whose size leads too far
/// is reported and ends the search.
std::optional<LogPacket> findSubpacket(const LogPacket& packet, const Subpacket& kind,
                                       SystemLog& log);

} // namespace ventrik
