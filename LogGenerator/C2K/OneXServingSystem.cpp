#include "LogGenerator/C2K/OneXServingSystem.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "Packets/C2KRecords.h"

#include <fmt/format.h>

namespace ventrik
{

void decodeOneXServingSystem(const LogPacket& packet, const C2KOutput& output)
{
    constexpr std::int64_t lowestVersion = 2;
    constexpr std::int64_t typeWithIdentity = 2;
    const std::int64_t version = numberOf(packet, C2KRecords::servingSystemVersion);
    if (version < lowestVersion) {
        output.log().error(
            "Log code 0x134f has version={}; only version 2 or higher expected; dropping.",
            version);
        return;
    }
    output.publish(C2KRecords::roamingFields, packet);
    const std::int64_t type = numberOf(packet, C2KRecords::systemType);
    for (const Field& field : C2KRecords::systemNumberFields) {
        if (type == typeWithIdentity)
            output.publish(field, packet);
        else
            output.publish(field, fmt::format("(unknown system type {})", type));
    }
    output.publish(C2KRecords::packetZone, packet);
    if (packet.size() >= C2KRecords::sizeWithBaseStation)
        output.publish(C2KRecords::baseStation, packet);
    output.publish(C2KRecords::protocolRevision, packet);
}

} // namespace ventrik
