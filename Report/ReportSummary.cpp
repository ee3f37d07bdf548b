#include "Report/ReportSummary.h"

#include "Charts/ChartTexts.h"
#include "Report/ReportLists.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using std::chrono::nanoseconds;

constexpr std::size_t mostServingCells = 20;

void writeFact(HtmlWriter& html, std::string_view name, std::string_view text)
{
    const auto row = html.inside("tr");
    html.element("th", name, R"(scope="row")");
    html.element("td", text);
}

void writeFacts(HtmlWriter& html, const ReportFacts& facts, const ReportRange& range,
                const ReportTimes& times)
{
    const auto table = html.inside("table", R"(class="values facts")");
    const auto body = html.inside("tbody");
    writeFact(html, "Capture", facts.capture);
    writeFact(html, "Technology", facts.technology);
    if (range.hasValues) {
        writeFact(html, "From", times.withDate(range.first));
        writeFact(html, "To", times.withDate(range.last));
        writeFact(html, "Duration", durationText(range.last - range.first));
        writeFact(html, "Time zone", times.zone());
    }
    writeFact(html, "Records", fmt::format("{}", facts.recordCount));
    writeFact(html, "Decoded", fmt::format("{}", facts.decodedCount));
}

double shareOf(nanoseconds part, nanoseconds whole)
{
    return whole.count() > 0
               ? 100.0 * static_cast<double>(part.count()) / static_cast<double>(whole.count())
               : 0;
}

void writeServingCell(HtmlWriter& html, const SeenCell& cell, nanoseconds whole)
{
    const double share = shareOf(cell.served, whole);
    const auto row = html.inside("tr");
    html.element("td", channelText(cell));
    html.element("td", identityText(cell));
    html.element("td", durationText(cell.served), R"(class="number")");
    html.element("td", fmt::format("{:.1f} %", share), R"(class="number")");
    const auto place = html.inside("td", R"(class="bar")");
    html.element("div", "", fmt::format("style=\"width:{:.1f}%\"", std::min(share, 100.0)));
}

void writeServingCells(HtmlWriter& html, const CellHistory& history, nanoseconds whole)
{
    auto cells = history.cells();
    const std::size_t seen = cells.size();
    std::erase_if(cells, [](const SeenCell& cell) { return cell.served.count() == 0; });
    html.element("p", fmt::format("{} cells were seen; {} of them served. Shares are of the whole "
                                  "time; cells of two systems may serve at once. Time counts while "
                                  "a cell is told, and at most 10 s after.",
                                  seen, cells.size()));
    if (cells.empty())
        return;
    {
        const auto table = html.inside("table", R"(class="serving")");
        html.piece("<thead><tr><th scope=\"col\">Serving channel</th><th scope=\"col\">Cell</th>"
                   "<th scope=\"col\">Time</th><th scope=\"col\" colspan=\"2\">Share</th></tr>"
                   "</thead>\n");
        const auto body = html.inside("tbody");
        for (std::size_t i = 0; i < std::min(cells.size(), mostServingCells); ++i)
            writeServingCell(html, cells[i], whole);
    }
    if (cells.size() > mostServingCells)
        html.element(
            "p", fmt::format("{} more are in the table of cells.", cells.size() - mostServingCells),
            R"(class="note")");
}

void writeNotes(HtmlWriter& html, const ReportFacts& facts, const ReportRange& range,
                const CellHistory& history)
{
    constexpr std::size_t mostNotes = 50;
    const auto warning = R"(class="warning")";
    for (std::size_t i = 0; i < std::min(facts.notes.size(), mostNotes); ++i)
        html.element("p", facts.notes[i], warning);
    if (facts.notes.size() > mostNotes)
        html.element("p",
                     fmt::format("{} more notes are left out.", facts.notes.size() - mostNotes),
                     warning);
    if (!range.isWhole)
        html.element("p",
                     "There was more than the report can hold: its charts and events begin with "
                     "what is told above; cells and records count from the first one.",
                     warning);
    if (history.silence().count() > 0)
        html.element("p",
                     fmt::format("For {} no messages came; that time counts for no cell.",
                                 durationText(history.silence())),
                     R"(class="note")");
}

} // namespace

void writeSummary(HtmlWriter& html, const ReportFacts& facts, const ReportRange& range,
                  const ReportTimes& times, const CellHistory& history)
{
    const auto part = html.inside("section");
    html.element("h1", "Radio report");
    html.element("p",
                 range.hasValues ? fmt::format("{} · {} · {}", facts.technology,
                                               times.withDate(range.first), times.zone())
                                 : facts.technology,
                 R"(class="subtitle")");
    writeFacts(html, facts, range, times);
    writeServingCells(html, history, history.whole());
    writeNotes(html, facts, range, history);
    if (!range.hasValues)
        html.element("p", "The capture shows no values.", R"(class="warning")");
}

} // namespace ventrik
