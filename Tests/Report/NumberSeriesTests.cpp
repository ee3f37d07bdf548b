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

TEST_F(NumberSeriesTest, StandsUntilItWasToldLast)
{
    show(cell("-70 dBm"));
    show(cell("-70 dBm"));
    show(cell("-70 dBm"));
    show(cell("-80 dBm"), 30s);
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 1: 0-2 -70 32-32 -80"));
}

TEST_F(NumberSeriesTest, EndsWithTheGroupThatHeldIt)
{
    show(cell("-70 dBm"));
    show(PlistDictionary{{"Note", "gone"}});
    EXPECT_THAT(lines(), ElementsAre("/Cell/Level dBm 0: 0-1 -70."));
}

} // namespace ventrik
