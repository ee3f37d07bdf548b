#include "Report/ReportCharts.h"

#include "Charts/SignalChart.h"
#include "Charts/SvgCanvas.h"
#include "Model/PinnedSeries.h"
#include "Report/ReportNames.h"

#include <algorithm>
#include <numeric>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr double width = 960;        ///< pixels, as all heights
constexpr double roomOfLabels = 190; // the same for all: their times stand below each other
constexpr double heightOfLane = 130;
constexpr double heightOfPlainLane = 62;
constexpr double heightOfAxis = 52;
constexpr std::size_t mostLines = 6; ///< in a chart: as many as there are colors
constexpr int mostMarks = 320;       ///< beside each other in the width

/// The places in the order of the tree.
std::vector<std::size_t> treeOrder(const PlaceTable& places)
{
    std::vector<std::size_t> order(places.size());
    std::vector<PlaceId> pending{PlaceTable::root};
    for (std::size_t next = 0; !pending.empty(); ++next) {
        const PlaceId place = pending.back();
        pending.pop_back();
        order[place] = next;
        const auto& below = places[place].below;
        pending.insert(pending.end(), below.rbegin(), below.rend());
    }
    return order;
}

bool belongTogether(const LineGroup& group, const NumberLine& line, PlaceId holder)
{
    return group.holder == holder && group.unit == line.unit && !line.unit.empty() &&
           group.lines.size() < mostLines;
}

} // namespace

std::vector<LineGroup> lineGroups(std::span<const NumberLine> lines, const PlaceTable& places)
{
    std::vector<const NumberLine*> changed;
    for (const NumberLine& line : lines)
        if (line.changeCount > 0)
            changed.push_back(&line);
    const auto order = treeOrder(places);
    // Levels come before what is no measure; groups stand where their first line does.
    std::ranges::sort(changed, {}, [&](const NumberLine* line) {
        return std::pair(line->unit.empty(), order[line->place]);
    });
    std::vector<LineGroup> groups;
    std::map<std::pair<PlaceId, std::string>, std::size_t> last; // group of a holder and a unit
    for (const NumberLine* line : changed) {
        const PlaceId holder = places[line->place].holder;
        const auto [known, isNew] = last.try_emplace({holder, line->unit}, groups.size());
        if (isNew || !belongTogether(groups[known->second], *line, holder)) {
            const int part = isNew || line->unit.empty() ? 1 : groups[known->second].part + 1;
            known->second = groups.size();
            groups.push_back({.holder = holder, .unit = line->unit, .lines = {}, .part = part});
        }
        LineGroup& group = groups[known->second];
        group.lines.push_back(line);
        group.changeCount += line->changeCount;
    }
    return groups;
}

ReportCharts::ReportCharts(const ChangeStore& store, const ReportTimes& times,
                           std::span<const Event> events)
    : _store(store),
      _times(times),
      _series(store),
      _groups(lineGroups(_series.lines(), store.places()))
{
    takeMarks(events);
    draw();
}

// Several changes in the width of a line are one line.
void ReportCharts::takeMarks(std::span<const Event> events)
{
    const auto least = (_store.lastTime() - _store.firstTime()) / mostMarks;
    for (const Event& event : events) {
        if (event.kind != EventKind::Cell)
            continue;
        ++_cellChangeCount;
        if (_marks.empty() || event.time - _marks.back().time >= least)
            _marks.push_back({event.time, event.text});
    }
}

void ReportCharts::draw()
{
    std::vector<std::size_t> byChanges(_groups.size());
    std::iota(byChanges.begin(), byChanges.end(), std::size_t{0});
    std::ranges::stable_sort(byChanges, std::greater(),
                             [&](std::size_t group) { return _groups[group].changeCount; });
    std::size_t bytes = 0;
    for (const std::size_t group : byChanges) {
        if (_charts.size() == mostCharts)
            break;
        std::string picture = pictureOf(_groups[group]);
        bytes += picture.size();
        if (bytes > mostBytes)
            break;
        _charts.push_back({group, std::move(picture)});
    }
    std::ranges::sort(_charts, {}, &Chart::group);
}

std::string ReportCharts::pictureOf(const LineGroup& group) const
{
    std::vector<ChartLine> lines;
    for (const NumberLine* line : group.lines)
        lines.push_back({nameOf(*line), line->unit, line->points});
    const ChartLooks looks{.secondsFromUtc = _times.secondsFromUtc(), .labelRoom = roomOfLabels};
    const auto lanes = static_cast<double>(lanesOf(lines, looks.bands).size());
    const double height =
        heightOfAxis + lanes * (group.unit.empty() ? heightOfPlainLane : heightOfLane);
    SvgCanvas canvas(width, height, titleOf(group));
    // In low pictures marks would hide more than they tell.
    const std::span<const ChartMark> marks =
        group.unit.empty() ? std::span<const ChartMark>() : _marks;
    const ChartContent content{lines, marks, _store.firstTime(), _store.lastTime()};
    SignalChart(content, looks, width, height, canvas).draw(canvas);
    return canvas.document();
}

// A level that leaves out its sign is GSM's, by which its bands are known.
std::string ReportCharts::nameOf(const NumberLine& line) const
{
    const std::string name(_store.places().nameOf(line.place));
    return isLevelWithoutSign(_store.places().pathOf(line.place)) ? "GSM " + name : name;
}

std::string ReportCharts::sectionOf(const LineGroup& group) const
{
    PlaceId place = group.holder;
    while (place != PlaceTable::root && _store.places()[place].holder != PlaceTable::root)
        place = _store.places()[place].holder;
    return place == PlaceTable::root ? "Ventrik" : std::string(_store.places().nameOf(place));
}

std::string ReportCharts::titleOf(const LineGroup& group) const
{
    const std::string title = placeTitle(_store.places(), group.holder);
    const std::string what = group.unit.empty()
                                 ? std::string(_store.places().nameOf(group.lines.front()->place))
                                 : group.unit;
    const std::string part = group.part > 1 ? fmt::format(" ({})", group.part) : "";
    return (title.empty() ? what : title + " · " + what) + part;
}

void ReportCharts::write(HtmlWriter& html) const
{
    const auto part = html.inside("section", R"(class="charts")");
    html.element("h2", "Signals over time");
    writeNotes(html);
    std::string section;
    for (const Chart& chart : _charts) {
        const LineGroup& group = _groups[chart.group];
        const std::string next =
            sectionOf(group) + (group.unit.empty() ? ": numbers without a unit" : "");
        if (next != section)
            html.element("h3", section = next);
        writeChart(html, chart);
    }
}

void ReportCharts::writeChart(HtmlWriter& html, const Chart& chart) const
{
    const auto figure = html.inside("figure");
    html.element("figcaption", titleOf(_groups[chart.group]));
    html.piece(chart.picture);
}

void ReportCharts::writeNotes(HtmlWriter& html) const
{
    std::size_t changed = 0;
    for (const LineGroup& group : _groups)
        changed += group.lines.size();
    std::size_t drawn = 0;
    for (const Chart& chart : _charts)
        drawn += _groups[chart.group].lines.size();
    std::string note = fmt::format("{} of {} numbers changed.", changed, _series.lines().size());
    if (drawn < changed)
        note += fmt::format(" {} of them, in {} charts, are left out: those that changed least.",
                            changed - drawn, _groups.size() - _charts.size());
    if (!_charts.empty() && _cellChangeCount > 0)
        note += fmt::format(" Marks: changes of the serving cell ({}).", _cellChangeCount);
    if (_marks.size() < _cellChangeCount)
        note += " Those that would stand in one place are one.";
    html.element("p", note, R"(class="note")");
}

} // namespace ventrik
