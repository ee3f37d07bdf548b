#include "Charts/ChartTexts.h"
#include "Report/CellHistory.h"
#include "Report/ReportLists.h"
#include "Report/ReportSummary.h"
#include "Tests/Report/ReportFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class CellHistoryTest : public ReportFixture
{
  protected:
    void show(const PlistValue& display, std::chrono::nanoseconds after = 1s)
    {
        ReportFixture::show(display, after);
        history.update();
    }
    /// "LTE 1300 (B3) PCI 301 Serving 0-2 served 2.0 s RSRP -80 -85": seconds seen, best and mean.
    std::vector<std::string> lines() const
    {
        std::vector<std::string> lines;
        for (const SeenCell& cell : history.cells())
            lines.push_back(fmt::format(
                "{} {} {} {}-{} served {} {} {} {}", channelText(cell), identityText(cell),
                nameOf(cell.kind), (cell.first - start) / 1s, (cell.last - start) / 1s,
                durationText(cell.served), cell.level.name, cell.level.best, cell.level.mean()));
        return lines;
    }

    CellHistory history{store};
};

} // namespace

TEST_F(CellHistoryTest, IsEmptyWithoutCells)
{
    EXPECT_THAT(lines(), IsEmpty());
    show(PlistDictionary{{"Note", "none"}});
    EXPECT_THAT(lines(), IsEmpty());
}

TEST_F(CellHistoryTest, TellsForHowLongEachCellServed)
{
    show(serving("301", "-90 dBm"));
    show(serving("301", "-90 dBm"), 3s);
    show(serving("302", "-80 dBm"), 2s);
    show(serving("302", "-80 dBm"), 4s);
    show(serving("301", "-90 dBm"), 6s);
    show(serving("301", "-90 dBm"), 7s);
    EXPECT_THAT(lines(),
                ElementsAre("LTE 1300 (B3) PCI 301 Serving 0-22 served 12.0 s RSRP -90 -90",
                            "LTE 1300 (B3) PCI 302 Serving 5-15 served 10.0 s RSRP -80 "
                            "-80"));
    EXPECT_EQ(history.silence(), 0s);
    EXPECT_EQ(history.whole(), 22s);
}

TEST_F(CellHistoryTest, CountsTheWholeTimeAlsoWhereTheStoreLostItsBeginning)
{
    ChangeStore small(RecordsMode::Base, {.bytes = 65536});
    small.useGenerator(&generator, "lte");
    CellHistory all(small);
    PlistDictionary display = serving("301", "-90 dBm");
    for (int i = 0; i <= 10000; ++i) {
        display.set("Count", fmt::format("{}", i));
        state.set(StateKey::display, display);
        small.messageTaken(start + i * 1s, {}, state);
        all.update();
    }
    ASSERT_GT(small.firstMoment(), 0U);
    EXPECT_EQ(all.whole(), 10000s);
    ASSERT_EQ(all.cells().size(), 1U);
    EXPECT_EQ(all.cells()[0].served, 10000s);

    HtmlWriter html;
    const ReportTimes times(0, small.firstTime(), small.lastTime());
    writeSummary(html, {}, {small.firstTime(), small.lastTime()}, times, all);
    EXPECT_THAT(html.written(), testing::HasSubstr("100.0 %"));
}

TEST_F(CellHistoryTest, HasTheBestLevelAndTheMeanOverTheTimeThatEachStood)
{
    show(serving("301", "-80 dBm"));
    show(serving("301", "-100 dBm"), 3s); // 3 s of -80
    show(serving("301", "-90 dBm"), 1s);  // 1 s of -100
    EXPECT_THAT(lines(),
                ElementsAre("LTE 1300 (B3) PCI 301 Serving 0-4 served 4.0 s RSRP -80 -85"));
}

TEST_F(CellHistoryTest, CountsNoTimeWithoutMessages)
{
    show(serving("301", "-90 dBm"));
    show(serving("301", "-90 dBm"), 2s);
    show(serving("301", "-90 dBm"), 60s);
    show(serving("301", "-90 dBm"), 10s);
    EXPECT_THAT(lines(),
                ElementsAre("LTE 1300 (B3) PCI 301 Serving 0-72 served 12.0 s RSRP -90 -90"));
    EXPECT_EQ(history.silence(), 60s);
}

TEST_F(CellHistoryTest, CountsACellNoMoreThatIsNotTold)
{
    show(serving("301", "-90 dBm"));
    generator.read.logCode = 2; // only what another record tells comes from now on
    PlistDictionary display = serving("301", "-90 dBm");
    for (int i = 0; i < 30; ++i) {
        display.set("Note", fmt::format("{}", i));
        show(display);
    }
    EXPECT_THAT(lines(),
                ElementsAre("LTE 1300 (B3) PCI 301 Serving 0-11 served 11.0 s RSRP -90 -90"));
}

TEST_F(CellHistoryTest, SeesCellsThatNeverServe)
{
    show(withNeighbor("118", "-100 dBm"));
    show(withNeighbor("119", "-95 dBm"));
    show(withNeighbor("118", "-96 dBm"));
    EXPECT_THAT(lines(), ElementsAre("LTE 1300 (B3) PCI 301 Serving 0-2 served 2.0 s RSRP -90 -90",
                                     "LTE 6300 (B20) PCI 118 Neighbor 0-2 served 0.0 s RSRP -96 "
                                     "-100",
                                     "LTE 6300 (B20) PCI 119 Neighbor 1-1 served 0.0 s RSRP -95 "
                                     "-95"));
}

TEST_F(CellHistoryTest, TellsTheClosestThatACellWas)
{
    show(withNeighbor("118", "-100 dBm"));
    PlistDictionary display = serving("118", "-95 dBm");
    display.set("Serving Cell Measurements", PlistDictionary{{"E-ARFCN", "6300"},
                                                             {"Physical Cell ID", "118"},
                                                             {"Measured RSRP", "-95 dBm"}});
    show(display);
    show(display, 5s);
    EXPECT_THAT(lines().front(),
                "LTE 6300 (B20) PCI 118 Serving 0-6 served 5.0 s RSRP -95 -95.83333333333333");
}

TEST_F(CellHistoryTest, HoldsNoMoreCellsThanItMayAndSaysSo)
{
    for (std::size_t i = 0; i <= CellHistory::mostCells; ++i) {
        EXPECT_FALSE(history.isFull());
        show(serving(fmt::format("{}", i), "-90 dBm"), 1ms);
    }
    EXPECT_EQ(history.cells().size(), CellHistory::mostCells);
    EXPECT_TRUE(history.isFull());
}

} // namespace ventrik
