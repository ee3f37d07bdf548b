#include "Report/ReportLists.h"

#include "Charts/ChartTexts.h"
#include "Report/ReportNames.h"

#include <array>
#include <string>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::string_view noValue = "–";
constexpr std::string_view number = R"(class="number")";

void writeHeads(HtmlWriter& html, std::span<const std::string_view> names)
{
    const auto head = html.inside("thead");
    const auto row = html.inside("tr");
    for (const std::string_view name : names)
        html.element("th", name, R"(scope="col")");
}

void writeEvent(HtmlWriter& html, const Event& event, const ReportTimes& times)
{
    const auto row = html.inside("tr");
    html.element("td", times.inTable(event.time), R"(class="time")");
    html.element("td", nameOf(event.kind));
    html.element("td", event.text);
    html.element("td", pathTitle(event.path), R"(class="place")");
}

void writeNote(HtmlWriter& html, std::string_view text)
{
    html.element("p", text, R"(class="note")");
}

std::string levelText(const CellLevels& levels, double value)
{
    if (levels.name.empty())
        return std::string(noValue);
    return fmt::format("{} {}", shortNumber(value, 1), levels.unit);
}

std::string namedLevelText(const CellLevels& levels, double value)
{
    return levels.name.empty() ? std::string(noValue)
                               : levels.name + " " + levelText(levels, value);
}

void writeCell(HtmlWriter& html, const SeenCell& cell, const ReportTimes& times)
{
    const auto row = html.inside("tr");
    html.element("td", channelText(cell), R"(class="name")");
    html.element("td", identityText(cell));
    html.element("td", nameOf(cell.kind));
    html.element("td", times.inTable(cell.first), R"(class="time")");
    html.element("td", times.inTable(cell.last), R"(class="time")");
    html.element("td", cell.served.count() > 0 ? durationText(cell.served) : std::string(noValue),
                 number);
    for (const CellLevels* levels : {&cell.level, &cell.quality}) {
        html.element("td", namedLevelText(*levels, levels->best), number);
        html.element("td", levelText(*levels, levels->mean()), number);
    }
}

void writeCellNotes(HtmlWriter& html, const CellHistory& history)
{
    writeNote(html, "Means are over the time for which each level stood, at most 10 s after it was "
                    "told last. The role is the closest to the phone that a cell had.");
    if (history.isFull())
        writeNote(html, fmt::format("More than {} cells came; the others are left out.",
                                    CellHistory::mostCells));
    if (history.step().count() > 0)
        writeNote(html, fmt::format("The display is too large to look at every message: from some "
                                    "time on cells were looked at every {}.",
                                    durationText(history.step())));
}

} // namespace

std::string channelText(const SeenCell& cell)
{
    std::string text(nameOf(cell.system));
    if (cell.channel)
        text += fmt::format(" {}", *cell.channel);
    return cell.band.empty() ? text : fmt::format("{} ({})", text, cell.band);
}

std::string identityText(const SeenCell& cell)
{
    return cell.identity.empty() ? std::string(noValue)
                                 : fmt::format("{} {}", identityNameOf(cell.system), cell.identity);
}

void writeEvents(HtmlWriter& html, std::span<const Event> events, const ReportTimes& times,
                 std::size_t mostBytes)
{
    static constexpr std::array<std::string_view, 4> heads{"Time", "Kind", "What", "Where"};
    const auto part = html.inside("section");
    html.element("h2", "Events");
    if (events.empty())
        return writeNote(html, "None.");
    std::size_t written = 0;
    {
        const auto table = html.inside("table");
        writeHeads(html, heads);
        const auto body = html.inside("tbody");
        for (const std::size_t start = html.size();
             written < events.size() && html.size() - start < mostBytes; ++written)
            writeEvent(html, events[written], times);
    }
    if (written < events.size())
        writeNote(html, fmt::format("{} later events are left out.", events.size() - written));
}

void writeCells(HtmlWriter& html, const CellHistory& history, const ReportTimes& times,
                std::size_t mostBytes)
{
    static constexpr std::array<std::string_view, 10> heads{
        "Channel", "Cell",       "Role", "First seen",   "Last seen",
        "Served",  "Best level", "Mean", "Best quality", "Mean"};
    const auto part = html.inside("section");
    html.element("h2", "Cells");
    const auto cells = history.cells();
    if (cells.empty())
        return writeNote(html, "None.");
    std::size_t written = 0;
    {
        const auto frame = html.inside("div", R"(class="wide")");
        const auto table = html.inside("table", R"(class="cells")");
        writeHeads(html, heads);
        const auto body = html.inside("tbody");
        for (const std::size_t start = html.size();
             written < cells.size() && html.size() - start < mostBytes; ++written)
            writeCell(html, cells[written], times);
    }
    if (written < cells.size())
        writeNote(html, fmt::format("{} more cells are left out.", cells.size() - written));
    writeCellNotes(html, history);
}

} // namespace ventrik
