#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/DecodeCommand.h"

#include <csignal>
#include <filesystem>
#include <map>

#include <fcntl.h>
#include <fmt/format.h>
#include <getopt.h>
#include <unistd.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik-decode [--technology NAME] [--format text|json|jsonl] [--system-log FILE]\n"
    "                      [--snapshot FILE] [--description TEXT] [--resources DIR]\n"
    "                      [--log-level LEVEL] [--verbose] CAPTURE\n"
    "\n"
    "Decodes a capture of log-channel messages (a pcap file; - for standard input) and prints the\n"
    "display that the viewer would show.\n"
    "\n"
    "  --technology NAME   lte, gsm, utran, c2k or ifx; needed where the capture does not tell\n"
    "  --format FORMAT     text: the display tree at the end (default)\n"
    "                      json: one document; jsonl: a line for every message\n"
    "  --system-log FILE   writes every system-log line to FILE\n"
    "  --snapshot FILE     writes the snapshot that Save would write after the last message\n"
    "  --description TEXT  the snapshot's description\n"
    "  --resources DIR     takes the display templates from DIR\n"
    "  --verbose           shows the system log on standard error, and what decoders tell\n"
    "  --log-level LEVEL   the least urgent lines that --verbose shows: debug (default), info,\n"
    "                      notice, warning, error, critical, alert or emergency\n"
    "  --help, --version\n"
    "\n"
    "Exit status: 0 done, 1 the input cannot be read or is damaged or the result cannot be\n"
    "written, 2 wrong usage.\n";

CaptureTechnology technologyArgument(const CommandLine& line)
{
    const auto technology = technologyNamed(line.value());
    if (!technology)
        line.refuse(fmt::format("there is no technology '{}'", line.value()));
    return *technology;
}

DecodeFormat formatArgument(const CommandLine& line)
{
    static const std::map<std::string_view, DecodeFormat> formats{
        {"text", DecodeFormat::Text},
        {"json", DecodeFormat::Json},
        {"jsonl", DecodeFormat::JsonLines}};
    const auto format = formats.find(line.value());
    if (format == formats.end())
        line.refuse(fmt::format("there is no format '{}'", line.value()));
    return format->second;
}

std::string directoryArgument(const CommandLine& line)
{
    std::error_code error;
    if (!std::filesystem::is_directory(line.value(), error))
        line.refuse(fmt::format("'{}' is no directory", line.value()));
    return line.value();
}

void takeOption(int letter, const CommandLine& line, DecodeOptions& result)
{
    switch (letter) {
    case 't':
        result.technology = technologyArgument(line);
        break;
    case 'f':
        result.format = formatArgument(line);
        break;
    case 'l':
        result.systemLogFile = line.value();
        break;
    case 's':
        result.snapshotFile = line.value();
        break;
    case 'd':
        result.description = line.value();
        break;
    case 'r':
        result.resourceDirectories = {directoryArgument(line)};
        break;
    case 'V':
        result.verbose = true;
        break;
    case 'L':
        result.logLevel = line.logLevel();
        break;
    case 'h':
        line.tell(usage);
    default:
        line.tell("ventrik-decode " VENTRIK_VERSION "\n");
    }
}

DecodeOptions parseArguments(int argc, char** argv)
{
    static const option options[] = {{"technology", required_argument, nullptr, 't'},
                                     {"format", required_argument, nullptr, 'f'},
                                     {"system-log", required_argument, nullptr, 'l'},
                                     {"snapshot", required_argument, nullptr, 's'},
                                     {"description", required_argument, nullptr, 'd'},
                                     {"resources", required_argument, nullptr, 'r'},
                                     {"verbose", no_argument, nullptr, 'V'},
                                     {"log-level", required_argument, nullptr, 'L'},
                                     {"help", no_argument, nullptr, 'h'},
                                     {"version", no_argument, nullptr, 'v'},
                                     {}};
    CommandLine line("ventrik-decode", argc, argv);
    DecodeOptions result;
    result.version = VENTRIK_VERSION;
    for (int letter = 0; (letter = line.next(options)) != -1;)
        takeOption(letter, line, result);
    const auto arguments = line.arguments();
    if (arguments.size() != 1)
        line.refuse(arguments.empty() ? "which capture?" : "one capture at a time");
    result.capture = arguments.front();
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
