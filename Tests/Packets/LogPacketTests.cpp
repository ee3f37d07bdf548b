#include "Packets/ArrayOutOfBoundsException.h"
#include "Packets/LogPacket.h"
#include "Packets/PacketBuilder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>

namespace ventrik
{

TEST(LogPacket, ReadsLittleEndianFields)
{
    const Bytes bytes{0x01, 0x80, 0xFF, 0x7F};
    const LogPacket packet(bytes);
    EXPECT_EQ(packet.u8(1), 0x80);
    EXPECT_EQ(packet.i8(1), -128);
    EXPECT_EQ(packet.u16(1), 0xFF80);
    EXPECT_EQ(packet.i16(1), -128);
    EXPECT_EQ(packet.u32(0), 0x7FFF8001U);
    EXPECT_EQ(packet.i32(0), 0x7FFF8001);
}

TEST(LogPacket, ReadsBigEndianWords)
{
    const Bytes bytes{0x12, 0x34};
    EXPECT_EQ(LogPacket(bytes).u16BigEndian(0), 0x1234);
}

TEST(LogPacket, ReadsThePropertyListBehindTheHeaderOnce)
{
    const Bytes bytes = propertyListPacket(0xFF0001, PlistArray{"cell"});
    const LogPacket packet(bytes);
    const PropertyListReading& reading = packet.propertyList();
    ASSERT_TRUE(reading);
    EXPECT_EQ(*reading.value, PlistArray{"cell"});
    EXPECT_EQ(&packet.propertyList(), &reading);
}

TEST(LogPacket, TellsWhyThereIsNoPropertyList)
{
    const Bytes bytes = PacketBuilder(0xFF0001).u8(13, 'x').build();
    const LogPacket packet(bytes);
    EXPECT_FALSE(packet.propertyList());
    EXPECT_FALSE(packet.propertyList().error.empty());
}

TEST(LogPacket, ReadsZeroPastTheEnd)
{
    const Bytes bytes{0x11, 0x22};
    const LogPacket packet(bytes);
    EXPECT_EQ(packet.u8(2), 0);
    EXPECT_EQ(packet.u16(1), 0x0022);
    EXPECT_EQ(packet.u32(1), 0x00000022U);
    EXPECT_EQ(packet.u16BigEndian(1), 0x2200);
}

TEST(LogPacket, ReadsNumbersThatStandSideBySide)
{
    const Bytes bytes{0xFF, 1, 0, 0, 0x80, 2, 3, 0, 0, 4};
    std::array<std::uint32_t, 2> numbers{};
    LogPacket(bytes).u32s(1, numbers);
    EXPECT_THAT(numbers, testing::ElementsAre(0x80000001U, 0x00000302U));
    LogPacket(bytes).u32s(2, numbers);
    EXPECT_THAT(numbers, testing::ElementsAre(0x02800000U, 0x04000003U));
}

TEST(LogPacket, ReadsZeroForTheNumbersPastTheEnd)
{
    const Bytes bytes{1, 2, 3, 4, 5, 6};
    std::array<std::uint32_t, 3> numbers{9, 9, 9};
    LogPacket(bytes).u32s(1, numbers);
    EXPECT_THAT(numbers, testing::ElementsAre(0x05040302U, 0x00000006U, 0U));
    LogPacket(bytes).u32s(100, numbers);
    EXPECT_THAT(numbers, testing::Each(0U));
}

TEST(LogPacket, HasNoPayloadWhenItIsShorterThanItsHeader)
{
    const Bytes bytes(12, 1);
    EXPECT_TRUE(LogPacket(bytes).payload().empty());
}

TEST(LogPacket, PayloadBeginsAtOffset13)
{
    Bytes bytes(15, 0);
    bytes[13] = 7;
    EXPECT_EQ(LogPacket(bytes).payload().size(), 2U);
    EXPECT_EQ(LogPacket(bytes).payload()[0], 7);
}

TEST(LogPacket, StripsTheTransportPrefix)
{
    const Bytes bytes{0x81, 0x05, 0x01, 0x02};
    EXPECT_TRUE(std::ranges::equal(stripPrefix(bytes), Bytes{0x01, 0x02}));
}

TEST(LogPacket, LeavesOtherFirstBytesAlone)
{
    for (const std::uint8_t first : Bytes{0x01, 0xFF, 0x80, 0x82}) {
        const Bytes bytes{first, 0x05, 0x01};
        EXPECT_EQ(stripPrefix(bytes).size(), 3U) << int{first};
    }
}

TEST(LogPacket, StripsNothingFromNothing)
{
    EXPECT_TRUE(stripPrefix({}).empty());
}

TEST(LogPacket, EffectiveCodeOfAnOrdinaryPacketIsItsCodeField)
{
    const Bytes packet = PacketBuilder(0xB0C2).build();
    EXPECT_EQ(effectiveLogCode(LogPacket(packet)), 0xB0C2U);
}

TEST(LogPacket, EffectiveCodeOfType255HasTheExtraCodeBase)
{
    const Bytes packet = PacketBuilder(0x0001).type(255).build();
    EXPECT_EQ(effectiveLogCode(LogPacket(packet)), 16711681U);
}

TEST(RecordElements, StopAtTheLastCompleteOne)
{
    const RecordElements elements{13, 4, 3, 2};
    // The third element's two bytes end at 13 + 8 + 2.
    for (const auto& [size, count] : {std::pair<std::size_t, std::size_t>{13, 0},
                                      {14, 0},
                                      {15, 1},
                                      {18, 1},
                                      {19, 2},
                                      {22, 2},
                                      {23, 3},
                                      {100, 3}}) {
        const Bytes bytes(size);
        EXPECT_EQ(elements.completeIn(LogPacket(bytes)), count) << size;
    }
}

TEST(RecordElements, AnElementCountsFromItsOwnFirstByte)
{
    const Bytes bytes{0, 0, 1, 2, 3, 4};
    const LogPacket packet(bytes);
    EXPECT_EQ((RecordElements{2, 2, 2, 2}.element(packet, 1).u16(0)), 0x0403);
    EXPECT_EQ(packet.from(9).size(), 0U);
}

TEST(RecordElements, AnIndexOutsideTheDeclaredCountIsRefused)
{
    const Bytes bytes(100);
    const RecordElements elements{13, 4, 3, 2};
    EXPECT_NO_THROW(elements.element(LogPacket(bytes), 2));
    EXPECT_THROW(elements.element(LogPacket(bytes), 3), ArrayOutOfBoundsException);
}

TEST(PacketBuilder, WritesTheHeader)
{
    const Bytes packet = PacketBuilder(0xFF0001).timestamp(0x0807060504030201).u8(13, 9).build();
    EXPECT_EQ(packet, (Bytes{255, 13, 0, 0x01, 0x00, 1, 2, 3, 4, 5, 6, 7, 8, 9}));
}

TEST(PacketBuilder, WritesBitFieldsAcrossBytes)
{
    // Nine bits of value 0x155 from bit 1 of byte 13: 0x2AA over bytes 13 and 14.
    const Bytes packet = PacketBuilder(1).bits(13, 1, 9, 0x155).build();
    EXPECT_EQ(packet[13], 0xAA);
    EXPECT_EQ(packet[14], 0x02);
}

TEST(PacketBuilder, PutsThePrefixInFront)
{
    const Bytes packet = PacketBuilder(1).withPrefix().build();
    EXPECT_EQ(packet.size(), 15U);
    EXPECT_EQ(packet[0], 0x81);
    EXPECT_EQ(packet[2], 1);
}

} // namespace ventrik
