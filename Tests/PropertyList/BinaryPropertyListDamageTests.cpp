#include "Tests/PropertyList/BinaryPlistBuilder.h"
#include "Tests/PropertyList/PlistText.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

void expectError(const Bytes& data, std::string_view part)
{
    const PropertyListReading reading = readBinaryPropertyList(data);
    EXPECT_FALSE(reading) << part;
    EXPECT_THAT(reading.error, testing::HasSubstr(std::string(part)));
    EXPECT_EQ(reading.error.find('\n'), std::string::npos);
}

void expectObjectError(const Bytes& object, std::string_view part)
{
    expectError(BinaryPlistBuilder().object(object).build(), part);
}

BinaryPlistBuilder goldenDocument()
{
    return BinaryPlistBuilder()
        .object({0xd3, 1, 2, 3, 4, 5, 6})
        .object({0x54, 'N', 'a', 'm', 'e'})
        .object({0x54, 'L', 'i', 's', 't'})
        .object({0x53, 'R', 'a', 'w'})
        .object({0x61, 0x00, 0xe9})
        .object({0xa3, 7, 8, 9})
        .object({0x42, 1, 2})
        .object({0x13, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xfb})
        .object({0x23, 0x3f, 0xf8, 0, 0, 0, 0, 0, 0})
        .object({0x33, 0x3f, 0xf0, 0, 0, 0, 0, 0, 0});
}

} // namespace

TEST(BinaryReaderDamage, TheGoldenDocumentIsWhole)
{
    EXPECT_EQ(readBinaryPropertyList(goldenDocument().build()).value,
              PlistValue(PlistDictionary{{"Name", "\xc3\xa9"},
                                         {"List", PlistArray{-5, 1.5, PlistDate{978307201}}},
                                         {"Raw", Bytes{1, 2}}}));
}

TEST(BinaryReaderDamage, EveryPrefixOfADocumentIsAnError)
{
    const Bytes data = goldenDocument().build();
    for (std::size_t length = 0; length < data.size(); ++length)
        expectError(Bytes(data.data(), data.data() + length), "binary property list: ");
}

TEST(BinaryReaderDamage, NoSingleFlippedBitIsFatal)
{
    const Bytes golden = goldenDocument().build();
    for (std::size_t bit = 0; bit < golden.size() * 8; ++bit) {
        Bytes data = golden;
        data[bit / 8] = static_cast<std::uint8_t>(data[bit / 8] ^ 1U << bit % 8);
        const PropertyListReading reading = readBinaryPropertyList(data);
        EXPECT_EQ(reading.value.has_value(), reading.error.empty()) << "bit " << bit;
    }
}

TEST(BinaryReaderDamage, TrailerNumbersAreChecked)
{
    const auto document = [] { return BinaryPlistBuilder().object({0x09}); };
    expectError(document().offsetSize(0).build(), "offsets 0 bytes");
    expectError(document().offsetSize(9).build(), "offsets 9 bytes");
    expectError(document().referenceSize(0).build(), "references 0 bytes");
    expectError(document().referenceSize(9).build(), "references 9 bytes");
    expectError(document().objectCount(0).build(), "the offset table of 0 objects");
    expectError(document().objectCount(2).build(), "the offset table of 2 objects");
    expectError(document().objectCount(std::uint64_t{1} << 62).build(), "4611686018427387904");
    expectError(document().topObject(1).build(), "a reference to object 1 of 1");
}

TEST(BinaryReaderDamage, OffsetTableMustLieInside)
{
    const auto document = [] { return BinaryPlistBuilder().object({0x09}); };
    expectError(document().tableStart(7).build(), "starts at byte 7, outside the data");
    expectError(document().tableStart(14).build(), "starts at byte 14, outside the data");
    expectError(document().tableStart(~std::uint64_t{0}).build(), "outside the data");
    expectError(document().tableStart(8).build(), "does not fill");
}

TEST(BinaryReaderDamage, OffsetsMustLieAmongTheObjects)
{
    const auto document = [](std::uint64_t offset) {
        return BinaryPlistBuilder().object({0x09}).offsetOf(0, offset).build();
    };
    expectError(document(7), "object 0 starts at byte 7, outside the objects");
    expectError(document(9), "object 0 starts at byte 9, outside the objects");
    expectError(document(0xffffffff), "outside the objects");
}

TEST(BinaryReaderDamage, ReferencesMustNameAnObject)
{
    expectObjectError({0xa1, 1}, "a reference to object 1 of 1");
    expectError(BinaryPlistBuilder()
                    .referenceSize(8)
                    .object(joined({{0xa1}, bigEndianBytes(~std::uint64_t{0}, 8)}))
                    .build(),
                "a reference to object 18446744073709551615 of 1");
}

TEST(BinaryReaderDamage, ContentMustEndBeforeTheOffsetTable)
{
    expectObjectError({0x13, 0}, "the integer at byte 8 runs past the objects");
    expectObjectError({0x14}, "the integer at byte 8");
    expectObjectError({0x22, 0}, "the real at byte 8");
    expectObjectError({0x33, 0}, "the date at byte 8");
    expectObjectError({0x42, 0}, "the data at byte 8");
    expectObjectError({0x52, 'a'}, "the string at byte 8");
    expectObjectError({0x61, 0}, "the string at byte 8");
    expectObjectError({0xa2, 0}, "the array at byte 8 runs past the objects (2 elements)");
    expectObjectError({0xd1, 0}, "the dictionary at byte 8");
}

TEST(BinaryReaderDamage, HugeCountsAreErrors)
{
    const Bytes count = joined({{0x13}, bigEndianBytes(std::uint64_t{1} << 40, 8)});
    for (const std::uint8_t marker : Bytes{0x4f, 0x5f, 0x6f, 0xaf, 0xdf})
        expectObjectError(joined({{marker}, count}), "(1099511627776 elements)");
    const Bytes largest = joined({{0x13}, bigEndianBytes(~std::uint64_t{0}, 8)});
    for (const std::uint8_t marker : Bytes{0x4f, 0x5f, 0x6f, 0xaf, 0xdf})
        expectObjectError(joined({{marker}, largest}), "(18446744073709551615 elements)");
}

TEST(BinaryReaderDamage, LongCountsMustBeIntegers)
{
    expectObjectError({0x5f, 0x51, 'a'}, "the count of the string at byte 8 is no integer");
    expectObjectError({0x5f, 0x14}, "is no integer");
    expectObjectError({0xaf}, "the array at byte 8 runs past");
    expectObjectError({0xaf, 0x11, 0}, "the array at byte 8 runs past");
}

TEST(BinaryReaderDamage, ContainersMustNotHoldThemselves)
{
    expectObjectError({0xa1, 0}, "object 0 contains itself");
    expectError(BinaryPlistBuilder().object({0xa1, 1}).object({0xa1, 0}).build(),
                "object 0 contains itself");
    expectError(
        BinaryPlistBuilder().object({0xd1, 1, 2}).object({0x51, 'k'}).object({0xa1, 0}).build(),
        "object 0 contains itself");
}

TEST(BinaryReaderDamage, KeysMustBeStrings)
{
    expectError(BinaryPlistBuilder().object({0xd1, 1, 1}).object({0x10, 1}).build(),
                "a key of the dictionary at byte 8 is not a string but integer");
}

TEST(BinaryReaderDamage, OtherKindsAreRefusedByName)
{
    expectObjectError({0x00}, "null, at byte 8");
    expectObjectError({0x0c}, "URL, at byte 8");
    expectObjectError({0x0e}, "UUID, at byte 8");
    expectObjectError({0x0f}, "fill, at byte 8");
    expectObjectError({0x80, 1}, "keyed-archiver UID, at byte 8");
    expectObjectError({0xb0}, "ordered set, at byte 8");
    expectObjectError({0xc0}, "set, at byte 8");
    expectObjectError({0x70}, "object of unknown kind, at byte 8");
    expectObjectError({0xf0}, "object of unknown kind, at byte 8");
}

TEST(BinaryReaderDamage, ScalarsMustBeWellFormed)
{
    expectObjectError({0x15}, "an integer of unknown size at byte 8");
    expectObjectError({0x21, 0, 0}, "a real of unknown size at byte 8");
    expectObjectError({0x32, 0, 0, 0, 0}, "a date of unknown size at byte 8");
    expectObjectError({0x33, 0x7f, 0xf0, 0, 0, 0, 0, 0, 0}, "the date at byte 8 is not finite");
    expectObjectError({0x51, 0x80}, "the string at byte 8 is not ASCII");
}

TEST(BinaryReaderDamage, WideIntegersMustBeInRange)
{
    const auto wide = [](std::uint64_t high, std::uint64_t low) {
        return joined({{0x14}, bigEndianBytes(high, 8), bigEndianBytes(low, 8)});
    };
    expectObjectError(wide(1, 0), "the integer at byte 8 is out of range");
    expectObjectError(wide(~std::uint64_t{0}, 5), "out of range");
    expectObjectError(wide(~std::uint64_t{1}, ~std::uint64_t{0}), "out of range");
}

TEST(BinaryReaderDamage, SurrogatesMustBePaired)
{
    expectObjectError({0x61, 0xd8, 0x3d}, "an unpaired surrogate in the string at byte 8");
    expectObjectError({0x61, 0xde, 0x00}, "unpaired surrogate");
    expectObjectError({0x62, 0xd8, 0x3d, 0xd8, 0x3d}, "unpaired surrogate");
    expectObjectError({0x62, 0xd8, 0x3d, 0x00, 0x61}, "unpaired surrogate");
    expectObjectError({0x62, 0xde, 0x00, 0xd8, 0x3d}, "unpaired surrogate");
}

} // namespace ventrik
