#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"
#include "Tools/Recording.h"
#include "Tools/WatchCommand.h"

#include <QCoreApplication>

#include <cstdlib>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>

using namespace ventrik;

namespace
{

RowFormat rowFormatValue(const std::string& text)
{
    static const std::map<std::string_view, RowFormat> formats{
        {"rows", RowFormat::JsonLines}, {"csv", RowFormat::Csv}, {"influx", RowFormat::Influx}};
    const auto format = formats.find(text);
    if (format == formats.end())
        throw WrongValue(fmt::format("there are no rows in the format '{}'", text));
    return format->second;
}

WatchOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-watch",
                     "The viewer for a terminal: shows the display tree in panes, to be walked by "
                     "keys. Where standard input or output is no terminal, prints the tree each "
                     "time something new has arrived.");
    WatchOptions result;
    std::vector<std::string> selected;
    std::optional<RowFormat> rowFormat;
    line.addFlag("--once", "prints the first tree and ends", result.once);
    line.addFlag("--plain", "prints trees on a terminal, too, one in the place of the other",
                 result.plain);
    line.addFlag("--rows", "prints rows of values as they change, as ventrik-decode --format rows",
                 [&] { result.rows.emplace(); });
    line.addOption("--format FORMAT", "of the rows: rows (default), csv or influx", rowFormat,
                   rowFormatValue);
    line.addOption("--select PATH", "of the rows those of the values there and below",
                   [&](const std::string& path) { selected.push_back(textValue(path)); });
    line.addFlag("--channel-pane",
                 "the root ends with a row for the channel: what came, and what did not; c shows "
                 "it, too",
                 result.channelPane);
    line.addOption("--metrics-file FILE",
                   "writes the numbers that show to FILE every 2 s, for Prometheus' node "
                   "exporter",
                   result.metricsFile, textValue);
    line.addOption("--records LAYOUTS", recordsNames(), result.records, recordsValue);
    addRecordingOptions(line, result.recording);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error; from a terminal that "
                       "shows panes, the last 1000 lines at the end",
                       result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "it was ended");
    line.addExitStatus(EXIT_FAILURE,
                       "the tree could not be written, the terminal cannot show panes, or nothing "
                       "can be recorded there");
    line.parse(argc, argv);
    refuseWrongRecording(line);
    if (!selected.empty() && !result.rows)
        line.refuse("--select goes with --rows");
    if (result.channelPane && result.rows)
        line.refuse("--channel-pane does not go with --rows");
    if (rowFormat && !result.rows)
        line.refuse("--format goes with --rows");
    if (result.rows) {
        result.rows->selection = PathSelection(selected);
        result.rows->format = rowFormat.value_or(RowFormat::JsonLines);
    }
    return result;
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const WatchOptions options = parseArguments(argc, argv);
    const QCoreApplication application(argc, argv);
    return WatchCommand(options).run();
}
