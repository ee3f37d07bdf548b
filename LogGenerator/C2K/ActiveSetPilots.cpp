#include "LogGenerator/C2K/ActiveSetPilots.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/PilotGroup.h"
#include "Packets/LogPacket.h"

namespace ventrik
{

namespace
{

constexpr std::size_t headerSize = 25;
constexpr std::size_t pilotSize = 12;

} // namespace

// Active-set pilot strengths, 0x12B6, at least 25 bytes
//   15 u8 number of pilots | 25 pilots of 12 bytes: 0 u16 PN offset, 2 u16 strength (1/512)
void decodeActiveSetPilots(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() < headerSize) {
        output.log().error("Log code 0x12b6 is {} bytes long but must be at least {} bytes.",
                           packet.size(), headerSize);
        return;
    }
    const RecordElements pilots{headerSize, pilotSize, packet.u8(15), pilotSize};
    if (pilots.completeIn(packet) < pilots.count) {
        output.log().error("Log code 0x12b6 is {} bytes long, but has {} substructs.",
                           packet.size(), pilots.count);
        return;
    }
    PilotGroup group;
    for (std::size_t i = 0; i < pilots.count; ++i) {
        const LogPacket pilot = pilots.element(packet, i);
        group.add(i, pilot.u16(0), pilotStrength(pilot.u16(2)));
    }
    output.publish("kActiveSetPilots", group.groupOrNone());
}

} // namespace ventrik
