#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Serving PLMN, 0x7135, at least 32 bytes
//   13 u8 network operating mode | 14 u8 service type
//   15 PLMN identity, 3 bytes of two decimal digits each, low nibble first:
//   country 1, 2 | country 3, network 3 | network 1, 2
//   18 u16 big-endian location area code | 20 u8 routing area code
namespace ServingPLMNRecord
{
inline constexpr std::uint32_t logCode = 0x7135;
inline constexpr std::size_t minimumSize = 32;
} // namespace ServingPLMNRecord

} // namespace ventrik
