#include "Tests/LogGenerator/C2KFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using Line = CapturingSystemLog::Line;

struct Strength {
    std::uint16_t raw;
    const char* text;
};

constexpr Strength strengths[] = {{0, "-inf dB"},     {1, "-27.09 dB"},    {51, "-10.02 dB"},
                                  {256, "-3.01 dB"},  {511, "-0.01 dB"},   {512, "+0.00 dB"},
                                  {1024, "+3.01 dB"}, {65535, "+21.07 dB"}};

using C2KActiveSetPilotsTest = C2KFixture;
using C2KFingerC2ITest = C2KFixture;

} // namespace

TEST_F(C2KActiveSetPilotsTest, ShowsEachPilotInASortedGroup)
{
    feed(activeSetPilotsPacket());
    EXPECT_THAT(group("kActiveSetPilots"),
                ElementsAre("_sorted=_sorted", "0;264=+0.00 dB", "1;12=-3.01 dB"));
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KActiveSetPilotsTest, StrengthsAreIn512ths)
{
    for (const Strength& strength : strengths) {
        feed(activeSetPilotsPacket().u8(15, 1).u16(27, strength.raw));
        EXPECT_THAT(group("kActiveSetPilots"),
                    ElementsAre("_sorted=_sorted", std::string("0;264=") + strength.text));
    }
}

TEST_F(C2KActiveSetPilotsTest, TheLastRecordReadIsKnown)
{
    feed(activeSetPilotsPacket());
    ASSERT_TRUE(generator->lastRead());
    EXPECT_EQ(generator->lastRead()->logCode, 0x12B6U);
    EXPECT_EQ(generator->lastRead()->kind, LayoutKind::Base);
    feed(PacketBuilder(0x12B6).size(24));
    EXPECT_EQ(generator->lastRead(), nullptr);
}

TEST_F(C2KActiveSetPilotsTest, APilotsLevelIsANumberAsItShows)
{
    feed(activeSetPilotsPacket());
    const auto levelOf = [this](std::string_view key) {
        auto place =
            generator->cellPlaceAt(state, std::vector<std::string_view>{"kActiveSetPilots", key});
        const auto cell = place ? generator->cellAt(*place) : std::nullopt;
        return cell ? cell->number() : std::nullopt;
    };
    EXPECT_EQ(levelOf("1;12"), -3.01);
    EXPECT_EQ(levelOf("0;264"), 0.0);
    EXPECT_EQ(levelOf("0;12"), std::nullopt);
    EXPECT_EQ(levelOf("2;12"), std::nullopt);
    EXPECT_EQ(levelOf("_sorted"), std::nullopt);
    feed(activeSetPilotsPacket().u8(15, 0).size(25));
    EXPECT_EQ(levelOf("1;12"), std::nullopt);
}

TEST_F(C2KActiveSetPilotsTest, NoPilotsAreSaidToBeNone)
{
    feed(activeSetPilotsPacket());
    feed(activeSetPilotsPacket().u8(15, 0).size(25));
    EXPECT_EQ(shown("kActiveSetPilots"), "(none)");
}

TEST_F(C2KActiveSetPilotsTest, TakesAsManyPilotsAsARecordCanCount)
{
    feed(PacketBuilder(0x12B6).u8(15, 255).size(25 + 12 * 255).u16(25 + 12 * 254, 0xFFFF));
    const auto entries = group("kActiveSetPilots");
    ASSERT_THAT(entries, SizeIs(256));
    EXPECT_EQ(entries[255], "254;65535=-inf dB");
}

TEST_F(C2KActiveSetPilotsTest, ARecordOf24BytesIsRejected)
{
    feed(activeSetPilotsPacket().size(24));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x12b6 is 24 bytes long but must be at least 25 bytes."}));
}

TEST_F(C2KActiveSetPilotsTest, ARecordThatEndsWithinItsPilotsIsRejected)
{
    feed(activeSetPilotsPacket().size(48));
    feed(activeSetPilotsPacket().size(25));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{3, "Log code 0x12b6 is 48 bytes long, but has 2 substructs."},
                            Line{3, "Log code 0x12b6 is 25 bytes long, but has 2 substructs."}));
}

TEST_F(C2KActiveSetPilotsTest, ALongerRecordIsTaken)
{
    feed(activeSetPilotsPacket().size(50));
    EXPECT_THAT(group("kActiveSetPilots"), SizeIs(3));
}

TEST_F(C2KFingerC2ITest, SkipsUnassignedFingersAndCountsThem)
{
    feed(fingerC2IPacket());
    EXPECT_THAT(group("kFingerC2I"),
                ElementsAre("_sorted=_sorted", "0;168=-3.01 dB", "2;512=+3.01 dB"));
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KFingerC2ITest, RatiosAreIn512ths)
{
    for (const Strength& strength : strengths) {
        feed(fingerC2IPacket().u8(22, 1).u16(29, strength.raw).size(37));
        EXPECT_THAT(group("kFingerC2I"),
                    ElementsAre("_sorted=_sorted", std::string("0;168=") + strength.text));
    }
}

TEST_F(C2KFingerC2ITest, NoFingersAreSaidToBeNone)
{
    feed(fingerC2IPacket());
    feed(fingerC2IPacket().u8(22, 0).size(23));
    EXPECT_EQ(shown("kFingerC2I"), "(none)");
}

TEST_F(C2KFingerC2ITest, UnassignedFingersAloneAreNone)
{
    feed(PacketBuilder(0x108A).u8(22, 2).u16(23, 0xFFFF).u16(37, 0xFFFF).size(51));
    EXPECT_EQ(shown("kFingerC2I"), "(none)");
}

TEST_F(C2KFingerC2ITest, TakesAsManyFingersAsARecordCanCount)
{
    feed(PacketBuilder(0x108A).u8(22, 255).size(23 + 14 * 255).u16(23 + 14 * 254, 9));
    const auto entries = group("kFingerC2I");
    ASSERT_THAT(entries, SizeIs(256));
    EXPECT_EQ(entries[255], "254;9=-inf dB");
}

TEST_F(C2KFingerC2ITest, ARecordOf22BytesIsRejected)
{
    feed(fingerC2IPacket().size(22));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(Line{3, "Log code 0x108a is 22 bytes long but must be at least 23 bytes."}));
}

TEST_F(C2KFingerC2ITest, ARecordThatDoesNotEndWithItsFingersIsRejected)
{
    feed(fingerC2IPacket().size(64));
    feed(fingerC2IPacket().size(66));
    feed(fingerC2IPacket().u8(22, 0).size(24));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(
        platform.log.lines(),
        ElementsAre(
            Line{3, "Log code 0x108a has bad length of 64 bytes, but has 3 substructs (size=23)."},
            Line{3, "Log code 0x108a has bad length of 66 bytes, but has 3 substructs (size=23)."},
            Line{3,
                 "Log code 0x108a has bad length of 24 bytes, but has 0 substructs (size=23)."}));
}

} // namespace ventrik
