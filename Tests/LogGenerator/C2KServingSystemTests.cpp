#include "Tests/LogGenerator/C2KFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using Line = CapturingSystemLog::Line;

struct Roaming {
    std::uint32_t indicator;
    const char* text;
};

constexpr Roaming roamings[] = {{0, "OFF [0]"},
                                {1, "ON [1]"},
                                {2, "Flashing [2]"},
                                {3, "Out of Neighborhood [3]"},
                                {4, "Out of Building [4]"},
                                {5, "Preferred system [5]"},
                                {6, "Available system [6]"},
                                {7, "Alliance partner [7]"},
                                {8, "Premium partner [8]"},
                                {9, "Full service functionality [9]"},
                                {10, "Partial service functionality [10]"},
                                {11, "Banner ON [11]"},
                                {12, "Banner OFF [12]"},
                                {13, "ERI - 13"},
                                {255, "ERI - 255"},
                                {256, "ERI - 256"},
                                {0x7FFFFFFF, "ERI - 2147483647"},
                                {0xFFFFFFFF, "ERI - -1"}};

using C2KServingSystemTest = C2KFixture;

} // namespace

TEST_F(C2KServingSystemTest, ShowsTheWholeRecord)
{
    feed(servingSystemPacket());
    EXPECT_EQ(shown("k1xRoamingHome"), "ON [1]");
    EXPECT_EQ(shown("kSystemId"), "4139");
    EXPECT_EQ(shown("kNetworkId"), "7");
    EXPECT_EQ(shown("kPacketZoneId"), "9");
    EXPECT_EQ(shown("kBaseId"), "1201");
    EXPECT_EQ(shown("kProtocolRevision"), "6");
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KServingSystemTest, NumbersAreUnsigned)
{
    feed(servingSystemPacket().u32(50, 0xFFFFFFFF).bytes(131, Bytes(3, 255)).u16(184, 0xFFFF));
    EXPECT_EQ(shown("kSystemId"), "65535");
    EXPECT_EQ(shown("kNetworkId"), "65535");
    EXPECT_EQ(shown("kPacketZoneId"), "255");
    EXPECT_EQ(shown("kBaseId"), "65535");
    EXPECT_EQ(shown("kProtocolRevision"), "255");
}

TEST_F(C2KServingSystemTest, NamesEveryRoamingIndicator)
{
    for (const Roaming& roaming : roamings) {
        feed(servingSystemPacket().u32(42, roaming.indicator));
        EXPECT_EQ(shown("k1xRoamingHome"), roaming.text);
    }
}

TEST_F(C2KServingSystemTest, OnlyOneSystemTypeHasANumberedIdentity)
{
    for (const auto& [type, text] : {std::pair<std::uint32_t, std::string>{0, "0"},
                                     {1, "1"},
                                     {3, "3"},
                                     {258, "258"},
                                     {0xFFFFFFFF, "-1"}}) {
        feed(servingSystemPacket().u32(46, type));
        EXPECT_EQ(shown("kSystemId"), "(unknown system type " + text + ")");
        EXPECT_EQ(shown("kNetworkId"), "(unknown system type " + text + ")");
        EXPECT_EQ(shown("kBaseId"), "1201");
    }
}

TEST_F(C2KServingSystemTest, ARecordOf170BytesIsRejected)
{
    feed(servingSystemPacket().size(170));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x134f is 170 bytes long but must be at least 171 bytes."}));
}

TEST_F(C2KServingSystemTest, AShorterRecordHasNoBaseStation)
{
    feed(servingSystemPacket().size(171));
    EXPECT_EQ(shown("kBaseId"), "");
    EXPECT_EQ(shown("kProtocolRevision"), "6");
    feed(servingSystemPacket().size(185));
    EXPECT_EQ(shown("kBaseId"), "");
    feed(servingSystemPacket().size(186));
    EXPECT_EQ(shown("kBaseId"), "1201");
    feed(servingSystemPacket().u16(184, 9).size(185));
    EXPECT_EQ(shown("kBaseId"), "1201");
}

TEST_F(C2KServingSystemTest, OlderVersionsAreDropped)
{
    feed(servingSystemPacket().u8(13, 0));
    feed(servingSystemPacket().u8(13, 1));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(
            Line{3, "Log code 0x134f has version=0; only version 2 or higher expected; dropping."},
            Line{3,
                 "Log code 0x134f has version=1; only version 2 or higher expected; dropping."}));
    feed(servingSystemPacket().u8(13, 255));
    EXPECT_EQ(shown("kBaseId"), "1201");
}

} // namespace ventrik
