#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Idle-mode reselection candidates, 0xB186, at least 21 bytes
//   13 u8 version | 15 u16 serving EARFCN | 17 u16 serving cell identity | 19 u16 candidates
//   21 candidates, 4 bytes apart: a candidate's technology part lies where the next one begins
namespace ReselectionRecord
{
inline constexpr std::uint32_t logCode = 0xB186;
inline constexpr std::size_t minimumSize = 21;

inline RecordElements candidates(const LogPacket& packet)
{
    return {21, 4, packet.u8(19), 4}; // the count is taken as 8 bits
}
} // namespace ReselectionRecord

} // namespace ventrik
