#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Ranked reselection candidates, 0x4005, at least 15 bytes
//   13 u8 u, UMTS cells | 14 u8 g, GSM cells | 15 u elements of 10 bytes, or g elements of 7 bytes
// Both lists begin at 15: the GSM cells of a record that has both kinds lie over the UMTS cells.
namespace RankedCellsRecord
{
inline constexpr std::uint32_t logCode = 0x4005;
inline constexpr std::size_t minimumSize = 15;

inline RecordElements umtsCells(const LogPacket& packet)
{
    return {15, 10, packet.u8(13), 10};
}

inline RecordElements gsmCells(const LogPacket& packet)
{
    return {15, 7, packet.u8(14), 7};
}
} // namespace RankedCellsRecord

} // namespace ventrik
