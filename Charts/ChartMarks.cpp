// The part of a chart that tells of its marks: a line or a tick at each, and what they say.
#include "Charts/LabelPlaces.h"
#include "Charts/SignalChart.h"
#include "Charts/TextEstimate.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double roomOfLine = 24; ///< closer ones would hide what they stand across
constexpr double tickLength = 7;
constexpr std::size_t mostLabels = 1000; ///< more never have room side by side

} // namespace

void SignalChart::takeMarks()
{
    for (const ChartMark& mark : _content.marks)
        if (isShown(mark.time))
            _marks.push_back(&mark);
    std::ranges::stable_sort(
        _marks, {}, [](const ChartMark* mark) { return std::pair(mark->isMinor, mark->time); });
}

// In their order, each once.
std::vector<double> SignalChart::columnsOf(bool areMinor) const
{
    std::vector<double> columns;
    for (const ChartMark* mark : _marks) {
        if (mark->isMinor != areMinor)
            continue;
        const double x = std::floor(_times.x(mark->time)) + 0.5;
        if (columns.empty() || x != columns.back())
            columns.push_back(x);
    }
    return columns;
}

void SignalChart::drawMarks(Canvas& canvas) const
{
    drawMarks(canvas, true);
    drawMarks(canvas, false);
    drawMarkLabels(canvas);
}

// Where there are many, a tick above the plot has to do.
void SignalChart::drawMarks(Canvas& canvas, bool areMinor) const
{
    const auto columns = columnsOf(areMinor);
    const double top = _plot.y - 3;
    const bool areTicks = static_cast<double>(columns.size()) * roomOfLine > _plot.width;
    const double bottom = areTicks ? top + tickLength : _lanes.back().area.bottom();
    const Stroke stroke{_looks.palette.mark, 1,
                        areTicks   ? Dash::Solid
                        : areMinor ? Dash::Dotted
                                   : Dash::Dashed};
    for (const double x : columns)
        canvas.line({x, top}, {x, bottom}, stroke);
}

void SignalChart::drawMarkLabels(Canvas& canvas) const
{
    const double size = _looks.textSize - 1;
    const double widest = std::min(220.0, _plot.width * 0.6);
    const std::size_t step = _marks.size() / mostLabels + 1;
    std::vector<std::string> texts;
    std::vector<LabelExtent> extents;
    for (std::size_t mark = 0; mark < _marks.size(); mark += step) {
        texts.push_back(elided(_marks[mark]->text, widest, size, false, canvas));
        const double width = canvas.textWidth(texts.back(), size);
        const double start = std::clamp(_times.x(_marks[mark]->time) - width / 2, _plot.x,
                                        std::max(_plot.x, _width - width - 4));
        extents.push_back({start, start + width + size});
    }
    const auto rows = labelRows(extents, _markRows);
    TextStyle style{.color = _looks.palette.text, .size = size};
    for (std::size_t label = 0; label < rows.size(); ++label)
        if (rows[label])
            canvas.text({extents[label].from, _plot.y - 5 - *rows[label] * (size + 3)},
                        texts[label], style);
}

} // namespace ventrik
