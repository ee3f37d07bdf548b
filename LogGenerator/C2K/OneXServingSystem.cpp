#include "LogGenerator/C2K/OneXServingSystem.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/Orbel/Labels.h"
#include "Packets/LogPacket.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::size_t minimumSize = 171;
constexpr std::size_t sizeWithBaseStation = 186;
constexpr std::uint8_t lowestVersion = 2;
constexpr std::int32_t systemTypeWithIdentity = 2;

constexpr std::array<std::string_view, 13> roamingLabels{"OFF [0]",
                                                         "ON [1]",
                                                         "Flashing [2]",
                                                         "Out of Neighborhood [3]",
                                                         "Out of Building [4]",
                                                         "Preferred system [5]",
                                                         "Available system [6]",
                                                         "Alliance partner [7]",
                                                         "Premium partner [8]",
                                                         "Full service functionality [9]",
                                                         "Partial service functionality [10]",
                                                         "Banner ON [11]",
                                                         "Banner OFF [12]"};

std::string roamingLabel(std::uint32_t indicator)
{
    return std::string(labelOr(roamingLabels, indicator,
                               fmt::format("ERI - {}", static_cast<std::int32_t>(indicator))));
}

std::string systemNumber(std::uint16_t number, std::int32_t systemType)
{
    return systemType == systemTypeWithIdentity
               ? decimal(number)
               : fmt::format("(unknown system type {})", systemType);
}

} // namespace

// 1x serving system, 0x134F, at least 171 bytes
//   13 u8 version, at least 2 | 42 u32 roaming indicator | 46 u32 system type
//   50 u16 system identification | 52 u16 network identification | 131 u8 packet zone
//   133 u8 protocol revision | 184 u16 base station, in longer records
void decodeOneXServingSystem(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() < minimumSize) {
        output.log().error("Log code 0x134f is {} bytes long but must be at least {} bytes.",
                           packet.size(), minimumSize);
        return;
    }
    if (packet.u8(13) < lowestVersion) {
        output.log().error(
            "Log code 0x134f has version={}; only version 2 or higher expected; dropping.",
            packet.u8(13));
        return;
    }
    const std::int32_t systemType = packet.i32(46);
    output.publish("k1xRoamingHome", roamingLabel(packet.u32(42)));
    output.publish("kSystemId", systemNumber(packet.u16(50), systemType));
    output.publish("kNetworkId", systemNumber(packet.u16(52), systemType));
    output.publish("kPacketZoneId", decimal(packet.u8(131)));
    if (packet.size() >= sizeWithBaseStation)
        output.publish("kBaseId", decimal(packet.u16(184)));
    output.publish("kProtocolRevision", decimal(packet.u8(133)));
}

} // namespace ventrik
