#include "LogGenerator/C2K/EVDOStatus.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "Packets/C2KRecords.h"

namespace ventrik
{

void decodeEVDOStatus(const LogPacket& packet, const C2KOutput& output)
{
    constexpr std::int64_t accessState = 4;
    output.publish(C2KRecords::evdoStatusFields, packet);
    // Before the access state only the first chain receives, and nothing is sent.
    const bool isActive = numberOf(packet, C2KRecords::evdoDeviceState) >= accessState;
    if (isActive)
        return output.publish(C2KRecords::evdoActiveFields, packet);
    output.publish(std::span(C2KRecords::evdoActiveFields), "N/A");
}

} // namespace ventrik
