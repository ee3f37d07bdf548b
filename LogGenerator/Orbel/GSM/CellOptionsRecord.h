#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// GPRS cell options, 0x51F6, at least 24 bytes
//   15 u8 T3192 | 16 u8 longest DRX timer, s | 17 u8 access burst type
namespace CellOptionsRecord
{
inline constexpr std::uint32_t logCode = 0x51F6;
inline constexpr std::size_t minimumSize = 24;
} // namespace CellOptionsRecord

} // namespace ventrik
