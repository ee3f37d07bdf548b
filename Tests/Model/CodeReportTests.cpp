#include "Model/CodeReport.h"

#include "Packets/PacketBuilder.h"
#include "Tests/Support/IdleGenerator.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

/// A generator that asks for three codes and shows one of them in two sections.
class AskingGenerator : public IdleGenerator
{
  public:
    PlistDictionary getStartCommand() const override
    {
        return {{"SetState", "Streaming"},
                {"SetOrbelLogCodes", PlistArray{0xB0C1, 0xB0C2}},
                {"SetQxExtraCodes", PlistArray{1}}};
    }
    std::vector<std::string_view> sectionsOfCode(std::uint32_t logCode) const override
    {
        return logCode == 0xB0C2 ? std::vector<std::string_view>{"Cell", "Other"}
                                 : std::vector<std::string_view>{};
    }
};

RecordCensus someRecords()
{
    RecordCensus census(RecordsMode::Newer);
    for (const std::size_t size : {38, 38, 37})
        census.take(PacketBuilder(0xB0C2).size(size).u8(13, 2).build());
    census.take(PacketBuilder(0xB0C2).size(42).u8(13, 3).build());
    census.take(PacketBuilder(0x1234).size(20).build());
    return census;
}

} // namespace

TEST(CodeReport, SumsUpTheKindsOfACode)
{
    const AskingGenerator generator;
    const CodeReport report = CodeReport::of(someRecords(), &generator);
    ASSERT_EQ(report.came.size(), 2U);
    const CodeReport::Code& code = report.came[1];
    EXPECT_EQ(code.logCode, 0xB0C2U);
    EXPECT_EQ(code.records, 4U);
    EXPECT_EQ(code.tooShort, 1U);
    EXPECT_EQ(versionsText(code), "2, 3");
    EXPECT_THAT(code.sections, ElementsAre("Cell", "Other"));
    ASSERT_EQ(code.kinds.size(), 3U);
    EXPECT_EQ(kindText(code.kinds[1].first), "version 2, 38 bytes, base");
    EXPECT_EQ(code.kinds[1].second, 2U);
    EXPECT_TRUE(code.isAskedFor);
}

TEST(CodeReport, TellsWhatWasAskedForAndNeverCame)
{
    const AskingGenerator generator;
    EXPECT_THAT(CodeReport::of(someRecords(), &generator).missing, ElementsAre(0xB0C1, 0xFF0001));
}

TEST(CodeReport, TellsWhatNobodyDecodes)
{
    const AskingGenerator generator;
    const CodeReport report = CodeReport::of(someRecords(), &generator);
    EXPECT_EQ(report.came[0].logCode, 0x1234U);
    EXPECT_FALSE(report.came[0].isAskedFor);
    EXPECT_EQ(kindText(report.came[0].kinds[0].first), "20 bytes");
}

TEST(CodeReport, WithoutAGeneratorNothingIsAskedFor)
{
    const CodeReport report = CodeReport::of(someRecords(), nullptr);
    EXPECT_THAT(report.missing, IsEmpty());
    EXPECT_FALSE(report.came[1].isAskedFor);
}

} // namespace ventrik
