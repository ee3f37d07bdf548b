#include "Packets/Subpackets.h"

namespace ventrik
{

std::vector<PlacedSubpacket> subpacketsOf(const LogPacket& packet, std::uint8_t identifier)
{
    std::vector<PlacedSubpacket> found;
    std::size_t start = Subpackets::first;
    for (std::int64_t left = numberAt(packet, Subpackets::count); left > 0; --left) {
        const LogPacket rest = packet.from(start);
        const auto size = static_cast<std::size_t>(numberAt(rest, Subpackets::size));
        if (size < Subpackets::headSize || size > rest.size())
            break;
        if (numberAt(rest, Subpackets::identifier) == identifier)
            found.push_back({LogPacket(rest.bytes().first(size)), start,
                             static_cast<std::uint8_t>(numberAt(rest, Subpackets::version))});
        start += size;
    }
    return found;
}

} // namespace ventrik
