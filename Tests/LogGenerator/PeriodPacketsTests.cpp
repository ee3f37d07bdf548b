#include "LogGenerator/Orbel/PeriodPackets.h"

#include <gtest/gtest.h>
#include <malloc.h>

namespace ventrik
{

namespace
{

constexpr std::size_t mebibyte = std::size_t{1} << 20;

// A packet whose every byte is its number.
Bytes packet(std::size_t size, std::size_t number)
{
    return Bytes(size, static_cast<std::uint8_t>(number));
}

} // namespace

TEST(PeriodPackets, AreKeptOneBehindTheOther)
{
    PeriodPackets packets;
    packets.append(Bytes{1, 2});
    packets.append(Bytes{});
    packets.append(Bytes{3});
    EXPECT_EQ(packets.take(), (Bytes{1, 2, 3}));
    EXPECT_EQ(packets.droppedCount(), 0U);
}

TEST(PeriodPackets, BeginAnewWithEachPeriod)
{
    PeriodPackets packets;
    packets.append(Bytes{1});
    packets.take();
    EXPECT_EQ(packets.take(), Bytes());
    packets.append(Bytes{2});
    EXPECT_EQ(packets.take(), Bytes{2});
}

TEST(PeriodPackets, OfSixtyFourMebibytesAreAllKept)
{
    PeriodPackets packets;
    for (std::size_t i = 0; i < 64; ++i)
        packets.append(packet(mebibyte, i));
    EXPECT_EQ(packets.droppedCount(), 0U);
    EXPECT_EQ(packets.take().size(), 64 * mebibyte);
}

TEST(PeriodPackets, MakeWayFromTheOldestOnAndAreCounted)
{
    PeriodPackets packets;
    for (std::size_t i = 0; i < 100; ++i)
        packets.append(packet(mebibyte, i));
    EXPECT_EQ(packets.droppedCount(), 36U);
    const Bytes kept = packets.take();
    ASSERT_EQ(kept.size(), 64 * mebibyte);
    EXPECT_EQ(kept.front(), 36);
    EXPECT_EQ(kept[mebibyte - 1], 36);
    EXPECT_EQ(kept[mebibyte], 37);
    EXPECT_EQ(kept.back(), 99);
    EXPECT_EQ(packets.droppedCount(), 0U);
}

TEST(PeriodPackets, OfAnySizeMakeWayAsAWhole)
{
    PeriodPackets packets;
    constexpr std::size_t size = 1000;
    constexpr std::size_t count = 70'000;
    for (std::size_t i = 0; i < count; ++i)
        packets.append(packet(size, i));
    const std::size_t dropped = packets.droppedCount();
    const Bytes kept = packets.take();
    EXPECT_EQ(kept.size(), (count - dropped) * size);
    EXPECT_LE(kept.size(), 64 * mebibyte);
    EXPECT_GT(kept.size(), 64 * mebibyte - 2 * 4096 - size);
    EXPECT_EQ(kept.front(), dropped % 256);
}

TEST(PeriodPackets, OfAnEarlierPeriodDoNotMakeWayAgain)
{
    PeriodPackets packets;
    packets.append(packet(3 * mebibyte, 200));
    packets.take();
    for (std::size_t i = 0; i < 65; ++i)
        packets.append(packet(mebibyte, i));
    EXPECT_EQ(packets.droppedCount(), 1U);
    const Bytes kept = packets.take();
    ASSERT_EQ(kept.size(), 64 * mebibyte);
    EXPECT_EQ(kept.front(), 1);
}

// The history keeps them for long.
TEST(PeriodPackets, ThatAreTakenHoldNoRoomOfThoseThatMadeWay)
{
    PeriodPackets packets;
    packets.append(packet(64 * mebibyte, 1));
    packets.append(packet(1000, 2));
    const Bytes kept = packets.take();
    EXPECT_EQ(kept, packet(1000, 2));
    EXPECT_LE(kept.capacity(), 2000U);
}

TEST(PeriodPackets, ThatAreSmallTakeLittleMoreThanTheirBytes)
{
    const auto before = mallinfo2().uordblks + mallinfo2().hblkhd;
    PeriodPackets packets;
    for (std::size_t i = 0; i < 10 * mebibyte; ++i)
        packets.append(Bytes{1});
    EXPECT_LT(mallinfo2().uordblks + mallinfo2().hblkhd - before, 20 * mebibyte);
}

} // namespace ventrik
