#pragma once

#include <cstdint>

namespace ventrik::DiagnosticFrames
{

/// First byte of the command that sets log masks, and of its answer, which carries a status.
inline constexpr std::uint8_t logMaskCommand = 0x73;
inline constexpr std::uint8_t statusOffset = 8;

enum class MaskOperation : std::uint32_t { DisableAll = 0, SetMask = 3 };

/// First bytes of the answers to what the port does not take: a command that it does not know, one
/// with wrong parameters, one of a wrong length.
inline constexpr std::uint8_t badCommand = 0x13;
inline constexpr std::uint8_t badParameters = 0x14;
inline constexpr std::uint8_t badLength = 0x15;

} // namespace ventrik::DiagnosticFrames
