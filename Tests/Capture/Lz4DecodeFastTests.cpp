#include "Capture/lz4_decode_fast.h"
#include "PropertyList/PlistValue.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

std::int64_t decode(const Bytes& source, Bytes& destination)
{
    return lz4_decode_fast(source.data(), source.size(), destination.data(), destination.size());
}

// One literal, a match of 8 one byte back, and the five literals that end a block.
const Bytes block{0x14, 'a', 0x01, 0x00, 0x50, 'b', 'c', 'd', 'e', 'f'};
const std::string text = "aaaaaaaaabcdef";

} // namespace

TEST(Lz4DecodeFast, DecodesLiterals)
{
    Bytes destination(5);
    EXPECT_EQ(decode({0x50, 'H', 'e', 'l', 'l', 'o'}, destination), 5);
    EXPECT_EQ(std::string(destination.begin(), destination.end()), "Hello");
}

TEST(Lz4DecodeFast, DecodesOverlappingMatches)
{
    Bytes destination(text.size());
    EXPECT_EQ(decode(block, destination), 14);
    EXPECT_EQ(std::string(destination.begin(), destination.end()), text);
}

TEST(Lz4DecodeFast, WritesNothingOutsideTheDestination)
{
    for (std::size_t capacity = 0; capacity <= 20; ++capacity) {
        Bytes buffer(capacity + 40, 0xEE);
        lz4_decode_fast(block.data(), block.size(), buffer.data() + 20, capacity);
        EXPECT_EQ(Bytes(buffer.begin(), buffer.begin() + 20), Bytes(20, 0xEE)) << capacity;
        EXPECT_EQ(Bytes(buffer.end() - 20, buffer.end()), Bytes(20, 0xEE)) << capacity;
    }
}

TEST(Lz4DecodeFast, RefusesADestinationThatIsTooSmall)
{
    Bytes destination(13);
    EXPECT_LT(decode(block, destination), 0);
}

TEST(Lz4DecodeFast, RefusesAMatchBeforeTheStart)
{
    Bytes destination(64);
    EXPECT_LT(decode({0x14, 'a', 0x02, 0x00, 0x50, 'b', 'c', 'd', 'e', 'f'}, destination), 0);
}

TEST(Lz4DecodeFast, RefusesEveryTruncationInsideASequence)
{
    for (const std::size_t size : {3U, 4U, 5U, 6U, 9U}) {
        // A copy of exactly that size, so that a read past it is seen by the sanitizer.
        const Bytes cut(block.begin(), block.begin() + static_cast<std::ptrdiff_t>(size));
        Bytes destination(text.size());
        EXPECT_LT(decode(cut, destination), 0) << size;
    }
}

TEST(Lz4DecodeFast, RefusesNothing)
{
    std::uint8_t byte = 0;
    EXPECT_LT(lz4_decode_fast(nullptr, 0, &byte, 1), 0);
    EXPECT_LT(lz4_decode_fast(&byte, 1, nullptr, 0), 0);
}

// One more than 32 bits can count: what is left of the size would be a whole block.
TEST(Lz4DecodeFast, RefusesASourceThatIsTooLarge)
{
    Bytes destination(text.size());
    EXPECT_LT(lz4_decode_fast(block.data(), (std::size_t{1} << 32) + block.size(),
                              destination.data(), destination.size()),
              0);
}

TEST(Lz4DecodeFast, TakesADestinationOfAnySize)
{
    Bytes destination(64);
    EXPECT_EQ(lz4_decode_fast(block.data(), block.size(), destination.data(), SIZE_MAX), 14);
}

} // namespace ventrik
