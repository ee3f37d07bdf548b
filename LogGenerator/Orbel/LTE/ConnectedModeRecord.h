#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Connected-mode intra-frequency measurement, 0xB179, at least 29 bytes
//   17 serving cell | 27 u8 n, measured neighbours | 28 u8 m, detected cells
//   29 n elements of 6 bytes | 29 + 6n m elements of 2 bytes
namespace ConnectedModeRecord
{
inline constexpr std::uint32_t logCode = 0xB179;
inline constexpr std::size_t minimumSize = 29;

inline RecordElements measuredNeighbors(const LogPacket& packet)
{
    return {29, 6, packet.u8(27), 6};
}

inline RecordElements detectedCells(const LogPacket& packet)
{
    return {29 + std::size_t{6} * packet.u8(27), 2, packet.u8(28), 2};
}
} // namespace ConnectedModeRecord

} // namespace ventrik
