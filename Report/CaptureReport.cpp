#include "Report/CaptureReport.h"

#include "Model/DisplayMoment.h"
#include "Model/EventLog.h"
#include "Report/HtmlWriter.h"
#include "Report/ReportCharts.h"
#include "Report/ReportLists.h"
#include "Report/ReportStyle.h"
#include "Report/ReportValues.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// With the charts a page stays below 5 MB.
constexpr std::size_t mostEventBytes = 600'000;
constexpr std::size_t mostCellBytes = 300'000;
constexpr std::size_t mostValueBytes = 1'000'000;

constexpr std::size_t mostStored = std::size_t{1} << 30;

void writeHead(HtmlWriter& html, const ReportFacts& facts)
{
    const auto head = html.inside("head");
    html.piece("<meta charset=\"utf-8\"/>\n"
               "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\"/>\n"
               // Nothing is loaded, whatever a capture holds.
               "<meta http-equiv=\"Content-Security-Policy\" "
               "content=\"default-src 'none'; style-src 'unsafe-inline'\"/>\n");
    html.element("title", "Radio report: " + facts.capture);
    const auto style = html.inside("style");
    html.piece(reportStyle);
}

} // namespace

CaptureReport::CaptureReport(const LogGenerator& generator, const Technology& technology,
                             RecordsMode records)
    : _generator(generator),
      _technology(technology),
      _wanted(generator.getStartCommand()),
      _store(records, {mostStored, std::chrono::nanoseconds::max()})
{
    _store.useGenerator(&generator, technology.name);
}

void CaptureReport::take(Clock::TimePoint time, ByteView message, const PlistDictionary& state)
{
    ++_recordCount;
    if (_generator.lastRead() || _wanted.wants(message))
        ++_decodedCount;
    _store.messageTaken(time, message, state);
    _cells.update();
}

std::optional<Clock::TimePoint> CaptureReport::firstTime() const
{
    return _store.isEmpty() ? std::nullopt : std::optional(_store.firstTime());
}

ReportRange CaptureReport::range() const
{
    return {.first = _store.firstTime(),
            .last = std::max(_store.firstTime(), _store.lastTime()),
            .hasValues = !_store.isEmpty(),
            .isWhole = _store.firstMoment() == 0 && _store.generation() == 0};
}

std::string CaptureReport::page(ReportFacts facts) const
{
    facts.technology = _technology.displayName;
    facts.recordCount = _recordCount;
    facts.decodedCount = _decodedCount;
    if (_store.lateCount() > 0)
        facts.notes.push_back(
            fmt::format("{} records are older than one before them: they are shown at its time",
                        _store.lateCount()));
    const ReportRange shown = range();
    const ReportTimes times(facts.secondsFromUtc, shown.first, shown.last);
    const auto events = EventLog(_store).update();

    HtmlWriter html;
    html.piece("<!DOCTYPE html>\n");
    {
        const auto document =
            html.inside("html", R"(xmlns="http://www.w3.org/1999/xhtml" lang="en")");
        writeHead(html, facts);
        const auto body = html.inside("body");
        writeSummary(html, facts, shown, times, _cells);
        ReportCharts(_store, times, events).write(html);
        writeEvents(html, events, times, mostEventBytes);
        writeCells(html, _cells, times, mostCellBytes);
        DisplayMoment end = _store.at(_store.present());
        writeValues(html, end, mostValueBytes);
        html.element("footer", fmt::format("{} · times in {}", facts.program, times.zone()));
    }
    return html.written();
}

} // namespace ventrik
