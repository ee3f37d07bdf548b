#include "Tests/LogGenerator/C2KFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using Line = CapturingSystemLog::Line;

class C2KTrafficFERTest : public C2KFixture
{
  protected:
    void feedFrame(bool isErased) { feed(oneXTrafficFERPacket(isErased)); }
    void feedStatus(std::uint8_t deviceState) { feed(oneXStatusPacket().u8(21, deviceState)); }
    std::string rate() { return shown("k1xTrafficFER"); }
};

} // namespace

TEST_F(C2KTrafficFERTest, AGoodFrameIsNoError)
{
    feedFrame(false);
    EXPECT_EQ(rate(), "0.00%");
    EXPECT_EQ(*state.find("TrafficFER"), PlistValue(0.0));
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KTrafficFERTest, AnErasedFrameCountsOne64th)
{
    feedFrame(true);
    EXPECT_EQ(rate(), "1.56%"); // 1/64
    feedFrame(false);
    EXPECT_EQ(rate(), "1.54%"); // 63/4096
    feedFrame(true);
    EXPECT_EQ(rate(), "3.08%"); // 1/64 + 63*63/262144
}

TEST_F(C2KTrafficFERTest, AnyMarkButZeroIsAnErasure)
{
    feed(oneXTrafficFERPacket(false).u8(17 + 7 + 24, 0x80));
    EXPECT_EQ(rate(), "1.56%");
}

TEST_F(C2KTrafficFERTest, After64ErasuresFromZeroItIs63AndAHalf)
{
    for (int i = 0; i < 64; ++i)
        feedFrame(true);
    EXPECT_EQ(rate(), "63.50%");
}

TEST_F(C2KTrafficFERTest, IsKeptInSinglePrecision)
{
    state.set("TrafficFER", 0.1); // as a float 0.100000001490116, of which 63/64 are taken
    feedFrame(false);
    EXPECT_EQ(*state.find("TrafficFER"), PlistValue(static_cast<double>(0.1F * 0.984375F)));
    EXPECT_NE(*state.find("TrafficFER"), PlistValue(0.0984375));
    EXPECT_EQ(rate(), "9.84%");
}

TEST_F(C2KTrafficFERTest, LeavingTrafficShowsTheLastRateAsOldOnce)
{
    for (int i = 0; i < 64; ++i)
        feedFrame(true);
    feedStatus(6);
    EXPECT_EQ(rate(), "63.50% (old)");
    EXPECT_FALSE(state.contains("TrafficFER"));
    state.find("Display")->dictionary()->set("k1xTrafficFER", "untouched");
    feedStatus(6);
    EXPECT_EQ(rate(), "untouched");
}

TEST_F(C2KTrafficFERTest, InTrafficTheRateGoesOn)
{
    feedFrame(true);
    feedStatus(8);
    EXPECT_EQ(rate(), "1.56%");
    EXPECT_TRUE(state.contains("TrafficFER"));
}

TEST_F(C2KTrafficFERTest, TheNextTrafficStartsAnew)
{
    feedFrame(true);
    feedStatus(3);
    feedFrame(true);
    EXPECT_EQ(rate(), "1.56%");
}

TEST_F(C2KTrafficFERTest, WithoutARateLeavingTrafficShowsNothing)
{
    feedStatus(6);
    EXPECT_EQ(rate(), "");
}

TEST_F(C2KTrafficFERTest, AnIncompleteStatusLeavesTheRate)
{
    feedFrame(true);
    feed(oneXStatusPacket().u8(14, 3).u8(21, 6));
    EXPECT_EQ(rate(), "1.56%");
    EXPECT_TRUE(state.contains("TrafficFER"));
}

TEST_F(C2KTrafficFERTest, ARecordOf16BytesIsRejected)
{
    feed(oneXTrafficFERPacket(true).size(16));
    EXPECT_TRUE(showsNothing());
    EXPECT_FALSE(state.contains("TrafficFER"));
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x119d is 16 bytes long but must be at least 17 bytes."}));
}

TEST_F(C2KTrafficFERTest, ARecordWithoutTheDemodulationSaysSo)
{
    feed(oneXTrafficFERPacket(true).u8(14, 1));
    feed(oneXTrafficFERPacket(true).u8(14, 0).size(17));
    EXPECT_FALSE(state.contains("TrafficFER"));
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{4, "Log code 0x119d: missing traffic demod subpacket."},
                            Line{4, "Log code 0x119d: missing traffic demod subpacket."}));
}

TEST_F(C2KTrafficFERTest, AMarkPastTheEndIsNoErasure)
{
    feed(oneXTrafficFERPacket(true).size(17 + 7 + 24));
    EXPECT_EQ(rate(), "0.00%");
}

} // namespace ventrik
