#include "LogGenerator/Core/StateKeys.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tools/CaptureRows.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// Its test writes the display; it asks for the codes 0x1000 and, of the others, 5.
class AskingGenerator : public IdleGenerator
{
  public:
    PlistDictionary getStartCommand() const override
    {
        return {{"SetOrbelLogCodes", PlistArray{0x1000}}, {"SetQxExtraCodes", PlistArray{5}}};
    }
};

Bytes record(std::uint8_t type, std::uint16_t code)
{
    Bytes bytes(13);
    bytes[0] = type;
    bytes[1] = 12;
    bytes[3] = static_cast<std::uint8_t>(code);
    bytes[4] = static_cast<std::uint8_t>(code >> 8U);
    return bytes;
}

/// Rows as "record time path=text", the time in seconds of 1970's first minute.
class CaptureRowsTest : public testing::Test
{
  protected:
    CaptureRows& rows()
    {
        if (!_rows)
            _rows.emplace(options, "c", Technologies::lte, generator, RecordsMode::Newer);
        return *_rows;
    }
    void select(const std::string& pattern) { options.selection = PathSelection({pattern}); }
    void take(std::chrono::milliseconds time, std::string_view value)
    {
        const Bytes message = record(1, 0x1000);
        rows().runStepsBefore(Clock::TimePoint(time), state);
        group.set("x", value);
        rows().take({Clock::TimePoint(time), message}, state);
    }
    std::vector<std::string> lines()
    {
        std::vector<std::string> lines;
        std::string_view text = rows().text();
        for (std::size_t end = 0; (end = text.find('\n')) != text.npos; text.remove_prefix(end + 1))
            lines.push_back(lineOf(text.substr(0, end)));
        rows().clearText();
        return lines;
    }
    // c,RECORD,1970-01-01T00:00:SS.mmm000Z,,lte,CODE,,,SECTION,PATH,INDEX,NAME,NUMBER,UNIT,TEXT,
    static std::string lineOf(std::string_view row)
    {
        std::vector<std::string> fields(1);
        for (const char character : row)
            if (character == ',')
                fields.emplace_back();
            else
                fields.back() += character;
        return fmt::format("{} {} {}={}", fields[1], fields[2].substr(17, 4), fields[9],
                           fields[14]);
    }

    AskingGenerator generator;
    RowOptions options{.format = RowFormat::Csv};
    PlistDictionary group{{"x", "0"}};
    PlistArray list;
    PlistDictionary state{
        {StateKey::display, PlistDictionary{{"a", group}, {"l", list}, {"b", "1"}}}};

  private:
    std::optional<CaptureRows> _rows;
};

} // namespace

TEST_F(CaptureRowsTest, TellWhatEachMessageChanged)
{
    take(0ms, "1");
    EXPECT_THAT(lines(), ElementsAre("0 00.0 /a/x=1", "0 00.0 /l/=\"\"", "0 00.0 /b=1"));
    take(100ms, "1");
    take(300ms, "2");
    EXPECT_THAT(lines(), ElementsAre("2 00.3 /a/x=2"));
}

TEST_F(CaptureRowsTest, TellEachOfMoreValuesThanAreKept)
{
    select("/a/x");
    for (int round = 0; round < 2; ++round)
        for (int i = 0; i < 20000; ++i) {
            const std::string value = fmt::format("{}{}", i % 2 == 0 ? "v" : "a longer value ", i);
            take(0ms, value);
            const auto taken = lines();
            ASSERT_EQ(taken.size(), 1U);
            ASSERT_TRUE(taken.front().ends_with("/a/x=" + value)) << taken.front();
        }
}

TEST_F(CaptureRowsTest, AreOnlyThoseThatAreSelected)
{
    select("/*/x");
    take(0ms, "1");
    EXPECT_THAT(lines(), ElementsAre("0 00.0 /a/x=1"));
}

TEST_F(CaptureRowsTest, TellOfAnElementThatGoesWhereSomethingBelowIsSelected)
{
    select("/l/*/PCI");
    list.append(PlistDictionary{{"PCI", "7"}, {"other", "8"}});
    take(0ms, "1");
    EXPECT_THAT(lines(), ElementsAre("0 00.0 /l/0/PCI=7"));
    list.clear();
    take(100ms, "1");
    EXPECT_THAT(lines(), ElementsAre("1 00.1 /l/0="));
}

TEST_F(CaptureRowsTest, CountWhatTheCaptureHolds)
{
    const auto takeMessage = [&](const Bytes& message) {
        rows().take({Clock::TimePoint(), message}, state);
    };
    takeMessage(record(1, 0x1000));
    takeMessage(record(255, 5)); // an extra code
    takeMessage(record(1, 5));
    takeMessage(Bytes{1, 2, 3});
    const RowClosing closing = rows().closing();
    EXPECT_EQ(closing.records, 4U);
    EXPECT_EQ(closing.decoded, 2U);
    EXPECT_EQ(closing.rows, 3U);
    EXPECT_EQ(closing.bytes, 3U * 13 + 3);
}

// At each step all values, with the last record before it.
TEST_F(CaptureRowsTest, TellAllValuesAtSteps)
{
    options.every = 1s;
    take(0ms, "1");
    take(900ms, "2");
    EXPECT_THAT(lines(), IsEmpty());
    take(1100ms, "3");
    EXPECT_THAT(lines(), ElementsAre("1 01.0 /a/x=2", "1 01.0 /b=1"));
    rows().finish(state);
    EXPECT_THAT(lines(), ElementsAre("2 02.0 /a/x=3", "2 02.0 /b=1"));
}

TEST_F(CaptureRowsTest, CountAMessageAtAStepToIt)
{
    options.every = 1s;
    select("/a");
    take(0ms, "1");
    take(1000ms, "2");
    take(1001ms, "3");
    EXPECT_THAT(lines(), ElementsAre("1 01.0 /a/x=2"));
}

TEST_F(CaptureRowsTest, PassOverStepsInWhichNothingCame)
{
    options.every = 1s;
    select("/a");
    take(0ms, "1");
    take(5500ms, "2");
    take(6500ms, "3");
    EXPECT_THAT(lines(), ElementsAre("0 01.0 /a/x=1", "1 06.0 /a/x=2"));
}

TEST_F(CaptureRowsTest, BeginStepsAnewWhereTimesRunBack)
{
    options.every = 1s;
    select("/a");
    take(10000ms, "1");
    take(2000ms, "2");
    take(3500ms, "3");
    EXPECT_THAT(lines(), ElementsAre("0 11.0 /a/x=1", "1 03.0 /a/x=2"));
}

TEST_F(CaptureRowsTest, HaveNothingToFinishWhereNothingCame)
{
    options.every = 1s;
    rows().finish(state);
    EXPECT_THAT(lines(), IsEmpty());
}

} // namespace ventrik
