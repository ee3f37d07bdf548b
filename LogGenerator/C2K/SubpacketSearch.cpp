#include "LogGenerator/C2K/SubpacketSearch.h"

namespace ventrik
{

std::optional<LogPacket> findSubpacket(const LogPacket& packet, const Subpacket& kind,
                                       SystemLog& log)
{
    // The limit lies as far behind the packet's end as the first subpacket behind its start.
    const std::size_t limit = Subpackets::first + packet.size();
    const std::int64_t count = numberAt(packet, Subpackets::count);

    std::size_t start = Subpackets::first;
    for (std::int64_t i = 0; i < count; ++i) {
        const LogPacket subpacket = packet.from(start);
        const auto size = static_cast<std::size_t>(numberAt(subpacket, Subpackets::size));
        if (start + size >= limit) {
            log.error("Log code error in subpkt#{}: bad size ({}).", i, size);
            return std::nullopt;
        }
        if (numberAt(subpacket, Subpackets::identifier) == kind.identifier)
            return subpacket;
        start += size;
    }
    return std::nullopt;
}

} // namespace ventrik
