#include "LogGenerator/C2K/Subpackets.h"

namespace ventrik
{

std::optional<LogPacket> Subpackets::find(const LogPacket& packet, std::uint8_t identifier,
                                          SystemLog& log)
{
    constexpr std::size_t firstStart = 17;
    // The limit lies as far behind the packet's end as the first subpacket behind its start.
    const std::size_t limit = firstStart + packet.size();
    const std::size_t count = packet.u8(14);

    std::size_t start = firstStart;
    for (std::size_t i = 0; i < count; ++i) {
        const std::size_t size = packet.u16(start + 2);
        if (start + size >= limit) {
            log.error("Log code error in subpkt#{}: bad size ({}).", i, size);
            return std::nullopt;
        }
        if (packet.u8(start) == identifier)
            return packet.from(start);
        start += size;
    }
    return std::nullopt;
}

} // namespace ventrik
