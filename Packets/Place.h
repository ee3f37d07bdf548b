#pragma once

#include <cstddef>
#include <cstdint>

namespace ventrik
{

/// Where the bits of a number stand in a packet, in an element of a list or in a subpacket: `width`
/// bits (up to 48) from bit `bit` (up to 15) of the byte at `offset` on, little-endian where
/// nothing else is said.
struct Place {
    std::uint16_t offset = 0;
    std::uint8_t bit = 0;
    std::uint8_t width = 8;
    bool isSigned = false;
    bool isBigEndian = false;

    /// How many bytes from `offset` on the bits reach into.
    constexpr std::size_t bytes() const { return (std::size_t{bit} + width + 7) / 8; }

    bool operator==(const Place&) const = default;
};

// How tables say a place.
constexpr Place u8(std::uint16_t offset)
{
    return {offset, 0, 8};
}
constexpr Place u16(std::uint16_t offset)
{
    return {offset, 0, 16};
}
constexpr Place u32(std::uint16_t offset)
{
    return {offset, 0, 32};
}
constexpr Place i8(std::uint16_t offset)
{
    return {offset, 0, 8, true};
}
constexpr Place i16(std::uint16_t offset)
{
    return {offset, 0, 16, true};
}
constexpr Place i32(std::uint16_t offset)
{
    return {offset, 0, 32, true};
}
constexpr Place u16BigEndian(std::uint16_t offset)
{
    return {offset, 0, 16, false, true};
}
constexpr Place bits(std::uint16_t offset, std::uint8_t bit, std::uint8_t width)
{
    return {offset, bit, width};
}

} // namespace ventrik
