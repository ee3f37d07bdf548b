#include "LogGenerator/C2K/SubpacketSearch.h"

namespace ventrik
{

void findSubpackets(const LogPacket& packet, std::span<SoughtSubpacket> sought, SystemLog& log)
{
    // The limit lies as far behind the packet's end as the first subpacket behind its start.
    const std::size_t limit = Subpackets::first + packet.size();
    const std::int64_t count = numberAt(packet, Subpackets::count);

    std::size_t missing = sought.size();
    std::size_t start = Subpackets::first;
    for (std::int64_t i = 0; i < count && missing > 0; ++i) {
        const auto size = static_cast<std::size_t>(numberAt(packet, Subpackets::size, start));
        if (start + size >= limit) {
            for (; missing > 0; --missing)
                log.error("Log code error in subpkt#{}: bad size ({}).", i, size);
            return;
        }
        const std::int64_t identifier = numberAt(packet, Subpackets::identifier, start);
        for (auto& [kind, found] : sought) {
            if (kind.identifier != identifier || found)
                continue;
            found = packet.from(start);
            --missing;
        }
        start += size;
    }
}

std::optional<LogPacket> findSubpacket(const LogPacket& packet, const Subpacket& kind,
                                       SystemLog& log)
{
    SoughtSubpacket sought{kind};
    findSubpackets(packet, {&sought, 1}, log);
    return sought.found;
}

} // namespace ventrik
