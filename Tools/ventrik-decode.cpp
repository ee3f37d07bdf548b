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

void addOptions(CommandLine& line, DecodeOptions& result)
{
    line.addArgument("CAPTURE", "a pcap file; - for standard input", result.capture);
    line.addOption("--technology NAME",
                   technologyNames() + "; needed where the capture does not tell",
                   result.technology, technologyValue);
    line.addOption("--format FORMAT",
                   "text: the display tree at the end (default); json: one document; jsonl: a "
                   "line for every message",
                   result.format, formatValue);
    line.addOption("--records LAYOUTS", recordsNames(), result.records, recordsValue);
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
    line.addLogOptions("--verbose shows", result.logLevel,
                       "shows the system log on standard error, and what decoders tell",
                       result.verbose);
    line.addExitStatus(DecodeStatus::done, "all was decoded");
    line.addExitStatus(DecodeStatus::badInput,
                       "the input cannot be read or is damaged (what was decoded before is still "
                       "printed), or the result cannot be written");
}

DecodeOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-decode",
                     "Decodes a capture of log-channel messages and prints the display that the "
                     "viewer would show. Time is the capture's.");
    DecodeOptions result;
    result.version = VENTRIK_VERSION;
    addOptions(line, result);
    line.parse(argc, argv);
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
    const DecodeOptions options = parseArguments(argc, argv);
    std::FILE* output = takeStandardOutput(options.verbose);
    if (!output) {
        complain("ventrik-decode", "standard output is closed");
        return DecodeStatus::badInput;
    }
    endOnInterrupt();
    return decodeCapture(options, output);
}
