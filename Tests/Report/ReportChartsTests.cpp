#include "Report/ReportCharts.h"
#include "Tests/Report/ReportFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

class ReportChartsTest : public ReportFixture
{
  protected:
    std::string page() const
    {
        const ReportTimes times(0, store.firstTime(), store.lastTime());
        HtmlWriter html;
        ReportCharts(store, times, EventLog(store).update()).write(html);
        return html.written();
    }
    /// "Cell dBm: A B"
    std::vector<std::string> groups() const
    {
        std::vector<std::string> lines;
        const NumberSeries series(store);
        for (const LineGroup& group : lineGroups(series.lines(), store.places())) {
            std::string text =
                fmt::format("{} {}:", store.places().nameOf(group.holder), group.unit);
            for (const NumberLine* line : group.lines)
                text += fmt::format(" {}", store.places().nameOf(line->place));
            lines.push_back(text);
        }
        return lines;
    }
};

PlistDictionary display(int number)
{
    PlistDictionary cell;
    cell.set("A", fmt::format("{} dBm", number));
    cell.set("B", fmt::format("{}", number));
    cell.set("C", fmt::format("{} dBm", number));
    cell.set("D", fmt::format("{}", number));
    cell.set("E", "7 dBm");
    cell.set("F", fmt::format("{} dB", number));
    return {{"Cell", cell}};
}

} // namespace

TEST_F(ReportChartsTest, PutsTogetherWhatSharesGroupAndUnit)
{
    show(display(1));
    show(display(2));
    EXPECT_THAT(groups(), ElementsAre("Cell dBm: A C", "Cell dB: F", "Cell : B", "Cell : D"));
}

TEST_F(ReportChartsTest, PartsLargeGroups)
{
    for (int number = 0; number < 2; ++number) {
        PlistDictionary cell;
        for (char name = 'a'; name < 'h'; ++name)
            cell.set(std::string(1, name), fmt::format("{} dB", number));
        show(PlistDictionary{{"Cell", cell}});
    }
    EXPECT_THAT(groups(), ElementsAre("Cell dB: a b c d e f", "Cell dB: g"));
    EXPECT_THAT(page(), HasSubstr("<figcaption>Cell · dB</figcaption>"));
    EXPECT_THAT(page(), HasSubstr("<figcaption>Cell · dB (2)</figcaption>"));
}

TEST_F(ReportChartsTest, DrawsWhatChangedAndCountsTheRest)
{
    show(display(1));
    show(display(2));
    EXPECT_THAT(page(), HasSubstr("5 of 6 numbers changed."));
    EXPECT_THAT(page(), Not(HasSubstr("left out")));
    EXPECT_THAT(page(), HasSubstr("<figcaption>Cell · dBm</figcaption>"));
    EXPECT_THAT(page(), HasSubstr("<figcaption>Cell · D</figcaption>"));
}

TEST_F(ReportChartsTest, LeavesOutWhatChangedLeastAndSaysHowMuch)
{
    const auto showAll = [&](int number, std::size_t from) {
        PlistDictionary cell;
        for (std::size_t i = from; i < ReportCharts::mostCharts + 2; ++i)
            cell.set(fmt::format("Number {:02}", i), fmt::format("{}", number));
        for (std::size_t i = 0; i < from; ++i)
            cell.set(fmt::format("Number {:02}", i), "1");
        show(PlistDictionary{{"Cell", cell}});
    };
    showAll(0, 0);
    showAll(1, 0);
    showAll(2, 2); // the first two stay
    const std::string text = page();
    EXPECT_THAT(text.substr(0, 200),
                HasSubstr("82 of 82 numbers changed. 2 of them, in 2 charts, are left out: those "
                          "that changed least."));
    EXPECT_EQ(text.find("Number 01"), text.npos);
    EXPECT_NE(text.find("Number 02"), text.npos);
}

TEST_F(ReportChartsTest, MarksChangesOfTheServingCell)
{
    show(serving("301", "-90 dBm"));
    show(serving("302", "-80 dBm"));
    EXPECT_THAT(page(), HasSubstr("Marks: changes of the serving cell (1)."));
    EXPECT_THAT(page(), HasSubstr("PCI 301 → 302"));
}

TEST_F(ReportChartsTest, NamesALevelOfGSMByWhichItsBandsAreKnown)
{
    for (const char* level : {"54", "60"})
        show(PlistDictionary{
            {"Serving Cell",
             PlistDictionary{{"GSM Serving Cell", PlistDictionary{{"RSSI", level}, {"BCC", "a"}}},
                             {"More", "b"}}}});
    EXPECT_THAT(page(), HasSubstr(">GSM RSSI</text>"));
    EXPECT_THAT(page(), HasSubstr(">excellent</text>"));
}

TEST_F(ReportChartsTest, EscapesNames)
{
    show(PlistDictionary{{R"(<&"x)", PlistDictionary{{"<A>", "1 dBm"}}}});
    show(PlistDictionary{{R"(<&"x)", PlistDictionary{{"<A>", "2 dBm"}}}});
    EXPECT_THAT(page(), HasSubstr("<figcaption>&lt;&amp;"));
    EXPECT_THAT(page(), Not(HasSubstr("<A>")));
}

} // namespace ventrik
