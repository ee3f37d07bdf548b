#include "Tests/PropertyList/BinaryPlistBuilder.h"
#include "Tests/PropertyList/PlistText.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

// The value of a document of that one object.
PlistValue valueOf(const Bytes& object)
{
    const auto reading = readBinaryPropertyList(BinaryPlistBuilder().object(object).build());
    EXPECT_EQ(reading.error, "");
    return reading.value.value_or("");
}

Bytes wide(std::uint64_t high, std::uint64_t low)
{
    return joined({{0x14}, bigEndianBytes(high, 8), bigEndianBytes(low, 8)});
}

} // namespace

TEST(BinaryReader, ReadsAWholeDocument)
{
    const Bytes data{'b',  'p',  'l',  'i', 's', 't', '0', '0', // 0
                     0xd1, 0x01, 0x02,                          // 8: one entry
                     0x52, 'O',  'n',                           // 11
                     0x09,                                      // 14: true
                     8,    11,   14,                            // 15: offset table
                     0,    0,    0,    0,   0,   0,   1,   1,   //
                     0,    0,    0,    0,   0,   0,   0,   3,   //
                     0,    0,    0,    0,   0,   0,   0,   0,   //
                     0,    0,    0,    0,   0,   0,   0,   15};
    EXPECT_EQ(readBinaryPropertyList(data).value, PlistValue(PlistDictionary{{"On", true}}));
}

TEST(BinaryReader, ReadsIntegersOfEverySize)
{
    EXPECT_EQ(valueOf({0x10, 0xff}), PlistValue(255));
    EXPECT_EQ(valueOf({0x11, 0xff, 0xfe}), PlistValue(65534));
    EXPECT_EQ(valueOf({0x12, 0xff, 0xff, 0xff, 0xff}), PlistValue(4294967295));
    EXPECT_EQ(valueOf(joined({{0x13}, bigEndianBytes(~std::uint64_t{4}, 8)})), PlistValue(-5));
    EXPECT_EQ(valueOf(wide(0, ~std::uint64_t{0})),
              PlistValue(std::numeric_limits<std::uint64_t>::max()));
    EXPECT_EQ(valueOf(wide(~std::uint64_t{0}, std::uint64_t{1} << 63)),
              PlistValue(std::numeric_limits<std::int64_t>::min()));
}

TEST(BinaryReader, ReadsRealsOfBothSizes)
{
    EXPECT_EQ(valueOf({0x22, 0x3e, 0x80, 0, 0}), PlistValue(0.25));
    EXPECT_EQ(valueOf({0x23, 0xbf, 0xf8, 0, 0, 0, 0, 0, 0}), PlistValue(-1.5));
    EXPECT_EQ(valueOf({0x23, 0x7f, 0xf8, 0, 0, 0, 0, 0, 0}), PlistValue(std::nan("")));
}

TEST(BinaryReader, ReadsBooleansDatesAndData)
{
    EXPECT_EQ(valueOf({0x08}), PlistValue(false));
    EXPECT_EQ(valueOf({0x09}), PlistValue(true));
    // 1.0 second after the start of 2001
    EXPECT_EQ(valueOf({0x33, 0x3f, 0xf0, 0, 0, 0, 0, 0, 0}), PlistValue(PlistDate{978307201}));
    EXPECT_EQ(valueOf({0x43, 0, 1, 0xff}), PlistValue(Bytes{0, 1, 0xff}));
}

TEST(BinaryReader, ReadsStringsOfBothKinds)
{
    EXPECT_EQ(valueOf({0x53, 'a', '\r', 'b'}), PlistValue("a\rb"));
    EXPECT_EQ(valueOf({0x50}), PlistValue(""));
    EXPECT_EQ(valueOf({0x62, 0x00, 0xe9, 0x20, 0xac}), PlistValue("\xc3\xa9\xe2\x82\xac"));
    EXPECT_EQ(valueOf({0x62, 0xd8, 0x3d, 0xde, 0x00}), PlistValue("\xf0\x9f\x98\x80"));
}

TEST(BinaryReader, ReadsLongCountsOfEverySize)
{
    const Bytes text(20, 'x');
    const PlistValue expected{std::string(20, 'x')};
    EXPECT_EQ(valueOf(joined({{0x5f, 0x10, 20}, text})), expected);
    EXPECT_EQ(valueOf(joined({{0x5f, 0x11, 0, 20}, text})), expected);
    EXPECT_EQ(valueOf(joined({{0x5f, 0x12, 0, 0, 0, 20}, text})), expected);
    EXPECT_EQ(valueOf(joined({{0x5f, 0x13, 0, 0, 0, 0, 0, 0, 0, 20}, text})), expected);
}

TEST(BinaryReader, ReadsOffsetsAndReferencesOfEverySize)
{
    for (std::uint8_t size = 1; size <= 8; ++size) {
        const Bytes array = joined({{0xa2}, bigEndianBytes(1, size), bigEndianBytes(2, size)});
        const auto reading = readBinaryPropertyList(BinaryPlistBuilder()
                                                        .offsetSize(size)
                                                        .referenceSize(size)
                                                        .object(array)
                                                        .object({0x09})
                                                        .object({0x51, 'a'})
                                                        .build());
        EXPECT_EQ(reading.value, PlistValue(PlistArray{true, "a"})) << reading.error;
    }
}

TEST(BinaryReader, ReadsFromTheTopObject)
{
    const auto reading = readBinaryPropertyList(
        BinaryPlistBuilder().object({0x09}).object({0xa1, 0x00}).topObject(1).build());
    EXPECT_EQ(reading.value, PlistValue(PlistArray{true}));
}

TEST(BinaryReader, LetsTheLaterOfTwoEqualKeysReplaceTheEarlier)
{
    const auto reading = readBinaryPropertyList(BinaryPlistBuilder()
                                                    .object({0xd2, 1, 1, 2, 3})
                                                    .object({0x51, 'k'})
                                                    .object({0x08})
                                                    .object({0x09})
                                                    .build());
    EXPECT_EQ(reading.value, PlistValue(PlistDictionary{{"k", true}}));
}

TEST(BinaryReader, SharesAContainerThatIsReferredToTwice)
{
    const auto reading =
        readBinaryPropertyList(BinaryPlistBuilder().object({0xa2, 1, 1}).object({0xa0}).build());
    ASSERT_TRUE(reading) << reading.error;
    const PlistArray& top = *reading.value->array();
    EXPECT_TRUE(top[0].array()->isSameContainer(*top[1].array()));
}

} // namespace ventrik
