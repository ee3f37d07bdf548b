#include "Tests/LogGenerator/C2KFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using Line = CapturingSystemLog::Line;

constexpr const char* deviceStates[] = {"Inactive [0]",
                                        "Deep sleep in start state [1]",
                                        "Initial state for CDMA operation [2]",
                                        "Acquisition [3]",
                                        "Sync [4]",
                                        "Slew [5]",
                                        "Paging [6]",
                                        "Slotted mode sleep state [7]",
                                        "Traffic [8]",
                                        "UnSlew [9]",
                                        "Operation in PCG state [10]",
                                        "Powerup state [11]",
                                        "[Bad Value 12]"};

// Offsets in the golden packet.
constexpr std::size_t stateOffset = 21;
constexpr std::size_t radioOffset = 22;
constexpr std::size_t activeSetOffset = 36;
constexpr std::size_t firstPilotOffset = 48;

struct Level {
    std::int8_t raw;
    const char* text;
};

// In steps of 0.334 dB from -63.248 dBm.
constexpr Level levels[] = {{0, "-63.25 dBm"},
                            {10, "-59.91 dBm"},
                            {127, "-20.83 dBm"},
                            {-1, "-63.58 dBm"},
                            {-128, "-106.00 dBm"}};

struct TransmitLevel {
    std::int16_t raw;
    const char* text;
};

constexpr TransmitLevel transmitLevels[] = {{0, "+0.00 dBm"},
                                            {230, "+23.00 dBm"},
                                            {-1, "-0.10 dBm"},
                                            {32767, "+3276.70 dBm"},
                                            {-32768, "-3276.80 dBm"}};

struct PilotEnergy {
    std::uint16_t n;
    std::uint8_t m;
    std::uint8_t e;
    std::uint16_t energy;
    const char* text;
};

// 2^(2e - 3) * energy / (9 n n m) - 1 / n
constexpr PilotEnergy pilotEnergies[] = {
    {1, 1, 0, 144, "+0.00 dB"},    // 18 / 9 - 1
    {1, 1, 0, 792, "+10.00 dB"},   // 99 / 9 - 1
    {1, 1, 1, 198, "+10.00 dB"},   // 99 / 9 - 1
    {2, 1, 2, 27, "+0.00 dB"},     // 54 / 36 - 1 / 2
    {2, 1, 2, 10, "-12.55 dB"},    // 20 / 36 - 1 / 2
    {2, 2, 2, 54, "+0.00 dB"},     // 108 / 72 - 1 / 2
    {1, 1, 255, 1, "+1516.68 dB"}, // 2^507 / 9 - 1
    {1, 1, 0, 72, "-50.00 dB"},    // 0
    {1, 1, 0, 0, "-50.00 dB"},     // -1
    {0, 1, 0, 100, "-50.00 dB"},   // infinity - infinity
    {0, 1, 0, 0, "-50.00 dB"},     // 0 / 0
    {1, 0, 0, 100, "+inf dB"},     // infinity
    {1, 0, 0, 0, "-50.00 dB"},     // 0 / 0
    {65535, 255, 0, 65535, "-50.00 dB"},
};

class C2KOneXStatusTest : public C2KFixture
{
  protected:
    std::vector<std::string> activeSet() { return group("k1xActiveSetInfo"); }
};

Bytes stateContent(std::uint8_t state)
{
    return {state};
}

const Bytes radioContent(10);

// Two pilots of 20 bytes, the energy of each 144.
Bytes activeSetContent()
{
    Bytes content(48);
    content[0] = content[2] = content[5] = 1;
    content[4] = 2;
    for (std::size_t pilot : {8, 28}) {
        content[pilot] = static_cast<std::uint8_t>(pilot);
        content[pilot + 16] = 144;
    }
    return content;
}

} // namespace

TEST_F(C2KOneXStatusTest, ShowsTheWholeRecordInTraffic)
{
    feed(oneXStatusPacket());
    EXPECT_EQ(shown("k1xDeviceState"), "Traffic [8]");
    EXPECT_EQ(shown("k1xRx0BandClass"), "1.8 to 2.0GHz PCS band [1]");
    EXPECT_EQ(shown("k1xRx0ChanNum"), "283");
    EXPECT_EQ(shown("k1xRxAGC0"), "-59.91 dBm");
    EXPECT_EQ(shown("k1xRx1BandClass"), "800 MHz cellular band [0]");
    EXPECT_EQ(shown("k1xRx1ChanNum"), "384");
    EXPECT_EQ(shown("k1xRxAGC1"), "-63.58 dBm");
    EXPECT_EQ(shown("k1xTxAGC"), "-12.50 dBm");
    EXPECT_THAT(activeSet(),
                ElementsAre("_sorted=_sorted", "0;168=(ref pilot) +10.00 dB", "1;12=-3.01 dB"));
    EXPECT_EQ(shown("k1xTrafficFER"), "");
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KOneXStatusTest, OutsideTrafficOnlyTheFirstChainHasValues)
{
    for (const int deviceState : {0, 6, 7, 9, 255}) {
        feed(oneXStatusPacket());
        feed(oneXStatusPacket().u8(stateOffset, static_cast<std::uint8_t>(deviceState)));
        EXPECT_EQ(shown("k1xRx0ChanNum"), "283");
        EXPECT_EQ(shown("k1xRxAGC0"), "-59.91 dBm");
        for (const char* key : {"k1xRx1BandClass", "k1xRx1ChanNum", "k1xRxAGC1", "k1xTxAGC"})
            EXPECT_EQ(shown(key), "N/A") << key;
        EXPECT_THAT(activeSet(), SizeIs(3));
    }
}

TEST_F(C2KOneXStatusTest, NamesEveryDeviceState)
{
    std::uint8_t value = 0;
    for (const char* text : deviceStates) {
        feed(oneXStatusPacket().u8(stateOffset, value++));
        EXPECT_EQ(shown("k1xDeviceState"), text);
    }
    feed(oneXStatusPacket().u8(stateOffset, 255));
    EXPECT_EQ(shown("k1xDeviceState"), "[Bad Value 255]");
}

TEST_F(C2KOneXStatusTest, BandClassesHaveAllTheirBits)
{
    feed(oneXStatusPacket().u8(radioOffset + 4, 255).u8(radioOffset + 5, 13));
    EXPECT_EQ(shown("k1xRx0BandClass"), "[Bad Value 255]");
    EXPECT_EQ(shown("k1xRx1BandClass"), "[Bad Value 13]");
    feed(oneXStatusPacket().u8(radioOffset + 4, 12).u8(radioOffset + 5, 9));
    EXPECT_EQ(shown("k1xRx0BandClass"), "800 MHz European PAMR band [12]");
    EXPECT_EQ(shown("k1xRx1BandClass"), "900 MHzband [9]");
}

TEST_F(C2KOneXStatusTest, ChannelsAreUnsigned)
{
    feed(oneXStatusPacket().u16(radioOffset + 6, 0xFFFF).u16(radioOffset + 8, 0xFFFE));
    EXPECT_EQ(shown("k1xRx0ChanNum"), "65535");
    EXPECT_EQ(shown("k1xRx1ChanNum"), "65534");
}

TEST_F(C2KOneXStatusTest, ReceiveLevelsOfBothChains)
{
    for (const Level& level : levels) {
        const auto raw = static_cast<std::uint8_t>(level.raw);
        feed(oneXStatusPacket().u8(radioOffset + 10, raw));
        EXPECT_EQ(shown("k1xRxAGC0"), level.text);
        feed(oneXStatusPacket().u8(radioOffset + 11, raw));
        EXPECT_EQ(shown("k1xRxAGC1"), level.text);
    }
}

TEST_F(C2KOneXStatusTest, TransmitLevels)
{
    for (const TransmitLevel& level : transmitLevels) {
        feed(oneXStatusPacket().u16(radioOffset + 12, static_cast<std::uint16_t>(level.raw)));
        EXPECT_EQ(shown("k1xTxAGC"), level.text);
    }
}

TEST_F(C2KOneXStatusTest, PilotLevels)
{
    for (const PilotEnergy& pilot : pilotEnergies) {
        feed(oneXStatusPacket()
                 .u16(activeSetOffset + 4, pilot.n)
                 .u8(activeSetOffset + 6, pilot.m)
                 .u8(activeSetOffset + 7, pilot.e)
                 .u8(activeSetOffset + 8, 1)
                 .u16(firstPilotOffset, 5)
                 .u16(firstPilotOffset + 16, pilot.energy));
        EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted", std::string("0;5=") + pilot.text));
    }
}

TEST_F(C2KOneXStatusTest, NoPilotsLeaveTheMarkerAlone)
{
    feed(oneXStatusPacket().u8(activeSetOffset + 8, 0));
    EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted"));
}

TEST_F(C2KOneXStatusTest, EveryPilotOfTheReferencesOffsetIsMarked)
{
    feed(oneXStatusPacket().u16(firstPilotOffset + 20, 168));
    EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted", "0;168=(ref pilot) +10.00 dB",
                                         "1;168=(ref pilot) -3.01 dB"));
    feed(oneXStatusPacket().u16(activeSetOffset + 10, 511));
    EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted", "0;168=+10.00 dB", "1;12=-3.01 dB"));
}

TEST_F(C2KOneXStatusTest, TheFieldCountSetsLengthAndPlace)
{
    struct FieldLayout {
        std::uint8_t fields;
        std::size_t stride;
        std::size_t energyOffset;
    };
    for (const FieldLayout& layout :
         {FieldLayout{0, 12, 12}, {1, 20, 16}, {2, 24, 20}, {3, 32, 24}, {255, 1544, 1032}}) {
        // The active set comes last and has room for two pilots.
        Bytes content(8 + 2 * layout.stride + 4);
        content[0] = content[2] = 1;
        content[4] = 2;
        content[5] = layout.fields;
        content[6] = 1;
        content[8] = 100;
        content[8 + layout.energyOffset] = 144;
        content[8 + layout.stride] = layout.energyOffset == layout.stride ? 144 : 101;
        content[8 + layout.stride + layout.energyOffset] = 108;
        feed(subpacketRecord(0x119C,
                             {{1, stateContent(8)}, {2, radioContent}, {4, {}}, {3, content}}));
        EXPECT_THAT(activeSet(),
                    ElementsAre("_sorted=_sorted", "0;100=+0.00 dB",
                                layout.fields == 0 ? "1;144=-3.01 dB" : "1;101=-3.01 dB"))
            << int{layout.fields};
    }
}

TEST_F(C2KOneXStatusTest, PilotsStopAtTheLastCompleteOne)
{
    const PacketBuilder record = subpacketRecord(
        0x119C, {{1, stateContent(8)}, {2, radioContent}, {4, {}}, {3, activeSetContent()}});
    const std::size_t size = record.build().size();
    // Behind the energy of a pilot come two bytes more.
    feed(PacketBuilder(record).size(size - 2));
    EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted", "0;8=+0.00 dB", "1;28=+0.00 dB"));
    feed(PacketBuilder(record).size(size - 3));
    EXPECT_THAT(activeSet(), ElementsAre("_sorted=_sorted", "0;8=+0.00 dB"));
}

TEST_F(C2KOneXStatusTest, PilotsMayLieBehindTheirSubpacket)
{
    feed(oneXStatusPacket().u8(activeSetOffset + 8, 3).u16(activeSetOffset + 2, 52).size(106));
    EXPECT_THAT(activeSet(), SizeIs(1 + 3)); // the third begins at byte 88, its energy at 104
    feed(oneXStatusPacket().u8(activeSetOffset + 8, 3).size(105));
    EXPECT_THAT(activeSet(), SizeIs(1 + 2));
}

TEST_F(C2KOneXStatusTest, SubpacketsComeInAnyOrder)
{
    feed(subpacketRecord(0x119C, {{4, {}},
                                  {9, Bytes(30)},
                                  {3, activeSetContent()},
                                  {1, stateContent(6)},
                                  {2, radioContent}}));
    EXPECT_EQ(shown("k1xDeviceState"), "Paging [6]");
    EXPECT_THAT(activeSet(), SizeIs(3));
}

TEST_F(C2KOneXStatusTest, TheFirstOfTwoSubpacketsCounts)
{
    feed(subpacketRecord(0x119C, {{1, stateContent(6)},
                                  {1, stateContent(8)},
                                  {2, radioContent},
                                  {3, activeSetContent()},
                                  {4, {}}}));
    EXPECT_EQ(shown("k1xDeviceState"), "Paging [6]");
}

TEST_F(C2KOneXStatusTest, AMissingSubpacketIsNamedAndNothingShown)
{
    const std::vector<std::pair<Subpacket, std::string>> all{
        {{1, stateContent(8)}, "(ss=0,rf=1,ai=1,fi=1)"},
        {{2, radioContent}, "(ss=1,rf=0,ai=1,fi=1)"},
        {{3, activeSetContent()}, "(ss=1,rf=1,ai=0,fi=1)"},
        {{4, {}}, "(ss=1,rf=1,ai=1,fi=0)"}};
    for (const auto& [missing, text] : all) {
        std::vector<Subpacket> others;
        for (const auto& [subpacket, ignored] : all)
            if (subpacket.first != missing.first)
                others.push_back(subpacket);
        platform.log.clear();
        feed(subpacketRecord(0x119C, others));
        EXPECT_THAT(platform.log.lines(),
                    ElementsAre(Line{4, "Log code 0x119c: missing subpacket " + text + "."}));
    }
    EXPECT_TRUE(showsNothing());
}

TEST_F(C2KOneXStatusTest, ACountThatLeavesOutTheFourthMissesIt)
{
    feed(oneXStatusPacket().u8(14, 3));
    feed(oneXStatusPacket().u8(14, 0));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{4, "Log code 0x119c: missing subpacket (ss=1,rf=1,ai=1,fi=0)."},
                            Line{4, "Log code 0x119c: missing subpacket (ss=0,rf=0,ai=0,fi=0)."}));
}

TEST_F(C2KOneXStatusTest, EachSearchReportsABadSize)
{
    feed(oneXStatusPacket().u16(radioOffset + 2, 5000));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{3, "Log code error in subpkt#1: bad size (5000)."},
                            Line{3, "Log code error in subpkt#1: bad size (5000)."},
                            Line{3, "Log code error in subpkt#1: bad size (5000)."},
                            Line{4, "Log code 0x119c: missing subpacket (ss=1,rf=0,ai=0,fi=0)."}));
}

// The limit is 17 bytes behind the end of the packet, here 92 + 17.
TEST_F(C2KOneXStatusTest, ASizeThatReachesTheLimitIsBadEvenWhereItIsWanted)
{
    feed(oneXStatusPacket().u16(90, 21)); // the fourth subpacket, from byte 88 on
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{3, "Log code error in subpkt#3: bad size (21)."},
                            Line{4, "Log code 0x119c: missing subpacket (ss=1,rf=1,ai=1,fi=0)."}));
    feed(oneXStatusPacket().u16(90, 20));
    EXPECT_EQ(shown("k1xDeviceState"), "Traffic [8]");
}

TEST_F(C2KOneXStatusTest, SubpacketsOfNoSizeEndWithTheirCount)
{
    feed(PacketBuilder(0x119C).u8(14, 255).size(40));
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{4, "Log code 0x119c: missing subpacket (ss=0,rf=0,ai=0,fi=0)."}));
}

TEST_F(C2KOneXStatusTest, ARecordOf16BytesIsRejected)
{
    feed(oneXStatusPacket().size(16));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x119c is 16 bytes long but must be at least 17 bytes."}));
}

TEST_F(C2KOneXStatusTest, ARecordOf17BytesIsSearched)
{
    feed(oneXStatusPacket().size(17));
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{4, "Log code 0x119c: missing subpacket (ss=0,rf=0,ai=0,fi=0)."}));
}

} // namespace ventrik
