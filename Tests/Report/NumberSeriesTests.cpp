#include "Report/NumberSeries.h"
#include "Tests/Report/ReportFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class NumberSeriesTest : public ReportFixture
{
  protected:
    /// "/Cell/Level dBm 1: 0-0 -70, 1-1 -75.": the changes, then the points as seconds and values,
    /// with a "." where the line ends.
    std::vector<std::string> lines() const
    {
        std::vector<std::string> lines;
        const NumberSeries series(store);
        for (const NumberLine& line : series.lines()) {
            std::string text = fmt::format("{} {} {}:", store.places().pathOf(line.place),
                                           line.unit, line.changeCount);
            for (const SeriesPoint& point : line.points)
                text +=
                    fmt::format(" {}-{} {}{}", (point.from - start) / 1s,
                                (point.until - start) / 1s, point.value, point.isEnd ? "." : "");
            lines.push_back(text);
        }
        return lines;
    }
    static PlistDictionary cell(std::string_view level)
    {
        return {{"Cell", PlistDictionary{{"Level", level}, {"Name", "a"}}}};
    }
};

} // namespace

TEST_F(NumberSeriesTest, HasEachValueThatWasANumber)
{
    EXPECT_THAT(lines(), IsEmpty());
    show(cell("-70 dBm"));
    show(cell("-75 dBm"));
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 1: 0-0 -70 1-1 -75"));
}

TEST_F(NumberSeriesTest, CountsOnlyOtherNumbersAsChanges)
{
    show(cell("-70 dBm"));
    show(cell("-"));
    show(cell("-70 dBm"));
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 0: 0-1 -70. 2-2 -70"));
}

TEST_F(NumberSeriesTest, DrawsLevelsBelowZeroThatLeaveOutTheirSign)
{
    const auto serving = [](std::string_view level) {
        return PlistDictionary{
            {"Serving Cell",
             PlistDictionary{{"GSM Serving Cell", PlistDictionary{{"RSSI", level}, {"BCC", "a"}}},
                             {"More", "b"}}}};
    };
    show(serving("54"));
    show(serving("60"));
    EXPECT_THAT(lines(), ElementsAre("/Serving Cell/GSM Serving Cell/RSSI dBm 1: 0-0 -54 1-1 -60"));
}

TEST_F(NumberSeriesTest, StandsUntilItWasToldLast)
{
    show(cell("-70 dBm"));
    show(cell("-70 dBm"));
    show(cell("-70 dBm"));
    show(cell("-80 dBm"), 30s);
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 1: 0-2 -70 32-32 -80"));
}

TEST_F(NumberSeriesTest, GoesOnForAsLongAsItIsToldAgainWithoutAGap)
{
    for (int i = 0; i < 30; ++i)
        show(cell("-70 dBm"));
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 0: 0-29 -70"));
}

TEST_F(NumberSeriesTest, HasAGapBeforeTheSameValueThatIsToldAgainLater)
{
    show(cell("-62 dBm"));
    show(cell("-62 dBm"));
    show(cell("-62 dBm"), 600s);
    show(cell("-62 dBm"));
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 0: 0-1 -62 601-602 -62"));
}

TEST_F(NumberSeriesTest, HasAGapBeforeAnotherValueThatTheSameCameBefore)
{
    show(cell("-62 dBm"));
    show(cell("-62 dBm"), 600s);
    show(cell("-70 dBm"));
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 1: 0-0 -62 600-600 -62 601-601 -70"));
}

TEST_F(NumberSeriesTest, HasNoMorePointsBehindGapsThanItMay)
{
    constexpr std::size_t numbers = 1000;
    PlistDictionary display;
    for (std::size_t i = 0; i < numbers; ++i)
        display.set(fmt::format("{}", i), "1");
    for (std::size_t i = 0; i < NumberSeries::mostBehindGaps / numbers + 50; ++i)
        show(display, 60s);
    std::size_t points = 0;
    const NumberSeries series(store);
    for (const NumberLine& line : series.lines())
        points += line.points.size();
    EXPECT_EQ(points, numbers + NumberSeries::mostBehindGaps);
}

TEST_F(NumberSeriesTest, EndsWithTheGroupThatHeldIt)
{
    show(cell("-70 dBm"));
    show(PlistDictionary{{"Note", "gone"}});
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 0: 0-1 -70."));
}

TEST_F(NumberSeriesTest, HasWhatStandsSinceBeforeTheStoresFirstMoment)
{
    ChangeStore small(RecordsMode::Base, {.bytes = 65536});
    small.useGenerator(&generator, "lte");
    PlistDictionary display = cell("-70 dBm");
    for (int i = 0; i < 20000; ++i) {
        display.set("Count", fmt::format("{}", i));
        state.set(StateKey::display, display);
        small.messageTaken(start + i * 1s, {}, state);
    }
    ASSERT_GT(small.firstMoment(), 10U);
    const NumberSeries series(small);
    ASSERT_EQ(series.lines().size(), 2U);
    EXPECT_EQ(series.lines()[0].unit, "dBm");
    ASSERT_EQ(series.lines()[0].points.size(), 1U);
    EXPECT_EQ(series.lines()[0].points[0].value, -70);
    EXPECT_EQ(series.lines()[0].points[0].until, small.lastTime());
}

} // namespace ventrik
