#include "Report/CaptureReport.h"
#include "Tests/Report/ReportFixture.h"

#include <QXmlStreamReader>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class CaptureReportTest : public ReportFixture
{
  protected:
    void take(const PlistValue& display, std::chrono::nanoseconds after = 1s)
    {
        state.set(StateKey::display, display);
        report.take(time, {}, state);
        time += after;
    }
    std::string page(ReportFacts facts = {}) const
    {
        facts.capture = "drive <&\">.pcap";
        return report.page(std::move(facts));
    }

    CaptureReport report{generator, Technologies::lte, RecordsMode::Base};
};

/// What is wrong with it as XML; empty where nothing is.
std::string problemOf(const std::string& document)
{
    QXmlStreamReader reader(QByteArray::fromStdString(document));
    while (!reader.atEnd())
        reader.readNext();
    return reader.errorString().toStdString();
}

} // namespace

TEST_F(CaptureReportTest, IsWellFormedWhateverTheNamesAre)
{
    PlistDictionary display = serving("<301>", "-90 dBm & more");
    display.set("]]><script>", PlistDictionary{{"\"'\x02", "</td>"}});
    take(display);
    take(serving("302", "-80 dBm"));
    EXPECT_THAT(problemOf(page()), IsEmpty());
    EXPECT_THAT(page(), Not(HasSubstr("<script")));
    EXPECT_THAT(page(), HasSubstr("drive &lt;&amp;"));
}

TEST_F(CaptureReportTest, BeginsWithWhatThereIs)
{
    take(serving("301", "-90 dBm"), 6s);
    take(serving("302", "-80 dBm"), 2s);
    take(serving("302", "-80 dBm"));
    const std::string text = page({.secondsFromUtc = 3600});
    EXPECT_THAT(text, HasSubstr("<td>2026-11-16 07:10:28</td>"));
    EXPECT_THAT(text, HasSubstr("<td>2026-11-16 07:10:36</td>"));
    EXPECT_THAT(text, HasSubstr("<td>UTC+01:00</td>"));
    EXPECT_THAT(text, HasSubstr("<td>8.0 s</td>"));
    EXPECT_THAT(text, HasSubstr("<th scope=\"row\">Records</th>\n<td>3</td>"));
    EXPECT_THAT(text,
                HasSubstr("<td class=\"number\">6.0 s</td>\n<td class=\"number\">75.0 %</td>"));
    EXPECT_THAT(text,
                HasSubstr("<td class=\"number\">2.0 s</td>\n<td class=\"number\">25.0 %</td>"));
}

TEST_F(CaptureReportTest, TellsWhatIsWrongWithTheCapture)
{
    take(serving("301", "-90 dBm"));
    EXPECT_THAT(page({.notes = {"cut at <5>"}}),
                HasSubstr("<p class=\"warning\">cut at &lt;5&gt;</p>"));
}

TEST_F(CaptureReportTest, TellsForHowLongNothingCame)
{
    take(serving("301", "-90 dBm"), 90s);
    take(serving("301", "-90 dBm"));
    EXPECT_THAT(page(), HasSubstr("For 1 min 30 s no messages came"));
}

TEST_F(CaptureReportTest, IsAPageAlsoOfNothing)
{
    EXPECT_THAT(problemOf(page()), IsEmpty());
    EXPECT_THAT(page(), HasSubstr("The capture shows no values."));
    EXPECT_THAT(page(), Not(HasSubstr("1970")));
}

TEST_F(CaptureReportTest, LoadsNothing)
{
    take(PlistDictionary{{"Link", PlistDictionary{{"http://x/", "http://x/"}}}});
    EXPECT_THAT(page(), HasSubstr("default-src 'none'"));
    EXPECT_THAT(page(), Not(HasSubstr("src=")));
    EXPECT_THAT(page(), Not(HasSubstr("href=")));
}

TEST_F(CaptureReportTest, StaysBelowFiveMegabytesWhateverComes)
{
    for (int round = 0; round < 60; ++round) {
        PlistDictionary display;
        for (int group = 0; group < 70; ++group) {
            PlistDictionary numbers;
            for (int i = 0; i < 20; ++i)
                numbers.set(fmt::format("{} {}", i, std::string(400, '&')),
                            fmt::format("{} dB", (round * 37 + i) % 100));
            display.set(fmt::format("Group {}", group), numbers);
        }
        take(display);
    }
    EXPECT_LT(page().size(), 5'000'000u);
    EXPECT_THAT(page(), HasSubstr("left out"));
}

TEST_F(CaptureReportTest, SaysHowManyRecordsAreOlderThanOneBeforeThem)
{
    take(serving("301", "-90 dBm"));
    take(serving("302", "-90 dBm"), -20s);
    EXPECT_THAT(page(), Not(HasSubstr("older than one before")));
    take(serving("301", "-90 dBm"));
    take(serving("302", "-90 dBm"));
    EXPECT_THAT(page(), HasSubstr("2 records are older than one before them: they are shown at "
                                  "its time"));
}

} // namespace ventrik
