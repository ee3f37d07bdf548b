#include "Tests/LogGenerator/C2KFixture.h"

#include <array>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

constexpr std::array<int, 56> forwardBits{
    128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
    0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
    1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};

constexpr std::array<int, 12> reverseBits{128,  256,  512,  768,  1024, 1536,
                                          2048, 3072, 4096, 6144, 8192, 12288};

// Both directions keep their records in the same way.
struct Direction {
    PacketBuilder (*packet)(std::uint32_t sequence);
    std::size_t counterOffset; // of one that counts 128 bits
    std::string lookupKey;
    std::string prefix;
};

class C2KDataRateTest : public C2KFixture, public testing::WithParamInterface<Direction>
{
  protected:
    void feedRecord(std::uint32_t sequence, std::uint32_t count)
    {
        feed(GetParam().packet(sequence).u32(GetParam().counterOffset, count));
    }
    std::string rate() { return shown(GetParam().lookupKey); }
    std::string key(const std::string& name) { return GetParam().prefix + name; }
    PlistValue kept(const std::string& name) { return *state.find(key(name)); }
    PlistDictionary extraInfo() { return *state.find("ExtraInfo")->dictionary(); }
};

using C2KForwardDataRateTest = C2KFixture;
using C2KReverseDataRateTest = C2KFixture;

} // namespace

INSTANTIATE_TEST_SUITE_P(, C2KDataRateTest,
                         testing::Values(Direction{forwardDataPacket, 17, "kFLDataRate", "FL"},
                                         Direction{reverseDataPacket, 18, "kRLDataRate", "RL"}),
                         [](const auto& direction) { return direction.param.prefix; });

TEST_P(C2KDataRateTest, TheFirstRecordShowsAnEmptyRate)
{
    state.find("Display")->dictionary()->set(GetParam().lookupKey, "old");
    feedRecord(7, 3);
    EXPECT_EQ(rate(), "");
    EXPECT_EQ(kept("DataSeqNum"), PlistValue(7));
    EXPECT_EQ(kept("DataSent"), PlistValue(384));
    EXPECT_EQ(extraInfo(), (PlistDictionary{{key("DataSeqNum1"), 7}, {key("DataSent1"), 384}}));
}

TEST_P(C2KDataRateTest, TheNextRecordShowsWhatWasAdded)
{
    feedRecord(7, 3);
    feedRecord(17, 83); // 80 packets of 128 bits in 10 steps
    EXPECT_EQ(rate(), "1.00 kbps");
    EXPECT_EQ(kept("DataSeqNum"), PlistValue(17));
    EXPECT_EQ(kept("DataSent"), PlistValue(10624));
    EXPECT_EQ(extraInfo(), (PlistDictionary{{key("DataSeqNum1"), 17},
                                            {key("DataSent1"), 10624},
                                            {key("DataSeqNum2"), 7},
                                            {key("DataSent2"), 384}}));
}

TEST_P(C2KDataRateTest, TheSameSequenceNumberLeavesTheRateAndKeepsTheRecord)
{
    feedRecord(7, 0);
    feedRecord(8, 8);
    feedRecord(8, 16);
    EXPECT_EQ(rate(), "1.00 kbps");
    EXPECT_EQ(*extraInfo().find(key("DataSent1")), PlistValue(2048));
    EXPECT_EQ(*extraInfo().find(key("DataSent2")), PlistValue(1024));
    feedRecord(9, 32);
    EXPECT_EQ(rate(), "2.00 kbps");
}

TEST_P(C2KDataRateTest, AnEarlierSequenceNumberLeavesTheRate)
{
    feedRecord(7, 0);
    feedRecord(6, 8);
    EXPECT_EQ(rate(), "");
    feedRecord(7, 16);
    EXPECT_EQ(rate(), "1.00 kbps");
}

TEST_P(C2KDataRateTest, SequenceNumbersWrapAround)
{
    feedRecord(0xFFFFFFFF, 0);
    feedRecord(0, 8);
    EXPECT_EQ(rate(), "1.00 kbps");
    feedRecord(0x80000000, 16); // half way round is back
    EXPECT_EQ(rate(), "1.00 kbps");
    feedRecord(0xFFFFFFFF, 16);
    EXPECT_EQ(rate(), "0.00 kbps");
}

TEST_P(C2KDataRateTest, CountersThatFellGiveANegativeRate)
{
    feedRecord(1, 16);
    feedRecord(2, 8);
    EXPECT_EQ(rate(), "-1.00 kbps");
}

TEST_P(C2KDataRateTest, ALostNumberStartsAnew)
{
    feedRecord(1, 0);
    feedRecord(2, 8);
    state.remove(key("DataSent"));
    feedRecord(3, 16);
    EXPECT_EQ(rate(), "");
    state.remove(key("DataSeqNum"));
    feedRecord(4, 32);
    EXPECT_EQ(rate(), "");
    feedRecord(5, 40);
    EXPECT_EQ(rate(), "1.00 kbps");
}

TEST_P(C2KDataRateTest, TheNumbersTravelWithTheHistory)
{
    feedRecord(7, 3);
    generator->generateLogUsingState(state);
    feedRecord(8, 4);
    const PlistValue& period = (*state.find("History")->array())[0];
    const PlistDictionary& extra = *period.dictionary()->find("ExtraInfo")->dictionary();
    EXPECT_EQ(*extra.find(key("DataSeqNum1")), PlistValue(7));
}

TEST_F(C2KForwardDataRateTest, EachCounterHasItsBits)
{
    std::uint32_t sequence = 0;
    for (std::size_t kind = 0; kind < forwardBits.size(); ++kind) {
        feed(forwardDataPacket(++sequence));
        feed(forwardDataPacket(++sequence).u32(17 + 4 * kind, 1024));
        EXPECT_EQ(shown("kFLDataRate"), fmt::format("{}.00 kbps", forwardBits.at(kind))) << kind;
    }
}

TEST_F(C2KForwardDataRateTest, TotalsHave64Bits)
{
    feed(forwardDataPacket(1));
    feed(forwardDataPacket(2).u32(17 + 4 * 52, 0xFFFFFFFF)); // 5120 bits each
    EXPECT_EQ(shown("kFLDataRate"), "21474836475.00 kbps");
    EXPECT_EQ(*state.find("FLDataSent"), PlistValue(21990232550400));
}

TEST_F(C2KForwardDataRateTest, TheSequenceNumberIsAllItsBytes)
{
    feed(forwardDataPacket(0x01020304));
    EXPECT_EQ(*state.find("FLDataSeqNum"), PlistValue(0x01020304));
    feed(forwardDataPacket(0xFFFFFFFF));
    EXPECT_EQ(*state.find("FLDataSeqNum"), PlistValue(4294967295));
}

TEST_F(C2KForwardDataRateTest, ARecordOf240BytesIsRejected)
{
    feed(forwardDataPacket(1).size(240));
    EXPECT_FALSE(state.contains("FLDataSeqNum"));
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x1192 is 240 bytes long but must be at least 241 bytes."}));
    feed(forwardDataPacket(1).size(242));
    EXPECT_TRUE(state.contains("FLDataSeqNum"));
}

TEST_F(C2KReverseDataRateTest, EachCounterHasTheBitsOfItsPayloadSize)
{
    std::uint32_t sequence = 0;
    for (std::size_t half : {18, 306})
        for (std::size_t block = 0; block < 3; ++block)
            for (std::size_t rate = 0; rate < reverseBits.size(); ++rate)
                for (std::size_t counter : {0, 4, 8, 12}) {
                    const std::size_t offset = half + 576 * block + 24 * rate + counter;
                    feed(reverseDataPacket(++sequence));
                    feed(reverseDataPacket(sequence + 1).u32(offset, 1024).u32(14, sequence + 1));
                    ++sequence;
                    EXPECT_EQ(shown("kRLDataRate"), fmt::format("{}.00 kbps", reverseBits.at(rate)))
                        << offset;
                }
}

TEST_F(C2KReverseDataRateTest, BytesBetweenTheCountersDoNotCount)
{
    PacketBuilder packet = reverseDataPacket(1).bytes(18, Bytes(1732, 0xFF));
    for (std::size_t half : {18, 306})
        for (std::size_t block = 0; block < 3; ++block)
            for (std::size_t rate = 0; rate < reverseBits.size(); ++rate)
                packet.bytes(half + 576 * block + 24 * rate, Bytes(16, 0));
    feed(packet);
    EXPECT_EQ(*state.find("RLDataSent"), PlistValue(0));
}

TEST_F(C2KReverseDataRateTest, TheSequenceNumberStartsAtByte14)
{
    feed(reverseDataPacket(0).bytes(13, Bytes{9, 4, 3, 2, 1}));
    EXPECT_EQ(*state.find("RLDataSeqNum"), PlistValue(0x01020304));
}

TEST_F(C2KReverseDataRateTest, ARecordOf1749BytesIsRejected)
{
    feed(reverseDataPacket(1).size(1749));
    EXPECT_FALSE(state.contains("RLDataSeqNum"));
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{
                    3, "Log code 0x127e is 1749 bytes long but must be at least 1750 bytes."}));
    feed(reverseDataPacket(1).size(1751));
    EXPECT_TRUE(state.contains("RLDataSeqNum"));
}

} // namespace ventrik
