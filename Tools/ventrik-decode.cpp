#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/DecodeCommand.h"
#include "Tools/OptionValues.h"

#include <csignal>
#include <map>

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

using namespace ventrik;

namespace
{

DecodeFormat formatValue(const std::string& text)
{
    static const std::map<std::string_view, DecodeFormat> formats{
        {"text", DecodeFormat::Text},
        {"json", DecodeFormat::Json},
        {"jsonl", DecodeFormat::JsonLines}};
    const auto format = formats.find(text);
    if (format == formats.end())
        throw WrongValue(fmt::format("there is no format '{}'", text));
    return format->second;
}

struct Options {
    DecodeOptions decode;
    UnknownReportOptions report; // where it has a file
};

void addOptions(CommandLine& line, DecodeOptions& result)
{
    line.addOption("--technology NAME",
                   technologyNames() + "; needed where the capture does not tell",
                   result.technology, technologyValue);
    line.addOption("--format FORMAT",
                   "text: the display tree at the end (default); json: one document; jsonl: a "
                   "line for every message",
                   result.format, formatValue);
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
    line.addOption("--resources DIR", "takes the display templates from DIR",
                   [&](const std::string& directory) {
                       result.resourceDirectories = {directoryValue(directory)};
                   });
    line.addFlag("--statistics",
                 "ends with a table of the records by code, version, size and layout, on standard "
                 "error",
                 result.statistics);
    line.addLogOptions("--verbose shows", result.logLevel,
                       "shows the system log on standard error, and what decoders tell",
                       result.verbose);
    line.addExitStatus(DecodeStatus::done, "all was decoded");
    line.addExitStatus(DecodeStatus::badInput,
                       "the input cannot be read or is damaged (what was decoded before is still "
                       "printed), or the result cannot be written");
}

void addReportOptions(CommandLine& line, UnknownReportOptions& result)
{
    line.addArguments("CAPTURE", "a capture of any kind, compressed or not; - for standard input",
                      result.captures);
    line.beginGroup("Records that cannot be read");
    line.addOption("--report-unknown FILE",
                   "writes which there are to FILE, to be sent to us, and nothing else: codes, "
                   "versions, sizes and counts",
                   result.file, textValue);
    line.addFlag("--with-bytes",
                 "also the first payload of each, of measurements that hold no identities",
                 result.withBytes);
}

Options parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-decode",
                     "Decodes a capture of log-channel messages and prints the display that the "
                     "viewer would show. Time is the capture's.");
    line.addUsage("[OPTION]... CAPTURE");
    line.addUsage("--report-unknown FILE [--with-bytes] CAPTURE...");
    Options result;
    result.decode.version = VENTRIK_VERSION;
    addOptions(line, result.decode);
    addReportOptions(line, result.report);
    line.parse(argc, argv);
    if (result.report.file.empty() && result.report.captures.size() > 1)
        line.refuse(fmt::format("what is '{}'?", result.report.captures[1]));
    if (result.report.file.empty() && result.report.withBytes)
        line.refuse("--with-bytes goes with --report-unknown");
    result.decode.capture = result.report.captures.front();
    return result;
}

// Standard output is for the result alone: whatever else is written there, the farewell of the
// class index above all, goes to standard error where that is asked for, or else nowhere.
std::FILE* takeStandardOutput(bool verbose)
{
    const int descriptor = dup(STDOUT_FILENO);
    std::FILE* output = descriptor >= 0 ? fdopen(descriptor, "w") : nullptr;
    dup2(verbose ? STDERR_FILENO : open("/dev/null", O_WRONLY), STDOUT_FILENO);
    std::setvbuf(stdout, nullptr, _IOLBF, BUFSIZ); // so that it comes in its place
    return output;
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
    const Options options = parseArguments(argc, argv);
    if (!options.report.file.empty()) {
        endOnInterrupt();
        return reportUnknownRecords(options.report);
    }
    std::FILE* output = takeStandardOutput(options.decode.verbose);
    if (!output) {
        complain("ventrik-decode", "standard output is closed");
        return DecodeStatus::badInput;
    }
    endOnInterrupt();
    return decodeCapture(options.decode, output);
}
