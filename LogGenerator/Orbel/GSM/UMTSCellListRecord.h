#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// UMTS cell list with energies, 0x417A, at least 16 bytes
//   13 i16 receive AGC | 15 u8 n, cells | 16 n elements of 15 bytes, the cells
//   16 + 15n n elements of 44 bytes, their energies in the same order
namespace UMTSCellListRecord
{
inline constexpr std::uint32_t logCode = 0x417A;
inline constexpr std::size_t minimumSize = 16;

inline RecordElements cells(const LogPacket& packet)
{
    return {16, 15, packet.u8(15), 9};
}

inline RecordElements energies(const LogPacket& packet)
{
    return {16 + std::size_t{15} * packet.u8(15), 44, packet.u8(15), 44};
}
} // namespace UMTSCellListRecord

} // namespace ventrik
