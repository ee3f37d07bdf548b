#include "LogGenerator/C2K/FingerC2I.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "Packets/C2KRecords.h"

#include <utility>

namespace ventrik
{

void decodeFingerC2I(const LogPacket& packet, const C2KOutput& output)
{
    const RecordElements elements = C2KRecords::fingers.elementsOf(packet);
    if (packet.size() != elements.offset + elements.stride * elements.count) {
        output.log().error(
            "Log code 0x108a has bad length of {} bytes, but has {} substructs (size={}).",
            packet.size(), elements.count, elements.offset);
        return;
    }
    std::vector<ShownPilot> pilots;
    pilots.reserve(elements.count);
    for (std::size_t i = 0; i < elements.count; ++i) {
        const LogPacket finger = elements.element(packet, i);
        if (numberOf(finger, C2KRecords::fingerPNOffset) != C2KRecords::unassignedFinger)
            pilots.push_back(
                shownPilot(i, finger, C2KRecords::fingerPNOffset, C2KRecords::fingerRatio));
    }
    output.publish(C2KRecords::fingerGroup, std::move(pilots), "(none)");
}

} // namespace ventrik
