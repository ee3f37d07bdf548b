#include "Tests/LogGenerator/C2KFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using Line = CapturingSystemLog::Line;

struct Label {
    std::uint8_t value;
    const char* text;
};

constexpr Label deviceStates[] = {{0, "Inactive [0]"}, {1, "Acquisition [1]"}, {2, "Sync [2]"},
                                  {3, "Idle [3]"},     {4, "Access [4]"},      {5, "Connected [5]"},
                                  {6, "[Reserved 6]"}, {255, "[Reserved 255]"}};

constexpr Label sessionStates[] = {
    {0, "Closed [0]"}, {1, "AMP setup [1]"}, {2, "AT-initiated neg [2]"}, {3, "Initiated neg [3]"},
    {4, "Open [4]"},   {5, "[Reserved 5]"},  {255, "[Reserved 255]"}};

// The five bits of the record hold no more than 31.
constexpr Label bandClasses[] = {{0, "800 MHz cellular band [0]"},
                                 {1, "1.8 to 2.0GHz PCS band [1]"},
                                 {2, "872 to 960MHz TACS band [2]"},
                                 {3, "832 to 925MHz JTACS band [3]"},
                                 {4, "1.75 to 1.87GHz Korean PCS band [4]"},
                                 {5, "450MHz band [5]"},
                                 {6, "2GHz band [6]"},
                                 {7, "700MHz band [7]"},
                                 {8, "1800 MHz band [8]"},
                                 {9, "900 MHzband [9]"},
                                 {10, "Secondary 800 MHz band [10]"},
                                 {11, "400 MHz European PAMR band [11]"},
                                 {12, "800 MHz European PAMR band [12]"},
                                 {13, "[Bad Value 13]"},
                                 {31, "[Bad Value 31]"}};

using C2KEVDOStatusTest = C2KFixture;

} // namespace

TEST_F(C2KEVDOStatusTest, ShowsTheWholeRecord)
{
    feed(evdoStatusPacket());
    EXPECT_EQ(shown("kChannel"), "283");
    EXPECT_EQ(shown("k1xEVDODeviceState"), "Connected [5]");
    EXPECT_EQ(shown("kBandClass"), "1.8 to 2.0GHz PCS band [1]");
    EXPECT_EQ(shown("kRxAGC0"), "-71 dBm");
    EXPECT_EQ(shown("kRxAGC1"), "-74 dBm");
    EXPECT_EQ(shown("kTxAGC"), "-12 dBm");
    EXPECT_EQ(shown("kServingPNOffset"), "264 × 64chips");
    EXPECT_EQ(shown("kSessionState"), "Open [4]");
    EXPECT_EQ(shown("kUATI24"), "0x0a1b2c");
    EXPECT_EQ(shown("kColorCode"), "37");
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KEVDOStatusTest, OnlyARecordOf50BytesIsTaken)
{
    feed(evdoStatusPacket().size(49));
    feed(evdoStatusPacket().size(51));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{3, "Log code 0x1183 is 49 bytes long but should be 50 bytes."},
                            Line{3, "Log code 0x1183 is 51 bytes long but should be 50 bytes."}));
}

TEST_F(C2KEVDOStatusTest, NamesEveryDeviceState)
{
    for (const Label& label : deviceStates) {
        feed(evdoStatusPacket().u8(36, label.value));
        EXPECT_EQ(shown("k1xEVDODeviceState"), label.text);
    }
}

TEST_F(C2KEVDOStatusTest, NamesEverySessionState)
{
    for (const Label& label : sessionStates) {
        feed(evdoStatusPacket().u8(37, label.value));
        EXPECT_EQ(shown("kSessionState"), label.text);
    }
}

TEST_F(C2KEVDOStatusTest, NamesEveryBandClass)
{
    for (const Label& bandClass : bandClasses) {
        feed(evdoStatusPacket().u8(14, static_cast<std::uint8_t>(bandClass.value << 3)));
        EXPECT_EQ(shown("kBandClass"), bandClass.text);
    }
}

TEST_F(C2KEVDOStatusTest, TheChannelHas11Bits)
{
    feed(evdoStatusPacket().u8(13, 0xFF).u8(14, 0x07));
    EXPECT_EQ(shown("kChannel"), "2047");
    EXPECT_EQ(shown("kBandClass"), "800 MHz cellular band [0]");
    feed(evdoStatusPacket().u8(13, 0).u8(14, 0xF8));
    EXPECT_EQ(shown("kChannel"), "0");
}

TEST_F(C2KEVDOStatusTest, BeforeAccessOnlyTheFirstChainHasALevel)
{
    feed(evdoStatusPacket().u8(36, 3));
    EXPECT_EQ(shown("kRxAGC0"), "-71 dBm");
    EXPECT_EQ(shown("kRxAGC1"), "N/A");
    EXPECT_EQ(shown("kTxAGC"), "N/A");
}

TEST_F(C2KEVDOStatusTest, FromAccessOnLevelsCarryTheirSign)
{
    feed(evdoStatusPacket().u8(36, 4).u8(15, 0).u8(16, 5).u8(17, 0x80));
    EXPECT_EQ(shown("kRxAGC0"), "+0 dBm");
    EXPECT_EQ(shown("kRxAGC1"), "+5 dBm");
    EXPECT_EQ(shown("kTxAGC"), "-128 dBm");
    feed(evdoStatusPacket().u8(36, 255).u8(16, 127));
    EXPECT_EQ(shown("kRxAGC1"), "+127 dBm");
}

TEST_F(C2KEVDOStatusTest, APNOffsetOfAllOnesIsInvalid)
{
    feed(evdoStatusPacket().u16(18, 0xFFFF));
    EXPECT_EQ(shown("kServingPNOffset"), "Invalid Value");
    feed(evdoStatusPacket().u16(18, 0xFFFE));
    EXPECT_EQ(shown("kServingPNOffset"), "65534 × 64chips");
    feed(evdoStatusPacket().u16(18, 0));
    EXPECT_EQ(shown("kServingPNOffset"), "0 × 64chips");
}

TEST_F(C2KEVDOStatusTest, TheUATIHasSixDigits)
{
    feed(evdoStatusPacket().bytes(38, Bytes{0x01, 0, 0, 255}));
    EXPECT_EQ(shown("kUATI24"), "0x000001");
    EXPECT_EQ(shown("kColorCode"), "255");
    feed(evdoStatusPacket().bytes(38, Bytes{0xFF, 0xFF, 0xFF, 0}));
    EXPECT_EQ(shown("kUATI24"), "0xffffff");
    EXPECT_EQ(shown("kColorCode"), "0");
}

} // namespace ventrik
