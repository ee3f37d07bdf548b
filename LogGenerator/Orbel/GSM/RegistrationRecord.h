#pragma once

#include "LogGenerator/Orbel/LogPacket.h"

namespace ventrik
{

// Registration, 0x7132, at least 16 bytes
//   13 u8 registration state | 14 u8 PLMN selection mode
namespace RegistrationRecord
{
inline constexpr std::uint32_t logCode = 0x7132;
inline constexpr std::size_t minimumSize = 16;
} // namespace RegistrationRecord

} // namespace ventrik
