#include "Report/ReportLists.h"
#include "Tests/Report/ReportFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::Not;

class ReportListsTest : public ReportFixture
{
  protected:
    std::string events(std::span<const Event> events, std::size_t mostBytes = 10000) const
    {
        HtmlWriter html;
        writeEvents(html, events, ReportTimes(3600, start, start + 1h), mostBytes);
        return html.written();
    }
    std::string cells(std::size_t mostBytes = 10000) const
    {
        HtmlWriter html;
        writeCells(html, history, ReportTimes(3600, start, start + 1h), mostBytes);
        return html.written();
    }
    void showAndLook(const PlistValue& display)
    {
        show(display);
        history.update();
    }

    CellHistory history{store};
};

} // namespace

TEST_F(ReportListsTest, HasEventsWithTheirLocalTimes)
{
    const std::vector<Event> all{
        {start + 1500ms, 1, EventKind::RRC, "State <a> → b", "/A/B", true}};
    EXPECT_THAT(events(all), HasSubstr("<td class=\"time\">07:10:29.5</td>\n<td>RRC</td>\n"
                                       "<td>State &lt;a&gt; → b</td>\n"
                                       "<td class=\"place\">A › B</td>"));
}

TEST_F(ReportListsTest, TellsDaysWhereThereAreSeveral)
{
    const ReportTimes times(3600, start, start + 24h);
    EXPECT_EQ(times.inTable(start), "2026-11-16 07:10:28.0");
    EXPECT_EQ(times.zone(), "UTC+01:00");
}

TEST_F(ReportListsTest, CountsTheEventsThatHaveNoRoom)
{
    const std::vector<Event> all(5, {start, 1, EventKind::Call, "x", "/", false});
    EXPECT_THAT(events(all), Not(HasSubstr("left out")));
    EXPECT_THAT(events(all, 1), HasSubstr("4 later events are left out."));
}

TEST_F(ReportListsTest, SaysWhereThereIsNothing)
{
    EXPECT_THAT(events({}), HasSubstr("None."));
    EXPECT_THAT(cells(), HasSubstr("None."));
}

TEST_F(ReportListsTest, HasTheCellsWithTheirLevels)
{
    showAndLook(serving("301", "-80 dBm"));
    showAndLook(serving("301", "-91 dBm"));
    showAndLook(serving("301", "-91 dBm"));
    EXPECT_THAT(
        cells(),
        HasSubstr("<td class=\"name\">LTE 1300 (B3)</td>\n<td>PCI 301</td>\n<td>Serving</td>\n"
                  "<td class=\"time\">07:10:28.0</td>\n"
                  "<td class=\"time\">07:10:30.0</td>\n"
                  "<td class=\"number\">2.0 s</td>\n"
                  "<td class=\"number\">RSRP -80 dBm</td>\n"
                  "<td class=\"number\">-85.5 dBm</td>"));
}

TEST_F(ReportListsTest, CountsTheCellsThatHaveNoRoom)
{
    showAndLook(serving("301", "-80 dBm"));
    showAndLook(serving("302", "-80 dBm"));
    showAndLook(serving("<&\"", "-80 dBm"));
    EXPECT_THAT(cells(), HasSubstr("PCI &lt;&amp;"));
    EXPECT_THAT(cells(1), HasSubstr("2 more cells are left out."));
}

} // namespace ventrik
