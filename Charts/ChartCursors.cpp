// The part of a chart that tells of its cursors: their lines and times, the values that stood
// there, and the difference between the two.
#include "Charts/ChartTexts.h"
#include "Charts/LabelPlaces.h"
#include "Charts/SignalChart.h"
#include "Charts/TextEstimate.h"

#include <algorithm>

namespace ventrik
{

namespace
{

// A difference of two levels in dBm is one in dB.
std::string_view unitOfDifference(std::string_view unit)
{
    return unit == "dBm" ? std::string_view("dB") : unit;
}

std::string withUnit(const std::string& number, std::string_view unit)
{
    return unit.empty() ? number : number + " " + std::string(unit);
}

} // namespace

// Tags that would overlap stand beside each other.
std::vector<SignalChart::Tag> SignalChart::tags(const TextMeasure& measure) const
{
    const double size = _looks.textSize;
    std::vector<Tag> tags;
    std::vector<double> wanted;
    double width = 0;
    for (const bool isSecond : {true, false}) {
        const auto& time = isSecond ? _content.secondCursor : _content.cursor;
        if (!time || !isShown(*time))
            continue;
        tags.push_back({*time, isSecond, exactTimeText(*time, _looks.secondsFromUtc), {}});
        wanted.push_back(_times.x(*time));
        width = std::max(width, measure.textWidth(tags.back().text, size, true) + 8);
    }
    const auto places = spreadLabels(wanted, width + 2, 0, std::max(_width, 2 * width + 5));
    const double top = _lanes.back().area.bottom() + 2;
    for (std::size_t tag = 0; tag < tags.size(); ++tag)
        tags[tag].area = {places[tag].value_or(wanted[tag]) - width / 2, top, width, size + 5};
    return tags;
}

bool SignalChart::isUnderTag(double from, double to, const TextMeasure& measure) const
{
    return std::ranges::any_of(tags(measure), [&](const Tag& tag) {
        return from < tag.area.right() + 2 && to > tag.area.x - 2;
    });
}

void SignalChart::drawCursors(Canvas& canvas) const
{
    const double size = _looks.textSize;
    const double bottom = _lanes.back().area.bottom();
    for (const Tag& tag : tags(canvas)) {
        const Color color = tag.isSecond ? _looks.palette.secondCursor : _looks.palette.cursor;
        const double x = _times.x(tag.time);
        canvas.line({x, _plot.y - 3}, {x, bottom + 2},
                    {color, 1.4, tag.isSecond ? Dash::Dashed : Dash::Solid});
        for (const ChartLane& lane : _lanes)
            drawReadings(canvas, lane, tag, color);
        canvas.fillRect(tag.area, color);
        canvas.text({tag.area.x + tag.area.width / 2, bottom + size + 3}, tag.text,
                    {.color = _looks.palette.tagText,
                     .size = size,
                     .anchor = Anchor::Middle,
                     .isBold = true});
    }
}

// Of two cursors in view each has its readings on its outer side.
bool SignalChart::hasReadingsLeft(const Tag& tag) const
{
    const auto& other = tag.isSecond ? _content.cursor : _content.secondCursor;
    const bool isPair = other && isShown(*other) && *other != tag.time;
    return isPair && tag.time < *other;
}

// A dot on each line and its value beside the cursor, where there is room.
void SignalChart::drawReadings(Canvas& canvas, const ChartLane& lane, const Tag& tag,
                               Color color) const
{
    const double size = _looks.textSize;
    const double x = _times.x(tag.time);
    std::vector<double> wanted;
    std::vector<Difference> readings;
    for (std::size_t member = 0; member < lane.lines.size(); ++member) {
        const auto value = valueAt(_content.lines[lane.lines[member]].points, tag.time);
        if (!value)
            continue;
        wanted.push_back(lane.scale().y(*value));
        readings.push_back({{}, shortNumber(*value), strokeOf(lane, member).color});
        canvas.fillRect({x - 2.5, wanted.back() - 2.5, 5, 5}, color);
    }
    if (x >= lane.area.right() - 1) // the current values stand beside it already
        return;
    const auto places = spreadLabels(wanted, size + 4, lane.area.y + 1, lane.area.bottom() - 1);
    for (std::size_t reading = 0; reading < places.size(); ++reading) {
        if (!places[reading])
            continue;
        const double width = canvas.textWidth(readings[reading].value, size, true) + 6;
        const bool fitsRight = x + 6 + width <= lane.area.right();
        const bool fitsLeft = x - 6 - width >= lane.area.x;
        const bool isLeft = fitsLeft && (hasReadingsLeft(tag) || !fitsRight);
        const double start = isLeft ? x - 6 - width : x + 6;
        canvas.fillRect({start, *places[reading] - size / 2 - 2, width, size + 4},
                        _looks.palette.background);
        canvas.text({start + 3, *places[reading] + size * 0.35}, readings[reading].value,
                    {.color = readings[reading].color, .size = size, .isBold = true});
    }
}

// What has changed from the earlier cursor to the later one, first the time.
std::vector<SignalChart::Difference> SignalChart::differences() const
{
    const auto [from, to] = std::minmax(*_content.cursor, *_content.secondCursor);
    std::vector<Difference> rows{{"Δ", durationText(to - from), _looks.palette.text}};
    for (const ChartLane& lane : _lanes)
        for (std::size_t member = 0; member < lane.lines.size(); ++member) {
            const ChartLine& line = _content.lines[lane.lines[member]];
            const auto before = valueAt(line.points, from);
            const auto after = valueAt(line.points, to);
            std::string value = "–";
            if (before && after)
                value = withUnit(signedNumber(*after - *before), unitOfDifference(lane.unit));
            rows.push_back({line.name, value, strokeOf(lane, member).color});
        }
    return rows;
}

// The part of the plot for the box: beside the cursors and their readings, or between them where
// only that is wide enough.
Rect SignalChart::roomBesideCursors(double enough, const TextMeasure& measure) const
{
    const double readings = measure.textWidth("-000.00", _looks.textSize, true) + 16;
    const auto [from, to] = std::minmax(*_content.cursor, *_content.secondCursor);
    const double start = std::clamp(_times.x(from), _plot.x, _plot.right());
    const double end = std::clamp(_times.x(to), _plot.x, _plot.right());
    const double left = start - readings - _plot.x;
    const double right = _plot.right() - end - readings;
    if (std::max(left, right) < std::min(enough, end - start))
        return {start, _plot.y, end - start, _plot.height};
    return left >= right ? Rect{_plot.x, _plot.y, left, _plot.height}
                         : Rect{_plot.right() - right, _plot.y, right, _plot.height};
}

// Where there is no room beside the cursors, the box stands over the labels of the current values.
// A narrow one leaves the names out: the rows have the order and the colors of the lines.
SignalChart::DifferenceBox SignalChart::differenceBox(const TextMeasure& measure) const
{
    const double size = _looks.textSize;
    DifferenceBox box{{}, differences(), 0};
    const auto mostRows = static_cast<std::size_t>(std::max(1.0, (_plot.height - 14) / (size + 4)));
    box.rows.resize(std::min(box.rows.size(), mostRows));
    double values = 0;
    double names = 0;
    for (const Difference& row : box.rows) {
        values = std::max(values, measure.textWidth(row.value, size, true));
        names = std::max(names, measure.textWidth(row.name.substr(0, 80), size));
    }
    const double least = values + 12;
    Rect room = roomBesideCursors(least + 80, measure);
    if (room.width < least + 8)
        room = {_plot.right(), _plot.y, std::max(least + 8, _width - _plot.right()), _plot.height};
    const double left = std::min(names, room.width - least - 18);
    box.namesWidth = left >= std::min(names, 60.0) ? left : 0;
    const double width = least + (box.namesWidth > 0 ? box.namesWidth + 10 : 0);
    const double share = room.x == _plot.x ? 0 : room.right() >= _plot.right() ? 1 : 0.5;
    const double x = std::clamp(room.x + 4 + (room.width - 8 - width) * share, 0.0,
                                std::max(0.0, _width - width - 2));
    box.area = {x, _plot.y + 4, width, static_cast<double>(box.rows.size()) * (size + 4) + 6};
    return box;
}

void SignalChart::drawDifference(Canvas& canvas) const
{
    if (!_content.cursor || !_content.secondCursor)
        return;
    const double size = _looks.textSize;
    const DifferenceBox box = differenceBox(canvas);
    canvas.fillRect(box.area, _looks.palette.background);
    canvas.strokeRect(box.area, {_looks.palette.frame});
    double baseline = box.area.y + size + 4;
    for (const Difference& row : box.rows) {
        TextStyle style{.color = row.color, .size = size};
        if (box.namesWidth > 0)
            canvas.text({box.area.x + 6, baseline},
                        elided(row.name, box.namesWidth, size, false, canvas), style);
        style.anchor = Anchor::End;
        style.isBold = true;
        canvas.text({box.area.right() - 6, baseline}, row.value, style);
        baseline += size + 4;
    }
}

} // namespace ventrik
