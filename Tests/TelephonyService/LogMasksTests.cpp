#include "TelephonyService/LogMasks.h"

#include "Capture/HdlcFrames.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

LogMasks masksOf(std::initializer_list<std::uint16_t> codes)
{
    LogMasks masks;
    for (const std::uint16_t code : codes)
        masks.add(code);
    return masks;
}

// The content of a frame that needs no other byte escaped than these tests know of.
Bytes contentOf(const Bytes& frame)
{
    FrameAssembler assembler;
    assembler.take(frame);
    const auto whole = assembler.frame();
    EXPECT_TRUE(whole);
    return whole ? Bytes(whole->content.begin(), whole->content.end()) : Bytes();
}

} // namespace

TEST(LogMasks, AreSetWithABitForEachItemTheLowestFirst)
{
    const auto commands = masksOf({0xB000, 0xB009, 0xB00A}).commandsFrom({});
    ASSERT_EQ(commands.size(), 1U);
    EXPECT_EQ(contentOf(commands[0]), (Bytes{0x73, 0, 0, 0, //
                                             3, 0, 0, 0,    // sets a mask
                                             0xB, 0, 0, 0,  // of this equipment
                                             11, 0, 0, 0,   // of so many items
                                             0x01, 0x06}));
}

TEST(LogMasks, AreSentAsFrames)
{
    const auto commands =
        masksOf({0x1006, 0x1005, 0x1004, 0x1003, 0x1002, 0x1001}).commandsFrom({});
    ASSERT_EQ(commands.size(), 1U);
    // The mask 0x7E is escaped.
    EXPECT_THAT(Bytes(commands[0].begin() + 16, commands[0].begin() + 18), ElementsAre(0x7D, 0x5E));
    EXPECT_EQ(commands[0].back(), 0x7E);
}

TEST(LogMasks, CoverEightItemsWithAWholeByte)
{
    const auto commands = masksOf({0x4007}).commandsFrom({});
    EXPECT_EQ(contentOf(commands.at(0)).size(), 17U);
}

TEST(LogMasks, AreSetWithOneCommandForEachEquipment)
{
    const auto commands = masksOf({0xB0C0, 0x1001, 0xB193}).commandsFrom({});
    ASSERT_EQ(commands.size(), 2U);
    EXPECT_EQ(contentOf(commands[0])[8], 0x1);
    EXPECT_EQ(contentOf(commands[1])[8], 0xB);
    EXPECT_EQ(contentOf(commands[1]).size(), 16U + 0x194 / 8 + 1);
}

TEST(LogMasks, AreLeftAloneWhereTheyAreTheSame)
{
    EXPECT_THAT(masksOf({0xB001}).commandsFrom(masksOf({0xB001})), IsEmpty());
    const auto commands = masksOf({0xB001, 0x4001}).commandsFrom(masksOf({0xB001}));
    ASSERT_EQ(commands.size(), 1U);
    EXPECT_EQ(contentOf(commands[0])[8], 0x4);
}

TEST(LogMasks, ClearWhatIsNotWantedAnyMore)
{
    const auto commands = masksOf({0xB001}).commandsFrom(masksOf({0xB001, 0xB009, 0x4000}));
    ASSERT_EQ(commands.size(), 2U);
    EXPECT_EQ(contentOf(commands[0]),
              (Bytes{0x73, 0, 0, 0, 3, 0, 0, 0, 4, 0, 0, 0, 1, 0, 0, 0, 0}));
    EXPECT_EQ(contentOf(commands[1]),
              (Bytes{0x73, 0, 0, 0, 3, 0, 0, 0, 0xB, 0, 0, 0, 10, 0, 0, 0, 2, 0}));
}

TEST(LogMasks, AreAllDisabledWhereNothingIsWanted)
{
    const auto commands = LogMasks().commandsFrom(masksOf({0xB001, 0x4001}));
    ASSERT_EQ(commands.size(), 1U);
    EXPECT_EQ(contentOf(commands[0]), (Bytes{0x73, 0, 0, 0, 0, 0, 0, 0}));
}

} // namespace ventrik
