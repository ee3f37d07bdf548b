#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/ManyCaptures.h"
#include "Tools/OptionValues.h"

#include <chrono>
#include <csignal>
#include <cstdio>
#include <map>

#include <fmt/format.h>

using namespace ventrik;

namespace
{

/// A format that has a name.
struct NamedFormat {
    DecodeFormat format;
    RowFormat rows = RowFormat::JsonLines;
};

NamedFormat formatValue(const std::string& text)
{
    static const std::map<std::string_view, NamedFormat> formats{
        {"text", {DecodeFormat::Text}},
        {"json", {DecodeFormat::Json}},
        {"jsonl", {DecodeFormat::JsonLines}},
        {"rows", {DecodeFormat::Rows, RowFormat::JsonLines}},
        {"csv", {DecodeFormat::Rows, RowFormat::Csv}},
        {"influx", {DecodeFormat::Rows, RowFormat::Influx}},
        {"html", {DecodeFormat::Html}}};
    const auto format = formats.find(text);
    if (format == formats.end())
        throw WrongValue(fmt::format("there is no format '{}'", text));
    return format->second;
}

// A billion seconds are 32 years.
std::chrono::nanoseconds secondsValue(const std::string& text)
{
    const double seconds = positiveNumberValue(text);
    if (seconds < 1e-6 || seconds > 1e9)
        throw WrongValue(fmt::format("'{}' is no step between a microsecond and 32 years", text));
    return std::chrono::round<std::chrono::nanoseconds>(std::chrono::duration<double>(seconds));
}

struct Options {
    ManyCapturesOptions captures;
    std::vector<std::string> selected;
    UnknownReportOptions report; // where it has a file

    DecodeOptions& decode() { return captures.decode; }
};

void addOptions(CommandLine& line, DecodeOptions& result)
{
    line.addOption("--technology NAME",
                   technologyNames() + "; needed where the capture does not tell",
                   result.technology, technologyValue);
    line.addOption("--format FORMAT",
                   "text: the display tree at the end (default); json: one document; jsonl: a "
                   "line for every message; rows: a line of JSON for every value that changed; "
                   "csv: the same as a table; influx: the same in InfluxDB's line protocol; "
                   "html: a report as one page, with charts, events and cells",
                   [&](const std::string& text) {
                       const NamedFormat format = formatValue(text);
                       result.format = format.format;
                       result.rows.format = format.rows;
                   });
    line.addOption("--records LAYOUTS", recordsNames(), result.records, recordsValue);
    line.addOption("--subscription N",
                   "leaves out what captures tell to be of another subscription",
                   result.subscription, wholeNumberValue);
    line.addOption("--system-log FILE",
                   "writes every system-log line to FILE: its priority, a tab, its text",
                   result.systemLogFile, textValue);
    line.addOption("--snapshot FILE",
                   "writes the snapshot that Save would write after the last message",
                   result.snapshotFile, textValue);
    line.addOption("--description TEXT", "the snapshot's description", result.description,
                   textValue);
    line.addOption("--write-capture FILE",
                   "writes what was read as a capture of ours, in the pcapng form where FILE ends "
                   "with .pcapng",
                   result.captureToWrite, textValue);
    line.addOption("--resources DIR", "takes the display templates from DIR",
                   [&](const std::string& directory) {
                       result.resourceDirectories = {directoryValue(directory)};
                   });
    line.addFlag(
        "--statistics",
        "ends with tables on standard error: the records by code, version, size and layout, "
        "by code and section, and the codes that never came or that nobody decodes",
        result.statistics);
}

void addRowOptions(CommandLine& line, Options& result)
{
    line.beginGroup("Rows");
    line.addOption("--select PATH",
                   "only the values there and below; * stands for any characters of a part, ** "
                   "for any parts; may be given again",
                   [&](const std::string& path) { result.selected.push_back(textValue(path)); });
    line.addOption("--every SECONDS", "the state at each such step in the place of each change",
                   result.decode().rows.every, secondsValue);
    line.addOption(
        "--files-from FILE",
        "decodes the captures that FILE names, one a line; - for standard input",
        [&](const std::string& file) { result.captures.lists.push_back(textValue(file)); });
    line.addOption("--jobs N", "decodes so many captures at a time (default 1)",
                   result.captures.jobs, positiveWholeNumberValue);
    line.addFlag("--strict", "several captures give exit status 1 when one of them does",
                 result.captures.isStrict);
    line.addInformation("--schema", "tells the columns of rows", rowSchema());
}

void addReportOptions(CommandLine& line, Options& result)
{
    line.addArguments("CAPTURE",
                      "a capture of any kind, compressed or not; - for standard input; for rows "
                      "several, and directories",
                      result.captures.captures, CommandLine::Arguments::Any);
    line.beginGroup("Records that cannot be read");
    line.addOption("--report-unknown FILE",
                   "writes which there are to FILE, to be sent to us, and nothing else: codes, "
                   "versions, sizes and counts",
                   result.report.file, textValue);
    line.addFlag("--with-bytes",
                 "also the first payload of each, of measurements that hold no identities",
                 result.report.withBytes);
}

void refuseWrongTogether(const CommandLine& line, const Options& options)
{
    const DecodeOptions& decode = options.captures.decode;
    const auto& captures = options.captures.captures;
    const bool isReport = !options.report.file.empty();
    const bool areRows = decode.format == DecodeFormat::Rows && !isReport;
    if (captures.empty() && (options.captures.lists.empty() || !areRows))
        line.refuse("CAPTURE is required");
    if (captures.size() > 1 && !isReport && decode.format == DecodeFormat::Html)
        line.refuse("--format html goes with one capture");
    if (captures.size() > 1 && !isReport && !areRows)
        line.refuse(fmt::format("what is '{}'?", captures[1]));
    if (!isReport && options.report.withBytes)
        line.refuse("--with-bytes goes with --report-unknown");
    for (const char* option : {"--select", "--every", "--files-from", "--jobs", "--strict"})
        if (line.has(option) && !areRows)
            line.refuse(fmt::format("{} goes with --format rows or csv", option));
    for (const char* option : {"--system-log", "--snapshot", "--write-capture"})
        if (line.has(option) && (captures.size() != 1 || !options.captures.lists.empty()))
            line.refuse(fmt::format("{} goes with one capture", option));
}

Options parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-decode",
                     "Decodes a capture of log-channel messages and prints the display that the "
                     "viewer would show. Time is the capture's.");
    line.addUsage("[OPTION]... CAPTURE");
    line.addUsage("--format rows|csv [OPTION]... CAPTURE...");
    line.addUsage("--report-unknown FILE [--with-bytes] CAPTURE...");
    Options result;
    result.decode().version = VENTRIK_VERSION;
    addOptions(line, result.decode());
    addRowOptions(line, result);
    addReportOptions(line, result);
    line.addLogOptions("--verbose shows", result.decode().logLevel,
                       "shows the system log on standard error, and what decoders tell",
                       result.decode().verbose);
    line.addExitStatus(DecodeStatus::done, "all was decoded");
    line.addExitStatus(DecodeStatus::badInput,
                       "the input cannot be read or is damaged (what was decoded before is still "
                       "printed), or the result cannot be written");
    line.parse(argc, argv);
    refuseWrongTogether(line, result);
    result.decode().rows.selection = PathSelection(result.selected);
    if (!result.captures.captures.empty())
        result.decode().capture = result.captures.captures.front();
    result.report.captures = result.captures.captures;
    return result;
}

// The farewell of the class index, above all, is none of the result.
std::FILE* openOutput(bool verbose)
{
    const int descriptor =
        takeStandardOutput(verbose ? OthersOutput::ToStandardError : OthersOutput::Nowhere);
    return descriptor >= 0 ? fdopen(descriptor, "w") : nullptr;
}

// A second Ctrl+C ends at once. A read that waits for standard input is not taken up again. In the
// background the shell has the interrupt ignored, and so it stays.
void endOnInterrupt()
{
    struct sigaction inherited = {};
    sigaction(SIGINT, nullptr, &inherited);
    if (inherited.sa_handler == SIG_IGN)
        return;
    struct sigaction action = {};
    action.sa_handler = [](int) { interruptDecoding(); };
    action.sa_flags = static_cast<int>(SA_RESETHAND);
    sigaction(SIGINT, &action, nullptr);
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    Options options = parseArguments(argc, argv);
    if (!options.report.file.empty()) {
        endOnInterrupt();
        return reportUnknownRecords(options.report);
    }
    std::FILE* output = openOutput(options.decode().verbose);
    if (!output) {
        complain("ventrik-decode", "standard output is closed");
        return DecodeStatus::badInput;
    }
    endOnInterrupt();
    return options.decode().format == DecodeFormat::Rows ? decodeCaptures(options.captures, output)
                                                         : decodeCapture(options.decode(), output);
}
