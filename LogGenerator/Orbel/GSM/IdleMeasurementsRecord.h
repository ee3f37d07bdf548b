#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// GSM idle measurements, 0x5137, at least 29 bytes
//   15 u8 serving receive level | 16 u32 C1 or full-set quality | 20 u32 C2 or sub-set quality
//   26 u8 reselect hysteresis | 28 u8 n, neighbours | 29 n elements of 14 bytes, 7 of them read
// The words at 16 and 20 are two quantities in one place: criteria in 16 bits, qualities in 32.
namespace IdleMeasurementsRecord
{
inline constexpr std::uint32_t logCode = 0x5137;
inline constexpr std::size_t minimumSize = 29;

inline RecordElements neighbors(const LogPacket& packet)
{
    return {29, 14, packet.u8(28), 7};
}
} // namespace IdleMeasurementsRecord

} // namespace ventrik
