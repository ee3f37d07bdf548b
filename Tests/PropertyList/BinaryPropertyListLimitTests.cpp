#include "Tests/PropertyList/BinaryPlistBuilder.h"
#include "Tests/PropertyList/PlistText.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::HasSubstr;

Bytes arrayOf(std::initializer_list<std::uint64_t> references)
{
    Bytes array{static_cast<std::uint8_t>(0xa0 + references.size())};
    for (const std::uint64_t reference : references) {
        const Bytes bytes = bigEndianBytes(reference, 3);
        array.insert(array.end(), bytes.begin(), bytes.end());
    }
    return array;
}

// Arrays of one element, each holding the next; the last is empty.
Bytes arrayChain(std::size_t length)
{
    BinaryPlistBuilder builder;
    builder.referenceSize(3);
    for (std::size_t i = 1; i < length; ++i)
        builder.object(arrayOf({i}));
    return builder.object({0xa0}).build();
}

// Arrays whose elements all refer to the next array; the last one's to the given object.
Bytes sharedArrays(std::size_t levels, const Bytes& last)
{
    BinaryPlistBuilder builder;
    builder.referenceSize(3);
    for (std::size_t i = 1; i <= levels; ++i)
        builder.object(arrayOf({i, i, i, i, i, i, i, i, i, i}));
    return builder.object(last).build();
}

} // namespace

TEST(BinaryReaderLimits, NestingEndsAt512)
{
    EXPECT_TRUE(readBinaryPropertyList(arrayChain(512)));
    EXPECT_THAT(readBinaryPropertyList(arrayChain(513)).error,
                HasSubstr("nesting deeper than 512"));
}

TEST(BinaryReaderLimits, AChainOfTwoMegabytesIsTooDeep)
{
    const Bytes data = arrayChain(250'000);
    ASSERT_GE(data.size(), 2'000'000U);
    EXPECT_THAT(readBinaryPropertyList(data).error, HasSubstr("nesting deeper than 512"));
}

TEST(BinaryReaderLimits, NestingCountsThroughObjectsReadBefore)
{
    // The top refers to the end of the chain first, so that all below is known when the rest comes.
    BinaryPlistBuilder builder;
    builder.referenceSize(3).object(arrayOf({300, 1}));
    for (std::uint64_t i = 1; i < 600; ++i)
        builder.object(arrayOf({i + 1}));
    EXPECT_THAT(readBinaryPropertyList(builder.object({0xa0}).build()).error,
                HasSubstr("nesting deeper than 512"));
}

TEST(BinaryReaderLimits, SharedReferencesWithinTheLimitAreRead)
{
    // 1 + 10 + ... + 10^5 values
    const auto reading = readBinaryPropertyList(sharedArrays(5, {0x09}));
    ASSERT_TRUE(reading) << reading.error;
    EXPECT_EQ(reading.value->array()->size(), 10U);
}

TEST(BinaryReaderLimits, ABombOfSharedReferencesIsRefused)
{
    EXPECT_THAT(readBinaryPropertyList(sharedArrays(6, {0x09})).error,
                HasSubstr("more than 1000000 values"));
    EXPECT_THAT(readBinaryPropertyList(sharedArrays(500, {0x09})).error,
                HasSubstr("more than 1000000 values"));
}

TEST(BinaryReaderLimits, ABombOfSharedTextIsRefused)
{
    const Bytes text = joined({{0x5f, 0x12, 0, 0x10, 0, 0}, Bytes(1 << 20, 'x')});
    EXPECT_THAT(readBinaryPropertyList(sharedArrays(3, text)).error,
                HasSubstr("more than 134217728 bytes of text and data"));
}

TEST(BinaryReaderLimits, ContainersThatOverlapCountEachTime)
{
    // Every object is the same array of references, all of them to the object after it.
    constexpr std::uint32_t elements = 300'000;
    Bytes array = joined({{0xaf, 0x12}, bigEndianBytes(elements, 4)});
    for (std::uint32_t i = 0; i < elements; ++i)
        array.push_back(static_cast<std::uint8_t>(i + 1));
    BinaryPlistBuilder builder;
    builder.object(array);
    for (std::size_t i = 1; i < 256; ++i)
        builder.object({}).offsetOf(i, 8);
    EXPECT_FALSE(readBinaryPropertyList(builder.build()));
}

TEST(BinaryReaderLimits, MessagesBeyond64MebibytesAreRefused)
{
    Bytes data((std::size_t{64} << 20) + 1);
    EXPECT_THAT(readBinaryPropertyList(data).error,
                HasSubstr("67108865 bytes are more than the 67108864 allowed"));
}

} // namespace ventrik
