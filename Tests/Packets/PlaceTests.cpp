#include "Packets/Record.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>

namespace ventrik
{

void PrintTo(const Place& place, std::ostream* out)
{
    *out << (place.isSigned ? "signed " : "") << (place.isBigEndian ? "big-endian " : "")
         << int{place.width} << " bits from bit " << int{place.bit} << " of byte " << place.offset;
}

namespace
{

const Bytes sample{0x12, 0x34, 0x56, 0x78, 0x9A, 0xBC, 0xDE, 0xF0,
                   0x0F, 0x1E, 0x80, 0xFF, 0x7F, 0x01, 0x02, 0x03};

struct PlaceCase {
    Place place;
    std::int64_t number;
};

const PlaceCase placeCases[]{
    // Whole bytes
    {u8(0), 0x12},
    {u8(4), 0x9A},
    {i8(4), -0x66},
    {i8(12), 0x7F},
    {u16(0), 0x3412},
    {u16(4), 0xBC9A},
    {i16(4), -0x4366},
    {i16(0), 0x3412},
    {u32(4), 0xF0DEBC9A},
    {i32(4), -0x0F214366},
    {i32(0), 0x78563412},
    {u16BigEndian(4), 0x9ABC},
    {{4, 0, 16, true, true}, -0x6544},
    {{0, 0, 24, false, true}, 0x123456},
    // Within a byte: 0x12 is 0001 0010, 0x9A is 1001 1010, 0xBC is 1011 1100.
    {bits(0, 0, 1), 0},
    {bits(0, 1, 1), 1},
    {bits(0, 0, 4), 2},
    {bits(0, 4, 4), 1},
    {{0, 1, 1, true}, -1},
    {{4, 4, 4, true}, -7},
    {{4, 0, 3, true}, 2},
    {{5, 2, 6, true}, -17},
    // Across bytes
    {bits(0, 4, 8), 0x41},
    {bits(4, 15, 1), 1},
    {bits(4, 15, 3), 5},
    {bits(0, 1, 33), 0x13C2B1A09},
    {bits(0, 0, 48), 0xBC9A78563412},
    {{0, 0, 48, true}, -0x436587A9CBEE},
    {bits(0, 15, 48), 0xE1BD7934F0AC},
    {{0, 15, 48, true}, -0x1E4286CB0F54},
    // The packet's last bytes
    {u8(15), 3},
    {u16(14), 0x0302},
    {bits(10, 0, 48), 0x0302017FFF80},
    {bits(14, 9, 7), 1},
};

// The bits one after the other, the lowest first; those past the end are 0.
std::uint64_t bitByBit(ByteView bytes, std::size_t offset, unsigned bit, unsigned width)
{
    std::uint64_t number = 0;
    for (unsigned i = 0; i < width; ++i) {
        const std::size_t byte = offset + (bit + i) / 8;
        if (byte < bytes.size() && (bytes[byte] >> ((bit + i) % 8) & 1))
            number |= std::uint64_t{1} << i;
    }
    return number;
}

} // namespace

TEST(Place, HoldsTheNumberOfItsBits)
{
    for (const auto& [place, number] : placeCases)
        EXPECT_EQ(numberAt(LogPacket(sample), place), number) << testing::PrintToString(place);
}

TEST(Place, HoldsTheSameNumberHoweverFewBytesFollow)
{
    for (const auto& [place, number] : placeCases)
        for (std::size_t size = place.offset + place.bytes(); size <= sample.size(); ++size) {
            const Bytes cut(sample.begin(), sample.begin() + static_cast<std::ptrdiff_t>(size));
            EXPECT_EQ(numberAt(LogPacket(cut), place), number)
                << testing::PrintToString(place) << " in a packet of " << size;
        }
}

TEST(Place, EveryBitAndWidthReadsAsItsBitsOneAfterTheOther)
{
    for (std::uint16_t offset = 0; offset < sample.size() + 2; ++offset)
        for (std::uint8_t bit = 0; bit < 16; ++bit)
            for (std::uint8_t width = 1; width <= 48; ++width)
                ASSERT_EQ(static_cast<std::uint64_t>(
                              numberAt(LogPacket(sample), bits(offset, bit, width))),
                          bitByBit(sample, offset, bit, width))
                    << testing::PrintToString(bits(offset, bit, width));
}

TEST(Place, BytesPastTheEndReadAsZero)
{
    const Bytes bytes{0x11, 0xFF};
    const PlaceCase cases[]{
        {u16(1), 0x00FF},       {i16(1), 0x00FF}, {u32(0), 0x0000FF11}, {u16BigEndian(1), 0xFF00},
        {bits(1, 4, 16), 0x0F}, {i8(2), 0},       {bits(0, 15, 48), 1}, {bits(1, 0, 48), 0xFF},
        {u8(0xFFFF), 0},        {u16(0xFFFF), 0}, {u16BigEndian(2), 0},
    };
    for (const auto& [place, number] : cases)
        EXPECT_EQ(numberAt(LogPacket(bytes), place), number) << testing::PrintToString(place);
    EXPECT_EQ(numberAt(LogPacket({}), u32(0)), 0);
}

TEST(Place, AnElementsPlacesCountFromItsFirstByte)
{
    EXPECT_EQ(numberAt(LogPacket(sample).from(4), u16(0)), 0xBC9A);
    EXPECT_EQ(numberAt(LogPacket(sample).from(14), u32(0)), 0x0302);
}

TEST(Place, ReachesIntoTheBytesThatHoldItsBits)
{
    const std::pair<Place, std::size_t> cases[]{
        {u8(7), 1},          {i32(7), 4},          {bits(0, 0, 1), 1}, {bits(0, 7, 1), 1},
        {bits(0, 7, 2), 2},  {bits(0, 15, 1), 2},  {bits(0, 8, 8), 2}, {bits(3, 1, 16), 3},
        {bits(0, 0, 48), 6}, {bits(0, 15, 48), 8},
    };
    for (const auto& [place, count] : cases)
        EXPECT_EQ(place.bytes(), count) << testing::PrintToString(place);
}

} // namespace ventrik
