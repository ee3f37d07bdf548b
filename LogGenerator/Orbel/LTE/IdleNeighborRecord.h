#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Idle-mode neighbour measurements, 0xB180, at least 21 bytes
//   13 u8 version | 17 u16 E-ARFCN | 19 6 bits Qrxlevmin, 5 bits number of cells less one
//   21 elements of 20 bytes, of which 16 are read
namespace IdleNeighborRecord
{
inline constexpr std::uint32_t logCode = 0xB180;
inline constexpr std::size_t minimumSize = 21;

inline RecordElements cells(const LogPacket& packet)
{
    return {21, 20, (packet.u16(19) >> 6 & 0x1FU) + std::size_t{1}, 16};
}
} // namespace IdleNeighborRecord

} // namespace ventrik
