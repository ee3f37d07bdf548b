#pragma once

#include "Packets/PacketBuilder.h"
#include "Tests/Capture/PcapBytes.h"

namespace ventrik
{

/// 2001-09-09 01:46:40 UTC: where the captures of these tests begin.
inline constexpr std::uint32_t captureStart = 1000000000;
inline constexpr std::uint32_t lteLinkType = 150;
inline constexpr std::uint32_t nanosecondMagic = 0xA1B23C4D;

/// A cell-info record of 38 bytes: every field of it is shown.
inline Bytes cellInfoMessage(std::uint16_t physicalCellId)
{
    return PacketBuilder(0xB0C2)
        .u16(14, physicalCellId)
        .u16(16, 1300)
        .u16(18, 19300)
        .u8(20, 50)
        .u8(21, 100)
        .u32(22, 0x01A2D003)
        .u16(26, 4711)
        .u32(28, 3)
        .size(38)
        .build();
}

/// An antenna-count record of 22 bytes.
inline Bytes antennaMessage(std::uint8_t count)
{
    return PacketBuilder(0xB0C1).u8(20, count).size(22).build();
}

} // namespace ventrik
