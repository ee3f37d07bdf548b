#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Transport channel measurement, 0xD00C, at least 17 bytes; bit fields of little-endian words
//   14.6 6 bits n, transport channels | 15.4 4 bits m, coded composite transport channels
//   17 n elements of 2 bytes | 289 + 34n m elements of 8 bytes
namespace TransportChannelRecord
{
inline constexpr std::uint32_t logCode = 0xD00C;
inline constexpr std::size_t minimumSize = 17;

inline std::size_t transportChannelCount(const LogPacket& packet)
{
    return packet.u16(14) >> 6 & 0x3FU;
}

inline RecordElements transportChannels(const LogPacket& packet)
{
    return {17, 2, transportChannelCount(packet), 2};
}

inline RecordElements compositeChannels(const LogPacket& packet)
{
    return {289 + 34 * transportChannelCount(packet), 8, std::size_t{packet.u8(15)} >> 4, 8};
}
} // namespace TransportChannelRecord

} // namespace ventrik
