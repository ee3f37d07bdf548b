#include "Charts/SignalChart.h"

#include "Charts/ChartTexts.h"
#include "Charts/LabelPlaces.h"
#include "Charts/LineThinning.h"
#include "Charts/TextEstimate.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double leader = 14; ///< from the plot to the label of a current value
constexpr double lowestLane = 30;
constexpr double lineWidth = 1.7;

Rect within(const Rect& area, double top, double bottom)
{
    const double y = std::clamp(top, area.y, area.bottom());
    return {area.x, y, area.width, std::clamp(bottom, area.y, area.bottom()) - y};
}

double middleOf(const Rect& area)
{
    return area.y + area.height / 2;
}

} // namespace

SignalChart::SignalChart(const ChartContent& content, const ChartLooks& looks, double width,
                         double height, const TextMeasure& measure)
    : _content(content), _looks(looks), _width(width), _height(height)
{
    _content.last = std::max(_content.last, _content.first);
    _lanes = lanesOf(_content.lines, _looks.bands);
    _isEmpty = _lanes.empty();
    layOut(measure);
}

void SignalChart::layOut(const TextMeasure& measure)
{
    const double size = _looks.textSize;
    const bool isHigh = _height >= 260;
    takeMarks();
    _markRows = _marks.empty() ? 0 : isHigh ? 2 : 1;
    const double top = size * 0.6 + _markRows * (size + 3);
    const double bottom = rowHeight() + (_height >= 120 ? rowHeight() : 0) + 2;
    _plot = {0, top, _width, std::max(1.0, _height - top - bottom)};
    _lanesLeftOut = layOutLanes(_lanes, _plot, lowestLane);
    for (ChartLane& lane : _lanes)
        chooseAxis(lane, _content.lines, _content.first, _content.last, size * 2);
    _plot.x = leftWidth(measure);
    _plot.width = std::max(1.0, _width - _plot.x - leader - labelWidth(measure) - 4);
    for (ChartLane& lane : _lanes) {
        lane.area.x = _plot.x;
        lane.area.width = _plot.width;
    }
    _times = TimeScale(_content.first, _content.last, _plot.x, _plot.right());
}

// Wide enough for the usual levels, so that the plot stays where it is while values come and go.
double SignalChart::leftWidth(const TextMeasure& measure) const
{
    double widest = measure.textWidth("-000", _looks.textSize);
    bool hasUnit = false;
    for (const ChartLane& lane : _lanes) {
        hasUnit = hasUnit || !lane.unit.empty();
        for (const ValueTick& tick : lane.axis.ticks)
            widest = std::max(widest, measure.textWidth(tick.text, _looks.textSize));
    }
    return std::ceil(widest + 8 + (hasUnit ? _looks.textSize + 4 : 0));
}

double SignalChart::labelWidth(const TextMeasure& measure) const
{
    if (_looks.labelRoom > 0)
        return _looks.labelRoom;
    double widest = 0;
    for (const ChartLane& lane : _lanes)
        for (const std::size_t line : lane.lines)
            widest = std::max(widest, measure.textWidth(_content.lines[line].name.substr(0, 80),
                                                        _looks.textSize));
    const double number = measure.textWidth("-000.00 ", _looks.textSize, true);
    return std::ceil(std::min(widest + number, _width * (_width < 600 ? 0.34 : 0.22)));
}

bool SignalChart::isShown(Clock::TimePoint time) const
{
    return time >= _content.first && time <= _content.last;
}

bool SignalChart::hasBands() const
{
    return std::ranges::any_of(_lanes,
                               [](const ChartLane& lane) { return lane.bands.has_value(); });
}

TextStyle SignalChart::faint(Anchor anchor) const
{
    return {.color = _looks.palette.faintText, .size = _looks.textSize, .anchor = anchor};
}

// Colors go on through all lanes. Dashes tell the lines of one lane apart without any color.
Stroke SignalChart::strokeOf(const ChartLane& lane, std::size_t member) const
{
    constexpr std::array dashes{Dash::Solid, Dash::Dashed, Dash::DashDotted, Dash::Dotted};
    const auto& colors = _looks.palette.lines;
    return {colors[lane.lines[member] % colors.size()], lineWidth, dashes[member % dashes.size()]};
}

void SignalChart::draw(Canvas& canvas) const
{
    canvas.fillRect({0, 0, _width, _height}, _looks.palette.background);
    if (_isEmpty) {
        TextStyle style = faint(Anchor::Middle);
        style.size += 3;
        canvas.text({_width / 2, _height / 2}, "Nothing to show yet", style);
        return;
    }
    for (const ChartLane& lane : _lanes)
        drawLane(canvas, lane);
    drawTimeAxis(canvas);
    drawMarks(canvas);
    drawLegend(canvas);
    drawCursors(canvas);
    drawDifference(canvas);
}

void SignalChart::drawLane(Canvas& canvas, const ChartLane& lane) const
{
    drawBands(canvas, lane);
    drawValueAxis(canvas, lane);
    {
        const ClipScope clip(canvas, lane.area);
        for (std::size_t member = 0; member < lane.lines.size(); ++member)
            drawLine(canvas, lane, member);
    }
    canvas.strokeRect(lane.area, {_looks.palette.frame});
    drawCurrentValues(canvas, lane);
}

void SignalChart::drawBands(Canvas& canvas, const ChartLane& lane) const
{
    if (!lane.bands)
        return;
    const ValueScale scale = lane.scale();
    double top = lane.area.y;
    for (std::size_t band = 0; band < _looks.palette.bands.size(); ++band) {
        const bool isLast = band == lane.bands->from.size();
        const double bottom = isLast ? lane.area.bottom() : scale.y(lane.bands->from[band]);
        const Rect stripe = within(lane.area, top, bottom);
        if (stripe.height > 0)
            canvas.fillRect(stripe, _looks.palette.bands[band]);
        top = bottom;
    }
}

void SignalChart::drawValueAxis(Canvas& canvas, const ChartLane& lane) const
{
    const double size = _looks.textSize;
    const ValueScale scale = lane.scale();
    double former = lane.area.bottom() + 2 * size;
    for (const ValueTick& tick : lane.axis.ticks) {
        const double y = scale.y(tick.value);
        canvas.line({lane.area.x, y}, {lane.area.right(), y}, {_looks.palette.grid});
        if (former - y < size)
            continue;
        former = y;
        canvas.text({lane.area.x - 5, y + size * 0.35}, tick.text, faint(Anchor::End));
    }
    TextStyle style = faint(Anchor::Middle);
    style.rotation = -90;
    const std::string unit = elided(lane.unit, lane.area.height, size, false, canvas);
    canvas.text({size + 1, middleOf(lane.area)}, unit, style);
}

void SignalChart::drawLine(Canvas& canvas, const ChartLane& lane, std::size_t member) const
{
    const Stroke stroke = strokeOf(lane, member);
    const auto& points = _content.lines[lane.lines[member]].points;
    for (const auto& run : thinnedLine(points, _times, lane.scale())) {
        const double from = run.front().x;
        const double to = run.back().x;
        if (to < lane.area.x || from > lane.area.right())
            continue;
        if (to - from < 2 && run.size() <= 2) // a moment would be too small to be seen
            canvas.fillRect({from - 1.5, run.front().y - 1.5, 3, 3}, stroke.color);
        else
            canvas.polyline(run, stroke);
    }
}

// Where the labels of the current values would stand if there were no others.
std::vector<double> SignalChart::currentPlaces(const ChartLane& lane) const
{
    std::vector<double> places;
    for (const std::size_t line : lane.lines) {
        const auto& points = _content.lines[line].points;
        const auto near = pointsWithin(points, _content.first, _content.last);
        const double former = near.empty() ? lane.axis.low : near.back().value;
        const double usual = std::isfinite(former) ? former : lane.axis.low;
        const double y = lane.scale().y(valueAt(points, _content.last).value_or(usual));
        places.push_back(std::clamp(y, lane.area.y, lane.area.bottom()));
    }
    return places;
}

void SignalChart::drawCurrentValues(Canvas& canvas, const ChartLane& lane) const
{
    const double row = _looks.textSize + 2;
    const double lines = static_cast<double>(lane.lines.size());
    const bool hasTwoRows = lane.area.height + 2 >= 2 * row * lines && !fitInOneRow(lane, canvas);
    const auto wanted = currentPlaces(lane);
    const auto places =
        spreadLabels(wanted, hasTwoRows ? 2 * row : row, lane.area.y - 1, lane.area.bottom() + 1);
    for (std::size_t member = 0; member < places.size(); ++member) {
        if (!places[member])
            continue;
        canvas.line({lane.area.right() + 1, wanted[member]},
                    {lane.area.right() + leader - 3, *places[member]},
                    {strokeOf(lane, member).color});
        drawCurrentValue(canvas, lane, member, *places[member], hasTwoRows);
    }
}

bool SignalChart::fitInOneRow(const ChartLane& lane, const TextMeasure& measure) const
{
    const double room = _width - lane.area.right() - leader - 2;
    return std::ranges::all_of(lane.lines, [&](std::size_t line) {
        const std::string& name = _content.lines[line].name;
        return name.size() < 80 && measure.textWidth(currentText(line), _looks.textSize, true) +
                                           measure.textWidth(name, _looks.textSize) +
                                           _looks.textSize * 0.4 <=
                                       room;
    });
}

std::string SignalChart::currentText(std::size_t line) const
{
    const auto value = valueAt(_content.lines[line].points, _content.last);
    return value ? shortNumber(*value) : "–";
}

// "-84 RSRP": the number stands first, for it must not be cut.
void SignalChart::drawCurrentValue(Canvas& canvas, const ChartLane& lane, std::size_t member,
                                   double y, bool hasTwoRows) const
{
    const std::size_t line = lane.lines[member];
    const double size = _looks.textSize;
    const std::string number = currentText(line);
    TextStyle style{.color = strokeOf(lane, member).color, .size = size, .isBold = true};
    Point place{lane.area.right() + leader, y + size * 0.35 - (hasTwoRows ? size / 2 + 1 : 0)};
    canvas.text(place, number, style);
    if (hasTwoRows)
        place.y += size + 2;
    else
        place.x += canvas.textWidth(number, size, true) + size * 0.4;
    style.isBold = false;
    const std::string& name = _content.lines[line].name;
    canvas.text(place, elided(name, _width - place.x - 2, size, false, canvas), style);
}

// As many ticks as have room for their labels.
std::vector<TimeTick> SignalChart::timeTicksFor(const TextMeasure& measure) const
{
    const double size = _looks.textSize;
    const auto fit = [&](const std::vector<TimeTick>& ticks) {
        double widest = 0;
        for (const TimeTick& tick : ticks)
            widest = std::max(widest, measure.textWidth(tick.text, size) + size);
        return ticks.size() < 2 || _times.x(ticks[1].time) - _times.x(ticks[0].time) >= widest;
    };
    const int start = static_cast<int>(_plot.width / measure.textWidth("00:00", size));
    for (int most = std::clamp(start, 1, 60); most > 1; --most)
        if (auto ticks = timeTicks(_content.first, _content.last, most, _looks.secondsFromUtc);
            fit(ticks))
            return ticks;
    return timeTicks(_content.first, _content.last, 1, _looks.secondsFromUtc);
}

void SignalChart::drawTimeAxis(Canvas& canvas) const
{
    const double size = _looks.textSize;
    const double bottom = _lanes.back().area.bottom();
    for (const TimeTick& tick : timeTicksFor(canvas)) {
        const double x = _times.x(tick.time);
        for (const ChartLane& lane : _lanes)
            canvas.line({x, lane.area.y}, {x, lane.area.bottom()}, {_looks.palette.grid});
        canvas.line({x, bottom}, {x, bottom + 3}, {_looks.palette.frame});
        const double half = canvas.textWidth(tick.text, size) / 2;
        const bool hasRoom = x - half >= 0 && x + half <= _width;
        if (hasRoom && !isUnderTag(x - half, x + half, canvas))
            canvas.text({x, bottom + size + 3}, tick.text, faint(Anchor::Middle));
    }
}

void SignalChart::drawLegend(Canvas& canvas) const
{
    if (_height < 120)
        return;
    const double size = _looks.textSize - 1;
    const double baseline = _height - size * 0.5;
    TextStyle style = faint(Anchor::Start);
    style.size = size;
    double x = _width - 4;
    if (hasBands())
        for (std::size_t band = qualityNames.size(); band-- > 0;) {
            x -= canvas.textWidth(qualityNames[band], size);
            canvas.text({x, baseline}, qualityNames[band], style);
            x -= size + 4;
            const Rect swatch{x, baseline - size + 1, size, size};
            canvas.fillRect(swatch, _looks.palette.bands[band]);
            canvas.strokeRect(swatch, {_looks.palette.frame});
            x -= size;
        }
    drawNote(canvas, {4, baseline}, x - 8);
}

// The date, as much as there is room for; that something is missing goes before.
void SignalChart::drawNote(Canvas& canvas, Point place, double width) const
{
    TextStyle style = faint(Anchor::Start);
    style.size -= 1;
    const std::string date = dateText(_content.last, _looks.secondsFromUtc);
    const std::string zone = date + " " + zoneText(_looks.secondsFromUtc);
    const std::string more =
        _lanesLeftOut > 0 ? fmt::format("{} more · ", _lanesLeftOut) : std::string();
    for (const std::string& text : {more + zone, more + date, more})
        if (canvas.textWidth(text, style.size) <= width) {
            canvas.text(place, text, style);
            return;
        }
}

} // namespace ventrik
