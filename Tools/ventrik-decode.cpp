#include "Tools/CommandLine.h"
#include "Tools/DecodeCommand.h"

#include <csignal>
#include <filesystem>
#include <map>

#include <fmt/format.h>
#include <getopt.h>
#include <unistd.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik-decode [--technology NAME] [--format text|json|jsonl] [--system-log FILE]\n"
    "                      [--snapshot FILE] [--description TEXT] [--resources DIR] CAPTURE\n"
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
    "  --help, --version\n"
    "\n"
    "Exit status: 0 done, 1 the input cannot be read or is damaged, 2 wrong usage.\n";

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
    case 'h':
        tell(usage);
    default:
        tell("ventrik-decode " VENTRIK_VERSION "\n");
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
// class index above all, goes to standard error.
std::FILE* takeStandardOutput()
{
    const int descriptor = dup(STDOUT_FILENO);
    std::FILE* output = descriptor >= 0 ? fdopen(descriptor, "w") : nullptr;
    dup2(STDERR_FILENO, STDOUT_FILENO);
    return output;
}

// A second Ctrl+C ends at once. A read that waits for standard input is not taken up again.
void endOnInterrupt()
{
    struct sigaction action = {};
    action.sa_handler = [](int) { interruptDecoding(); };
    action.sa_flags = static_cast<int>(SA_RESETHAND);
    sigaction(SIGINT, &action, nullptr);
}

} // namespace

int main(int argc, char** argv)
{
    const DecodeOptions options = parseArguments(argc, argv);
    std::FILE* output = takeStandardOutput();
    if (!output) {
        fmt::print(stderr, "ventrik-decode: standard output is closed\n");
        return DecodeStatus::badInput;
    }
    endOnInterrupt();
    return decodeCapture(options, output);
}
