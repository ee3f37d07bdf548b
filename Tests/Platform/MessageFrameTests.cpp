#include "Platform/Linux/MessageFrame.h"

#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using Status = FrameReader::Status;

constexpr FrameHeaderBytes sample{3, 0, 0, 0, 0xFE, 0xFF, 0xFF, 0xFF, 1, 0, 0, 0, 4, 3, 2, 1};

FrameHeaderBytes headerWith(std::uint32_t length, std::uint32_t flags)
{
    return encodeFrameHeader({length, 0, flags, 0});
}

TEST(MessageFrame, IsLittleEndian)
{
    EXPECT_EQ(encodeFrameHeader({3, -2, FrameFlag::wantsReply, 0x01020304}), sample);
    EXPECT_EQ(decodeFrameHeader(sample), (FrameHeader{3, -2, FrameFlag::wantsReply, 0x01020304}));
}

TEST(MessageFrame, HasALengthOf64MiBAtMost)
{
    EXPECT_TRUE(decodeFrameHeader(headerWith(67108864, 0)));
    EXPECT_FALSE(decodeFrameHeader(headerWith(67108865, 0)));
    EXPECT_FALSE(decodeFrameHeader(headerWith(0xFFFFFFFF, 0)));
}

TEST(MessageFrame, MayBeLimitedFurther)
{
    EXPECT_TRUE(decodeFrameHeader(headerWith(100, 0), 100));
    EXPECT_FALSE(decodeFrameHeader(headerWith(101, 0), 100));
    FrameReader reader(100);
    const FrameHeaderBytes header = headerWith(101, 0);
    ByteView input(header);
    EXPECT_EQ(reader.consume(input), Status::Malformed);
}

TEST(MessageFrame, IsBegunFromItsFirstByteToItsLast)
{
    FrameReader reader;
    EXPECT_FALSE(reader.isWithinFrame());
    Bytes bytes(sample.begin(), sample.end());
    bytes.insert(bytes.end(), {1, 2, 3});
    for (std::size_t i = 0; i < bytes.size(); ++i) {
        ByteView input = ByteView(bytes).subspan(i, 1);
        reader.consume(input);
        EXPECT_TRUE(reader.isWithinFrame());
    }
    reader.takePayload();
    EXPECT_FALSE(reader.isWithinFrame());
}

TEST(MessageFrame, RefusesFlagsThatMakeNoSense)
{
    EXPECT_FALSE(decodeFrameHeader(headerWith(0, 3))); // a reply that wants a reply
    EXPECT_FALSE(decodeFrameHeader(headerWith(0, 4))); // no data of no reply
    EXPECT_FALSE(decodeFrameHeader(headerWith(1, 6))); // no data, but a length
    EXPECT_FALSE(decodeFrameHeader(headerWith(0, 8)));
    EXPECT_TRUE(decodeFrameHeader(headerWith(0, 6)));
}

TEST(FrameReader, PutsAFrameTogetherByteByByte)
{
    Bytes stream(sample.begin(), sample.end());
    stream.insert(stream.end(), {10, 20, 30});
    FrameReader reader;
    for (std::size_t i = 0; i + 1 < stream.size(); ++i) {
        ByteView input = ByteView(stream).subspan(i, 1);
        ASSERT_EQ(reader.consume(input), Status::NeedsMore);
    }
    ByteView last = ByteView(stream).last(1);
    ASSERT_EQ(reader.consume(last), Status::HasFrame);
    EXPECT_EQ(reader.header().id, -2);
    EXPECT_EQ(reader.takePayload(), (Bytes{10, 20, 30}));
}

TEST(FrameReader, LeavesTheNextFrameInTheInput)
{
    Bytes stream;
    for (const std::int32_t id : {1, 2}) {
        const auto header = encodeFrameHeader({1, id, 0, 0});
        stream.insert(stream.end(), header.begin(), header.end());
        stream.push_back(static_cast<std::uint8_t>(id));
    }
    FrameReader reader;
    ByteView input = stream;
    ASSERT_EQ(reader.consume(input), Status::HasFrame);
    EXPECT_EQ(input.size(), 17U);
    EXPECT_EQ(reader.takePayload(), Bytes{1});
    ASSERT_EQ(reader.consume(input), Status::HasFrame);
    EXPECT_EQ(reader.header().id, 2);
}

TEST(FrameReader, HoldsNothingThatHasNotComeIn)
{
    const auto header = headerWith(60U << 20, 0);
    FrameReader reader;
    ByteView input = header;
    EXPECT_EQ(reader.consume(input), Status::NeedsMore);
    EXPECT_EQ(reader.takePayload().capacity(), 0U);
}

TEST(FrameReader, FindsAMalformedHeader)
{
    const auto header = headerWith(0, 99);
    FrameReader reader;
    ByteView input = header;
    EXPECT_EQ(reader.consume(input), Status::Malformed);
}

} // namespace
} // namespace ventrik
