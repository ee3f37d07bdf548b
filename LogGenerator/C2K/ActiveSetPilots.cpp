#include "LogGenerator/C2K/ActiveSetPilots.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "Packets/C2KRecords.h"

#include <utility>

namespace ventrik
{

void decodeActiveSetPilots(const LogPacket& packet, const C2KOutput& output)
{
    const RecordElements elements = C2KRecords::activeSetPilotList.elementsOf(packet);
    if (elements.completeIn(packet) < elements.count) {
        output.log().error("Log code 0x12b6 is {} bytes long, but has {} substructs.",
                           packet.size(), elements.count);
        return;
    }
    std::vector<ShownPilot> pilots;
    pilots.reserve(elements.count);
    for (std::size_t i = 0; i < elements.count; ++i) {
        const LogPacket pilot = elements.element(packet, i);
        pilots.push_back(shownPilot(i, pilot, C2KRecords::pilotPNOffset, C2KRecords::pilotLevel));
    }
    output.publish(C2KRecords::activeSetPilotGroup, std::move(pilots), "(none)");
}

} // namespace ventrik
