#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/Orbel/UTRAN/UTRANSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

// A record that announces so many channels of each kind, all bytes of them 0.
PacketBuilder record(std::uint32_t transport, std::uint32_t composite)
{
    return PacketBuilder(0xD00C)
        .bits(14, 6, 6, transport)
        .bits(15, 4, 4, composite)
        .size(289 + 34 * transport + 8 * composite);
}

// Two transport channels and a composite one, byte for byte.
PacketBuilder smallRecord()
{
    return PacketBuilder(0xD00C)
        .u8(14, 0x80)
        .u8(15, 0x10)
        .bytes(17, Bytes{1, 2, 24, 100})
        .bytes(357, Bytes{5, 4, 10, 11, 12, 13, 14, 255});
}

using TRCHBLERTest = ListSectionFixture<TRCHBLERMeasurement>;

class CCTRCHSIRTest : public ListSectionFixture<CCTRCHSIRMeasurement>
{
  protected:
    std::vector<std::string> ratios(std::size_t row)
    {
        std::vector<std::string> texts;
        for (const PlistValue& ratio : *rows[row].dictionary()->find("SIR")->array())
            texts.push_back(*ratio.string());
        return texts;
    }
};

} // namespace

TEST_F(TRCHBLERTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "TRCH BLER");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD00C));
}

TEST_F(TRCHBLERTest, ShowsEachChannelInARow)
{
    feed(smallRecord());
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_EQ(shown(0, "TRCH ID"), "1");
    EXPECT_EQ(shown(0, "TRCH BLER Measurement"), "2");
    EXPECT_EQ(shown(1, "TRCH ID"), "24");
    EXPECT_EQ(shown(1, "TRCH BLER Measurement"), "100");
    EXPECT_THAT(keysOf(*rows[0].dictionary()), ElementsAre("TRCH ID", "TRCH BLER Measurement"));
}

TEST_F(TRCHBLERTest, ValuesAreUnsignedBytes)
{
    feed(record(1, 0).u8(17, 255).u8(18, 255));
    EXPECT_EQ(shown(0, "TRCH ID"), "255");
    EXPECT_EQ(shown(0, "TRCH BLER Measurement"), "255");
}

TEST_F(TRCHBLERTest, TracesAtNoticeLevel)
{
    feed(smallRecord());
    EXPECT_THAT(log.lines(), ElementsAre(Line{5, "TRCH BLER Measurement"}));
}

TEST_F(TRCHBLERTest, TheCountIsItsSixBits)
{
    feed(record(63, 15));
    EXPECT_EQ(rows.size(), 63U);
    feed(record(63, 15).u8(14, 0x3F).u8(15, 0xF0)); // all other bits of the word
    EXPECT_TRUE(rows.empty());
    feed(record(63, 15).u8(14, 0x40).u8(15, 0x00));
    EXPECT_EQ(rows.size(), 1U);
    feed(record(63, 15).u8(14, 0x00).u8(15, 0x08));
    EXPECT_EQ(rows.size(), 32U);
}

TEST_F(TRCHBLERTest, StopsAtTheLastCompleteChannel)
{
    feed(record(4, 0).size(17 + 5));
    EXPECT_EQ(rows.size(), 2U);
    feed(record(4, 0).size(17 + 6));
    EXPECT_EQ(rows.size(), 3U);
    feed(record(4, 0).size(17));
    EXPECT_TRUE(rows.empty());
}

TEST_F(TRCHBLERTest, ARecordOf16BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(record(1, 1).size(16));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{5, "TRCH BLER Measurement"}));
}

TEST_F(TRCHBLERTest, AnotherCodeLeavesTheListAsItWas)
{
    rows.append("row");
    feed(PacketBuilder(0xD00A).size(200));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{5, "TRCH BLER Measurement"}));
}

TEST_F(CCTRCHSIRTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "CCTRCH SIR");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD00C));
}

TEST_F(CCTRCHSIRTest, ShowsEachChannelInARowWithSixRatios)
{
    feed(smallRecord());
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "CCTRCH ID"), "5");
    EXPECT_EQ(shown(0, "TSNUM"), "4");
    EXPECT_THAT(ratios(0), ElementsAre("10", "11", "12", "13", "14", "255"));
    EXPECT_THAT(keysOf(*rows[0].dictionary()), ElementsAre("CCTRCH ID", "TSNUM", "SIR"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "CCTRCH SIR Measurement"}));
}

TEST_F(CCTRCHSIRTest, ChannelsLieBehindTheRoomOfTheTransportChannels)
{
    feed(record(0, 2).u8(289, 1).u8(297, 2));
    EXPECT_EQ(shown(0, "CCTRCH ID"), "1");
    EXPECT_EQ(shown(1, "CCTRCH ID"), "2");
    feed(record(63, 15).u8(2431, 3).u8(2431 + 8 * 14 + 1, 6)); // 289 + 34 * 63
    ASSERT_EQ(rows.size(), 15U);
    EXPECT_EQ(shown(0, "CCTRCH ID"), "3");
    EXPECT_EQ(shown(14, "TSNUM"), "6");
}

TEST_F(CCTRCHSIRTest, TheCountIsItsFourBits)
{
    feed(record(0, 15));
    EXPECT_EQ(rows.size(), 15U);
    feed(record(63, 15).u8(14, 0xFF).u8(15, 0x0F));
    EXPECT_TRUE(rows.empty());
}

TEST_F(CCTRCHSIRTest, StopsAtTheLastCompleteChannel)
{
    feed(record(0, 3).size(289 + 15));
    EXPECT_EQ(rows.size(), 1U);
    feed(record(0, 3).size(289 + 16));
    EXPECT_EQ(rows.size(), 2U);
    feed(record(0, 3).size(289 + 7));
    EXPECT_TRUE(rows.empty());
}

TEST_F(CCTRCHSIRTest, ARecordThatEndsBeforeTheChannelsEmptiesTheList)
{
    rows.append("row");
    feed(record(2, 3).size(17));
    EXPECT_TRUE(rows.empty());
}

TEST_F(CCTRCHSIRTest, ARecordOf16BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(record(1, 1).size(16));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "CCTRCH SIR Measurement"}));
}

TEST_F(CCTRCHSIRTest, AnotherCodeLeavesTheListAsItWas)
{
    rows.append("row");
    feed(PacketBuilder(0xD00E).size(200));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "CCTRCH SIR Measurement"}));
}

} // namespace ventrik
