#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/ElementField.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class BLERTest : public SectionFixture<BLER>
{
  protected:
    // A record of n transport channels, all bytes of them 0.
    static PacketBuilder blockErrors(std::uint8_t n)
    {
        return PacketBuilder(0x4116).u8(13, n).size(16 + std::size_t{9} * n);
    }
    PlistArray channels() { return *values.find("Transport Channels")->array(); }
    std::string shownOf(std::size_t channel, std::string_view key)
    {
        return textAt(channels()[channel], {key});
    }
};

constexpr ElementField fields[] = {
    {0, 8, 31, "Transport Channel ID", "31"},
    {0, 8, 255, "Transport Channel ID", "255"},
    {1, 32, 70000, "CRC Received", "70000"},
    {1, 32, 0x7FFFFFFF, "CRC Received", "2147483647"},
    {1, 32, 0x80000000, "CRC Received", "-2147483648"},
    {5, 32, 70001, "CRC Received in Error", "70001"},
    {5, 32, 0xFFFFFFFF, "CRC Received in Error", "-1"},
};

} // namespace

TEST_F(BLERTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "BLER");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x4116));
}

TEST_F(BLERTest, EachFieldIsReadFromItsBytesAlone)
{
    expectElementFields(fields, blockErrors(2), 25, 9,
                        [this](const PacketBuilder& packet, std::string_view key) {
                            feed(packet);
                            return shownOf(1, key);
                        });
}

TEST_F(BLERTest, ShowsItsKeysInOrder)
{
    feed(blockErrors(1).u16(14, 65535));
    EXPECT_THAT(keysOf(values), ElementsAre("Window Size", "Transport Channels"));
    EXPECT_EQ(shown("Window Size"), "65535");
    EXPECT_THAT(keysOf(*channels()[0].dictionary()),
                ElementsAre("Transport Channel ID", "CRC Received", "CRC Received in Error"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "BLER"}));
}

TEST_F(BLERTest, ARecordWithoutChannelsShowsAnEmptyList)
{
    feed(blockErrors(2));
    feed(blockErrors(0).u16(14, 50));
    EXPECT_EQ(shown("Window Size"), "50");
    EXPECT_TRUE(channels().empty());
}

TEST_F(BLERTest, Shows255ChannelsAtMost)
{
    feed(blockErrors(255).u8(16 + 9 * 254, 124));
    ASSERT_EQ(channels().size(), 255U);
    EXPECT_EQ(shownOf(254, "Transport Channel ID"), "124");
}

TEST_F(BLERTest, AChannelNeedsItsNineBytes)
{
    feed(blockErrors(2).size(33));
    EXPECT_EQ(channels().size(), 1U);
    feed(blockErrors(2).size(34));
    EXPECT_EQ(channels().size(), 2U);
    feed(blockErrors(2).size(16));
    EXPECT_TRUE(channels().empty());
}

TEST_F(BLERTest, ARecordOf15BytesChangesNothing)
{
    feed(PacketBuilder(0x4116).u8(13, 1).size(15));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("BLER"));
}

TEST_F(BLERTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0x4221).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(),
                ElementsAre(Line{4, "BLER"}, Line{3, "Received an unknown log message: 16929"}));
}

} // namespace ventrik
