#include "LogGenerator/C2K/FingerC2I.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/PilotGroup.h"
#include "Packets/LogPacket.h"

namespace ventrik
{

namespace
{

constexpr std::size_t headerSize = 23;
constexpr std::size_t fingerSize = 14;
constexpr std::uint16_t unassigned = 0xFFFF;

} // namespace

// 1x finger C/I, 0x108A, 23 bytes and those of the fingers, no more
//   22 u8 number of fingers | 23 fingers of 14 bytes: 0 u16 PN offset (0xFFFF: unassigned),
//   6 u16 C/I (1/512)
void decodeFingerC2I(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() < headerSize) {
        output.log().error("Log code 0x108a is {} bytes long but must be at least {} bytes.",
                           packet.size(), headerSize);
        return;
    }
    const RecordElements fingers{headerSize, fingerSize, packet.u8(22), fingerSize};
    if (packet.size() != headerSize + fingerSize * fingers.count) {
        output.log().error(
            "Log code 0x108a has bad length of {} bytes, but has {} substructs (size={}).",
            packet.size(), fingers.count, headerSize);
        return;
    }
    PilotGroup group;
    for (std::size_t i = 0; i < fingers.count; ++i) {
        const LogPacket finger = fingers.element(packet, i);
        if (finger.u16(0) != unassigned)
            group.add(i, finger.u16(0), pilotStrength(finger.u16(6)));
    }
    output.publish("kFingerC2I", group.groupOrNone());
}

} // namespace ventrik
