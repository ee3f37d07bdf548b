#include "Charts/SignalChart.h"
#include "Tests/Charts/ChartTimes.h"
#include "Tests/Charts/RecordingCanvas.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cmath>
#include <deque>

namespace ventrik
{

namespace
{

using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::Ge;
using testing::IsEmpty;
using testing::Le;
using testing::SizeIs;

/// A chart of the hundred seconds from `morning` on.
class SignalChartTest : public testing::Test
{
  protected:
    std::span<const SeriesPoint> keep(std::vector<SeriesPoint> points)
    {
        return kept.emplace_back(std::move(points));
    }
    void add(const std::string& name, const std::string& unit, std::vector<SeriesPoint> points)
    {
        lines.push_back({name, unit, keep(std::move(points))});
    }
    void addConstant(const std::string& name, const std::string& unit, double value)
    {
        add(name, unit, {point(0, 100, value)});
    }
    SignalChart chart(double width = 900, double height = 400)
    {
        const ChartContent content{lines, marks, at(0), at(100), cursor, secondCursor};
        return {content, looks, width, height, TextEstimate()};
    }
    RecordingCanvas drawn(double width = 900, double height = 400)
    {
        RecordingCanvas canvas(width, height);
        chart(width, height).draw(canvas);
        return canvas;
    }
    static std::vector<std::string> unitsOf(const SignalChart& chart)
    {
        std::vector<std::string> units;
        for (const ChartLane& lane : chart.lanes())
            units.push_back(lane.unit);
        return units;
    }
    // How many lines go down at that time.
    static long uprightsAt(const RecordingCanvas& canvas, double x)
    {
        return std::ranges::count_if(canvas.lines, [x](const auto& line) {
            return std::abs(line.first.x - x) < 1 && std::abs(line.second.x - x) < 1;
        });
    }

    // How far down the line goes there; 0 without one.
    static double depthAt(const RecordingCanvas& canvas, double x)
    {
        double depth = 0;
        for (const auto& line : canvas.lines)
            if (std::abs(line.first.x - x) < 1 && std::abs(line.second.x - x) < 1)
                depth = std::max(depth, line.second.y - line.first.y);
        return depth;
    }

    std::deque<std::vector<SeriesPoint>> kept;
    std::vector<ChartLine> lines;
    std::vector<ChartMark> marks;
    std::optional<Clock::TimePoint> cursor;
    std::optional<Clock::TimePoint> secondCursor;
    ChartLooks looks;
};

bool overlap(const Rect& one, const Rect& other)
{
    return one.x < other.right() && other.x < one.right() && one.y < other.bottom() &&
           other.y < one.bottom();
}

} // namespace

TEST_F(SignalChartTest, AnEmptyChartSaysSo)
{
    lines.push_back({"RSRP", "dBm", {}});
    const auto canvas = drawn(300, 200);
    EXPECT_TRUE(chart().isEmpty());
    EXPECT_THAT(canvas.texts, ElementsAre(testing::Field(&DrawnText::text, "Nothing to show yet")));
}

TEST_F(SignalChartTest, LinesOfOneUnitShareALane)
{
    addConstant("Temperature", "°C", 40);
    addConstant("Cells", "", 3);
    addConstant("Other Temperature", "°C", 41);
    EXPECT_THAT(unitsOf(chart()), ElementsAre("°C", ""));
    EXPECT_THAT(chart().lanes()[0].lines, ElementsAre(0, 2));
}

TEST_F(SignalChartTest, LinesWithOtherBandsHaveALaneOfTheirOwn)
{
    addConstant("Measured RSRP", "dBm", -90);
    addConstant("Measured RSSI", "dBm", -60);
    addConstant("Average RSRP", "dBm", -91);
    addConstant("GSM RSSI", "dBm", -70);
    const SignalChart shown = chart();
    ASSERT_THAT(shown.lanes(), SizeIs(3));
    EXPECT_THAT(shown.lanes()[0].lines, ElementsAre(0, 2));
    EXPECT_FALSE(shown.lanes()[1].bands);
    EXPECT_EQ(shown.lanes()[2].bands->name, "RxLev");
}

TEST_F(SignalChartTest, BandsStandWhereTheirLimitsAre)
{
    add("RSRP", "dBm", {point(0, 50, -80), point(50, 100, -120)});
    const SignalChart shown = chart();
    const ChartLane& lane = shown.lanes()[0];
    const auto canvas = drawn();
    const double limit = lane.scale().y(-84);
    EXPECT_THAT(canvas.fills, Contains(std::pair(Rect{lane.area.x, lane.area.y, lane.area.width,
                                                      limit - lane.area.y},
                                                 looks.palette.bands[0])));
    const double fair = lane.scale().y(-102);
    EXPECT_THAT(canvas.fills,
                Contains(std::pair(Rect{lane.area.x, limit, lane.area.width, fair - limit},
                                   looks.palette.bands[1])));
}

TEST_F(SignalChartTest, TheLegendOfBandsIsThereForThoseWhoHaveThem)
{
    addConstant("Measured RSSI", "dBm", -60);
    EXPECT_FALSE(drawn().has("excellent"));
    addConstant("RSRP", "dBm", -90);
    const auto canvas = drawn();
    for (const auto name : qualityNames)
        EXPECT_TRUE(canvas.has(name)) << name;
}

TEST_F(SignalChartTest, LanesThatHaveNoRoomAreCounted)
{
    for (const char* unit : {"a", "b", "c", "d", "e", "f", "g"})
        addConstant(unit, unit, 1);
    EXPECT_THAT(unitsOf(chart(300, 200)), ElementsAre("a", "b", "c", "d"));
    EXPECT_TRUE(drawn(300, 200).has("3 more · 2026-11-22 UTC"));
    EXPECT_THAT(unitsOf(chart(300, 600)), SizeIs(7));
}

TEST_F(SignalChartTest, LanesStandBelowEachOther)
{
    addConstant("a", "a", 1);
    addConstant("b", "b", 1);
    addConstant("c", "c", 1);
    const SignalChart shown = chart(300, 200);
    for (std::size_t lane = 1; lane < shown.lanes().size(); ++lane)
        EXPECT_GT(shown.lanes()[lane].area.y, shown.lanes()[lane - 1].area.bottom());
    EXPECT_LE(shown.lanes().back().area.bottom(), shown.plot().bottom() + 0.01);
}

TEST_F(SignalChartTest, TheCurrentValueStandsAtTheLinesEnd)
{
    add("RSRP", "dBm", {point(0, 50, -90), point(51, 99, -63.75)});
    const auto canvas = drawn();
    const SignalChart shown = chart();
    const DrawnText* value = canvas.find("-63.75");
    ASSERT_TRUE(value);
    EXPECT_GT(value->place.x, shown.plot().right());
    EXPECT_NEAR(value->place.y, shown.lanes()[0].scale().y(-63.75), 5);
    ASSERT_TRUE(canvas.has("RSRP"));
    EXPECT_EQ(canvas.find("RSRP")->style.color, looks.palette.lines[0]);
}

TEST_F(SignalChartTest, ALineThatHasGoneHasNoCurrentValue)
{
    add("RSRP", "dBm", {point(0, 50, -90, true)});
    const auto canvas = drawn();
    EXPECT_TRUE(canvas.has("–"));
    EXPECT_TRUE(canvas.has("RSRP"));
    EXPECT_THAT(canvas.texts,
                testing::Not(Contains(AllOf(
                    testing::Field(&DrawnText::text, "-90"),
                    testing::Field(&DrawnText::style, testing::Field(&TextStyle::isBold, true))))));
}

TEST_F(SignalChartTest, LabelsOfEqualValuesDoNotOverlap)
{
    for (const char* name : {"RSRP", "RSRP 1", "RSRP 2", "RSRP 3"})
        addConstant(name, "dBm", -90);
    for (const auto& [width, height] : {std::pair(300, 200), std::pair(900, 400)}) {
        const auto canvas = drawn(width, height);
        std::vector<Rect> values;
        for (const DrawnText& text : canvas.texts)
            if (text.text == "-90" && text.style.isBold)
                values.push_back(canvas.extentOf(text));
        ASSERT_THAT(values, SizeIs(4));
        for (std::size_t one = 0; one < values.size(); ++one)
            for (std::size_t other = 0; other < one; ++other)
                EXPECT_FALSE(overlap(values[one], values[other]));
    }
}

TEST_F(SignalChartTest, LinesOfALaneAreToldApartWithoutColors)
{
    for (const char* name : {"RSRP", "RSRP 1", "RSRP 2", "RSRP 3"})
        addConstant(name, "dBm", -90);
    const auto canvas = drawn();
    ASSERT_THAT(canvas.strokes, SizeIs(4));
    for (std::size_t one = 0; one < 4; ++one)
        for (std::size_t other = 0; other < one; ++other)
            EXPECT_NE(canvas.strokes[one].dash, canvas.strokes[other].dash);
}

TEST_F(SignalChartTest, AGapStaysAGap)
{
    add("RSRP", "dBm", {point(0, 30, -90), point(45, 100, -80)});
    EXPECT_THAT(drawn().polylines, SizeIs(2));
}

TEST_F(SignalChartTest, AMomentIsADot)
{
    add("RSRP", "dBm", {point(50, 50, -90)});
    const auto canvas = drawn();
    const double x = chart().times().x(at(50));
    EXPECT_THAT(canvas.polylines, IsEmpty());
    EXPECT_THAT(
        canvas.fills,
        Contains(testing::Pair(AllOf(testing::Field(&Rect::x, testing::DoubleNear(x - 1.5, 0.01)),
                                     testing::Field(&Rect::width, 3)),
                               looks.palette.lines[0])));
}

TEST_F(SignalChartTest, MarksStayWhereTheirLabelsHaveNoRoom)
{
    addConstant("RSRP", "dBm", -90);
    for (int second = 40; second < 60; second += 5)
        marks.push_back({at(second), "cell 301 → cell 302 at " + std::to_string(second)});
    const auto canvas = drawn(600, 300);
    std::vector<Rect> labels;
    for (const DrawnText& text : canvas.texts)
        if (text.text.starts_with("cell"))
            labels.push_back(canvas.extentOf(text));
    EXPECT_THAT(labels, SizeIs(AllOf(Ge(2U), Le(3U))));
    for (std::size_t one = 0; one < labels.size(); ++one)
        for (std::size_t other = 0; other < one; ++other)
            EXPECT_FALSE(overlap(labels[one], labels[other]));
    for (const ChartMark& mark : marks)
        EXPECT_GE(uprightsAt(canvas, chart(600, 300).times().x(mark.time)), 1);
}

TEST_F(SignalChartTest, ARoomThatIsGivenToLabelsIsTheSameForAllNames)
{
    looks.labelRoom = 190;
    addConstant("RSRP", "dBm", -90);
    const double right = chart().plot().right();
    addConstant("A name that would want more room than the others", "dBm", -80);
    EXPECT_EQ(chart().plot().right(), right);
}

TEST_F(SignalChartTest, AMarkGoesAcrossTheLanes)
{
    addConstant("RSRP", "dBm", -90);
    addConstant("RSRQ", "dB", -9);
    marks = {{at(51), "301 → 302"}};
    const SignalChart shown = chart();
    EXPECT_NEAR(depthAt(drawn(), shown.times().x(at(51))), shown.plot().height + 3, 0.01);
}

TEST_F(SignalChartTest, MarksThatWouldHideTheLinesAreTicks)
{
    addConstant("RSRP", "dBm", -90);
    for (int mark = 0; mark < 60; ++mark)
        marks.push_back({at(mark + 0.3), "mark"});
    const auto canvas = drawn();
    for (int mark = 0; mark < 60; ++mark)
        EXPECT_EQ(depthAt(canvas, chart().times().x(at(mark + 0.3))), 7);
}

TEST_F(SignalChartTest, ManyMinorMarksLeaveTheOthersTheirLinesAndLabels)
{
    addConstant("RSRP", "dBm", -90);
    for (int mark = 0; mark < 60; ++mark)
        marks.push_back({at(mark + 0.3), "minor " + std::to_string(mark), true});
    marks.push_back({at(30.6), "301 → 302"});
    const auto canvas = drawn();
    const SignalChart shown = chart();
    EXPECT_EQ(depthAt(canvas, shown.times().x(at(29.3))), 7);
    EXPECT_NEAR(depthAt(canvas, shown.times().x(at(30.6))), shown.plot().height + 3, 0.01);
    EXPECT_TRUE(canvas.has("301 → 302"));
    EXPECT_TRUE(canvas.has("minor 0"));
}

TEST_F(SignalChartTest, OfVeryManyMarksSomeAreLabelledEverywhere)
{
    addConstant("RSRP", "dBm", -90);
    for (int mark = 0; mark < 5000; ++mark)
        marks.push_back({at(mark * 0.02), "mark"});
    const auto canvas = drawn();
    const SignalChart shown = chart();
    const double right = shown.plot().x + shown.plot().width * 0.9;
    EXPECT_TRUE(std::ranges::any_of(canvas.texts, [&](const DrawnText& text) {
        return text.text == "mark" && text.place.x > right;
    }));
}

TEST_F(SignalChartTest, MarksOutsideAreNotDrawn)
{
    addConstant("RSRP", "dBm", -90);
    marks.push_back({at(-1), "before"});
    marks.push_back({at(101), "after"});
    EXPECT_FALSE(drawn().has("before"));
    EXPECT_FALSE(drawn().has("after"));
}

TEST_F(SignalChartTest, ACursorHasItsTimeAndTheValues)
{
    add("RSRP", "dBm", {point(0, 50, -90), point(51, 99, -63.75)});
    cursor = at(20.5);
    const auto canvas = drawn();
    ASSERT_TRUE(canvas.has("10:00:20.5"));
    const double x = chart().times().x(at(20.5));
    EXPECT_NEAR(canvas.find("10:00:20.5")->place.x, x, 0.01);
    EXPECT_THAT(canvas.texts,
                Contains(AllOf(
                    testing::Field(&DrawnText::text, "-90"),
                    testing::Field(&DrawnText::place,
                                   testing::Field(&Point::x, testing::DoubleNear(x + 9, 0.01))))));
}

TEST_F(SignalChartTest, ACursorAtTheEndLeavesItsValuesToThoseBesideIt)
{
    addConstant("RSRP", "dBm", -63.75);
    cursor = at(100);
    const auto canvas = drawn();
    EXPECT_TRUE(canvas.has("10:01:40.0"));
    EXPECT_EQ(std::ranges::count(canvas.texts, "-63.75", &DrawnText::text), 1);
}

TEST_F(SignalChartTest, OfTwoCursorsEachHasItsValuesOnItsOuterSide)
{
    add("RSRP", "dBm", {point(0, 50, -90), point(51, 90, -86.5)});
    secondCursor = at(30);
    cursor = at(60);
    const auto canvas = drawn();
    ASSERT_TRUE(canvas.has("-86.5"));
    EXPECT_GT(canvas.find("-86.5")->place.x, chart().times().x(at(60)));
    const double x = chart().times().x(at(30));
    EXPECT_TRUE(std::ranges::any_of(canvas.texts, [&](const DrawnText& text) {
        return text.text == "-90" && text.style.isBold && text.place.x < x && text.place.x > x - 50;
    }));
}

TEST_F(SignalChartTest, ALowChartHasOneRowOfMarks)
{
    addConstant("RSRP", "dBm", -90);
    marks = {{at(50), "first mark"}, {at(50.1), "second mark"}};
    EXPECT_FALSE(drawn(600, 259).has("second mark"));
    EXPECT_TRUE(drawn(600, 260).has("second mark"));
}

TEST_F(SignalChartTest, TwoCursorsTellTheDifference)
{
    add("RSRP", "dBm", {point(0, 50, -90), point(51, 99, -86.5)});
    add("RSRQ", "dB", {point(0, 50, -9), point(51, 99, -11)});
    add("Cells", "", {point(80, 99, 4)});
    secondCursor = at(20);
    cursor = at(60.5);
    const auto canvas = drawn();
    EXPECT_TRUE(canvas.has("Δ"));
    EXPECT_TRUE(canvas.has("40.5 s"));
    EXPECT_TRUE(canvas.has("+3.5 dB"));
    EXPECT_TRUE(canvas.has("-2 dB"));
    EXPECT_TRUE(canvas.has("–"));
}

TEST_F(SignalChartTest, TheDifferenceDoesNotHideTheCursors)
{
    addConstant("RSRP", "dBm", -90);
    for (const double second : {5.0, 20.0, 50.0, 80.0}) {
        cursor = at(second);
        secondCursor = at(second + 15);
        const auto canvas = drawn();
        const SignalChart shown = chart();
        const DrawnText* delta = canvas.find("15.0 s");
        ASSERT_TRUE(delta) << second;
        const Rect box = canvas.extentOf(*delta);
        for (const auto& time : {*cursor, *secondCursor}) {
            const double x = shown.times().x(time);
            EXPECT_TRUE(x < box.x || x > box.right()) << second;
        }
    }
}

TEST_F(SignalChartTest, TagsOfNeighboringCursorsStandBesideEachOther)
{
    addConstant("RSRP", "dBm", -90);
    cursor = at(50);
    secondCursor = at(50.1);
    const auto canvas = drawn();
    ASSERT_TRUE(canvas.has("10:00:50.0") && canvas.has("10:00:50.1"));
    EXPECT_FALSE(overlap(canvas.extentOf(*canvas.find("10:00:50.0")),
                         canvas.extentOf(*canvas.find("10:00:50.1"))));
}

TEST_F(SignalChartTest, TimesAreThoseOfTheZone)
{
    addConstant("RSRP", "dBm", -90);
    looks.secondsFromUtc = 5400;
    const auto canvas = drawn();
    EXPECT_TRUE(canvas.has("11:30:30") || canvas.has("11:31"));
    EXPECT_TRUE(canvas.has("2026-11-22 UTC+01:30"));
}

TEST_F(SignalChartTest, EveryTextIsInsideAtEverySize)
{
    addConstant("A very long name of a value that nobody can read", "dBm", -90);
    addConstant("RSRP <&\"", "dBm", -85.25);
    add("RSRQ", "dB", {point(0, 50, -9), point(51, 99, -11)});
    addConstant("Frequency", "kHz", 1234567);
    marks = {{at(1), "1 → 2"}, {at(99), "a long text of a mark at the very end of the chart"}};
    cursor = at(0.5);
    secondCursor = at(99.5);
    for (const auto& [width, height] : {std::pair(300.0, 200.0), std::pair(450.0, 300.0),
                                        std::pair(890.0, 400.0), std::pair(1600.0, 900.0)}) {
        const auto canvas = drawn(width, height);
        for (const DrawnText& text : canvas.texts) {
            if (text.style.rotation != 0)
                continue;
            const Rect extent = canvas.extentOf(text);
            EXPECT_GE(extent.x, 0) << text.text << " at " << width;
            EXPECT_LE(extent.right(), width + 0.01) << text.text << " at " << width;
            EXPECT_GE(extent.y, 0) << text.text << " at " << width;
            EXPECT_LE(extent.bottom(), height) << text.text << " at " << width;
        }
        EXPECT_EQ(canvas.openClips, 0);
    }
}

TEST_F(SignalChartTest, EvenTheSmallestChartDraws)
{
    addConstant("RSRP", "dBm", -90);
    cursor = at(10);
    secondCursor = at(20);
    marks = {{at(1), "1 → 2"}};
    for (const double size : {0.0, 1.0, 20.0, 60.0})
        EXPECT_EQ(drawn(size, size).openClips, 0);
}

TEST_F(SignalChartTest, TheRangeShownDecidesTheAxis)
{
    add("Value", "dB", {point(-500, -400, 200), point(0, 100, -20)});
    const SignalChart shown = chart();
    EXPECT_LT(shown.lanes()[0].axis.high, 0);
}

TEST(TextEstimateTest, TextsAreCutToTheirWidth)
{
    const TextEstimate measure;
    EXPECT_EQ(elided("RSRP", 100, 10, false, measure), "RSRP");
    const std::string cut = elided("Measured RSRP", 60, 10, false, measure);
    EXPECT_THAT(cut, testing::EndsWith("…"));
    EXPECT_LE(measure.textWidth(cut, 10), 60);
    EXPECT_EQ(elided("RSRP", 3, 10, false, measure), "");
    EXPECT_EQ(elided("", 3, 10, false, measure), "");
}

TEST(TextEstimateTest, NoCharacterIsCutInTwo)
{
    const TextEstimate measure;
    const std::string cut = elided("ÄÖÜÄÖÜ", 40, 10, false, measure);
    EXPECT_EQ(cut, "ÄÖÜ…");
}

} // namespace ventrik
