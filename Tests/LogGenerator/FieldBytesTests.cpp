#include "LogGenerator/Orbel/FieldBytes.h"
#include "Packets/ShownNumbers.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

constexpr std::array<Field, 4> fields{
    {{"Byte", u8(13)}, {"Bits", bits(14, 4, 8)}, {"Nibble", bits(14, 0, 4)}, {"Far", u16(30)}}};

class FieldBytesTest : public testing::Test
{
  protected:
    FieldBytesTest() { changes(); }

    std::uint64_t changes() { return bytes.changesIn(LogPacket(packet), words); }

    FieldBytes bytes{fields};
    FieldBytes::Words words;
    Bytes packet = Bytes(32, 0x55);
};

} // namespace

TEST_F(FieldBytesTest, TheSameBytesAreNoChange)
{
    EXPECT_EQ(changes(), 0U);
}

TEST_F(FieldBytesTest, AByteThatChangedTellsEveryFieldThatStandsInIt)
{
    packet[13] = 1;
    EXPECT_EQ(changes(), 0b0001U);
    packet[14] = 1;
    EXPECT_EQ(changes(), 0b0110U);
    packet[15] = 1;
    EXPECT_EQ(changes(), 0b0010U);
    packet[31] = 1;
    EXPECT_EQ(changes(), 0b1000U);
}

TEST_F(FieldBytesTest, ChangesFarFromEachOtherAreToldAtOnce)
{
    packet[13] = 1;
    packet[30] = 1;
    EXPECT_EQ(changes(), 0b1001U);
}

TEST_F(FieldBytesTest, BytesThatNoFieldStandsInDoNotCount)
{
    packet[12] = 1;
    packet[16] = 1;
    packet.push_back(1);
    EXPECT_EQ(changes(), 0U);
}

TEST_F(FieldBytesTest, BytesPastTheEndCountAsZeros)
{
    packet.resize(31);
    EXPECT_EQ(changes(), 0b1000U);
    packet.resize(32);
    EXPECT_EQ(changes(), 0U);
}

TEST_F(FieldBytesTest, IsOfTheTableItWasMadeFor)
{
    EXPECT_TRUE(bytes.areOf(fields));
    EXPECT_FALSE(bytes.areOf(std::span(fields).first(3)));
    EXPECT_FALSE(bytes.areOf(std::span(fields).subspan(1)));
}

} // namespace ventrik
