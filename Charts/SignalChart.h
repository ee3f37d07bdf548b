#pragma once

#include "Charts/ChartLanes.h"
#include "Charts/ChartPalette.h"

#include <cstdint>
#include <string>
#include <vector>

namespace ventrik
{

/// What a chart shows. Lines and marks belong to somebody else and outlive it.
struct ChartContent {
    std::span<const ChartLine> lines;
    std::span<const ChartMark> marks;
    Clock::TimePoint first; ///< the times shown
    Clock::TimePoint last;
    std::optional<Clock::TimePoint> cursor = {};
    std::optional<Clock::TimePoint> secondCursor = {};
};

struct ChartLooks {
    ChartPalette palette = lightPalette;
    QualityBands bands = {};
    std::int32_t secondsFromUtc = 0; ///< of the times' labels
    double textSize = 11;            ///< pixels
    double labelRoom = 0;            ///< for the current values; 0: as much as they need
};

/// Lines over time, a lane for each unit, above a common axis of time: bands of quality behind,
/// marks across, the current values at the right, and up to two cursors with what stood there.
class SignalChart
{
  public:
    /// Lays everything out; the measure is that of the canvas it will be drawn on.
    SignalChart(const ChartContent& content, const ChartLooks& looks, double width, double height,
                const TextMeasure& measure);

    void draw(Canvas& canvas) const;

    bool isEmpty() const { return _isEmpty; }
    /// What is drawn into, from the first lane to the last.
    const Rect& plot() const { return _plot; }
    const TimeScale& times() const { return _times; }
    const std::vector<ChartLane>& lanes() const { return _lanes; }

  private:
    void layOut(const TextMeasure& measure);
    double leftWidth(const TextMeasure& measure) const;
    double labelWidth(const TextMeasure& measure) const;
    bool isShown(Clock::TimePoint time) const;
    bool hasBands() const;
    double rowHeight() const { return _looks.textSize + 5; }
    TextStyle faint(Anchor anchor) const;
    Stroke strokeOf(const ChartLane& lane, std::size_t member) const;

    void drawLane(Canvas& canvas, const ChartLane& lane) const;
    void drawBands(Canvas& canvas, const ChartLane& lane) const;
    void drawValueAxis(Canvas& canvas, const ChartLane& lane) const;
    void drawLine(Canvas& canvas, const ChartLane& lane, std::size_t member) const;
    void drawCurrentValues(Canvas& canvas, const ChartLane& lane) const;
    void drawCurrentValue(Canvas& canvas, const ChartLane& lane, std::size_t member, double y,
                          bool hasTwoRows) const;
    std::vector<double> currentPlaces(const ChartLane& lane) const;
    bool fitInOneRow(const ChartLane& lane, const TextMeasure& measure) const;
    std::string currentText(std::size_t line) const;
    std::vector<TimeTick> timeTicksFor(const TextMeasure& measure) const;
    void drawTimeAxis(Canvas& canvas) const;
    void takeMarks();
    std::vector<double> columnsOf(bool areMinor) const;
    void drawMarks(Canvas& canvas) const;
    void drawMarks(Canvas& canvas, bool areMinor) const;
    void drawMarkLabels(Canvas& canvas) const;
    void drawLegend(Canvas& canvas) const;
    void drawNote(Canvas& canvas, Point place, double width) const;
    /// A cursor in view, with its time in a tag on the axis.
    struct Tag {
        Clock::TimePoint time;
        bool isSecond;
        std::string text;
        Rect area;
    };
    std::vector<Tag> tags(const TextMeasure& measure) const;
    bool isUnderTag(double from, double to, const TextMeasure& measure) const;
    void drawCursors(Canvas& canvas) const;
    bool hasReadingsLeft(const Tag& tag) const;
    void drawReadings(Canvas& canvas, const ChartLane& lane, const Tag& tag, Color color) const;
    struct Difference {
        std::string name;
        std::string value;
        Color color;
    };
    std::vector<Difference> differences() const;
    struct DifferenceBox {
        Rect area;
        std::vector<Difference> rows;
        double namesWidth; ///< 0: without names
    };
    Rect roomBesideCursors(double enough, const TextMeasure& measure) const;
    DifferenceBox differenceBox(const TextMeasure& measure) const;
    void drawDifference(Canvas& canvas) const;

    ChartContent _content;
    ChartLooks _looks;
    double _width;
    double _height;
    bool _isEmpty = true;
    std::vector<ChartLane> _lanes;
    std::size_t _lanesLeftOut = 0;
    Rect _plot;
    TimeScale _times;
    std::vector<const ChartMark*> _marks; ///< in view; those of more weight first
    int _markRows = 0;
};

} // namespace ventrik
