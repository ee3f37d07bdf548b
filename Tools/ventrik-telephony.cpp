#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "TelephonyService/ReplaySource.h"
#include "TelephonyService/ScenarioCapture.h"
#include "TelephonyService/Scenarios.h"
#include "TelephonyService/TelephonyService.h"
#include "Tools/CommandLine.h"

#include <QCoreApplication>

#include <cstdlib>

#include <fmt/format.h>
#include <getopt.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik-telephony --technology NAME [--seed N]\n"
    "       ventrik-telephony --technology NAME [--seed N] --write CAPTURE [--count N]\n"
    "       ventrik-telephony --replay CAPTURE [--speed FACTOR|max] [--loop]\n"
    "\n"
    "A telephony service for machines without a baseband: answers the log-channel protocol and\n"
    "streams a built-in scenario, or a capture, to every viewer that connects.\n"
    "\n"
    "  --technology NAME  the scenario of that technology: lte, gsm, utran, c2k or ifx\n"
    "  --seed N           another drive through the same scenario (default 1)\n"
    "  --write CAPTURE    writes the scenario's messages to a capture instead, and ends\n"
    "  --count N          so many of them (default 10000)\n"
    "  --replay CAPTURE   replays a capture with the pauses it was recorded with\n"
    "  --speed FACTOR     replays that much faster; max: as fast as the viewer takes\n"
    "  --loop             begins again at the capture's end\n"
    "  --log-level LEVEL  the least urgent lines that go to the system log: debug, info, notice,\n"
    "                     warning, error (default), critical, alert or emergency\n"
    "  --verbose          copies every line of the log to standard error\n"
    "  --help, --version\n"
    "\n"
    "Ended by SIGTERM or SIGINT. Exit status: 0 ended so, 1 it could not start, 2 wrong usage.\n";

struct ServiceOptions {
    std::optional<CaptureTechnology> technology;
    std::uint32_t seed = 1;
    std::optional<std::string> captureToWrite;
    std::uint32_t messageCount = 10000;
    std::optional<ReplayOptions> replay;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

std::uint32_t numberArgument(const CommandLine& line, std::string_view option)
{
    char* end = nullptr;
    errno = 0;
    const unsigned long number = std::strtoul(line.value(), &end, 10);
    if (end == line.value() || *end != '\0' || errno != 0 || number > UINT32_MAX)
        line.refuse(
            fmt::format("{} takes a whole number below 2^32, not '{}'", option, line.value()));
    return static_cast<std::uint32_t>(number);
}

std::optional<double> speedArgument(const CommandLine& line)
{
    if (std::string_view(line.value()) == "max")
        return std::nullopt;
    return line.positiveNumber("--speed");
}

CaptureTechnology technologyArgument(const CommandLine& line)
{
    const auto technology = technologyNamed(line.value());
    if (!technology)
        line.refuse(fmt::format("there is no technology '{}'", line.value()));
    if (!makeScenario(*technology, 1))
        line.refuse(fmt::format("there is no scenario for '{}' yet", line.value()));
    return *technology;
}

struct ReplayArguments {
    std::optional<std::string> capture;
    std::optional<double> speed = 1.0;
    bool loop = false;
    bool isAskedFor = false;
};

void takeOption(int letter, const CommandLine& line, ServiceOptions& result,
                ReplayArguments& replay)
{
    switch (letter) {
    case 't':
        result.technology = technologyArgument(line);
        break;
    case 'n':
        result.seed = numberArgument(line, "--seed");
        break;
    case 'w':
        result.captureToWrite = line.value();
        break;
    case 'c':
        result.messageCount = numberArgument(line, "--count");
        break;
    case 'r':
        replay.capture = line.value();
        break;
    case 's':
        replay.speed = speedArgument(line);
        replay.isAskedFor = true;
        break;
    case 'l':
        replay.loop = replay.isAskedFor = true;
        break;
    case 'L':
        result.logLevel = line.logLevel();
        break;
    case 'V':
        result.verbose = true;
        break;
    case 'h':
        line.tell(usage);
    default:
        line.tell("ventrik-telephony " VENTRIK_VERSION "\n");
    }
}

ServiceOptions parseArguments(int argc, char** argv)
{
    static const option options[] = {{"technology", required_argument, nullptr, 't'},
                                     {"seed", required_argument, nullptr, 'n'},
                                     {"write", required_argument, nullptr, 'w'},
                                     {"count", required_argument, nullptr, 'c'},
                                     {"replay", required_argument, nullptr, 'r'},
                                     {"speed", required_argument, nullptr, 's'},
                                     {"loop", no_argument, nullptr, 'l'},
                                     {"log-level", required_argument, nullptr, 'L'},
                                     {"verbose", no_argument, nullptr, 'V'},
                                     {"help", no_argument, nullptr, 'h'},
                                     {"version", no_argument, nullptr, 'v'},
                                     {}};
    CommandLine line("ventrik-telephony", argc, argv);
    ServiceOptions result;
    ReplayArguments replay;
    for (int letter = 0; (letter = line.next(options)) != -1;)
        takeOption(letter, line, result, replay);
    if (!line.arguments().empty())
        line.refuse(fmt::format("what is '{}'?", line.arguments().front()));
    if (result.technology.has_value() == replay.capture.has_value())
        line.refuse("either --technology or --replay");
    if (replay.capture)
        result.replay = ReplayOptions{*replay.capture, replay.speed, replay.loop};
    else if (replay.isAskedFor)
        line.refuse("--speed and --loop go with --replay");
    if (result.captureToWrite && !result.technology)
        line.refuse("--write goes with --technology");
    return result;
}

// What the service streams, or none with the reason.
std::optional<LogChannelContent> makeContent(const ServiceOptions& options, SystemLog& log,
                                             std::string& error)
{
    if (options.technology) {
        return LogChannelContent{std::string(options.technology->identifier),
                                 [technology = *options.technology, seed = options.seed] {
                                     return makeScenario(technology, seed);
                                 }};
    }
    const auto reader = CaptureReader::open(options.replay->capture, error);
    if (!reader)
        return std::nullopt;
    const auto technology = reader->technology();
    if (!technology) {
        error = fmt::format("{}: link type {} names no technology", options.replay->capture,
                            reader->linkType());
        return std::nullopt;
    }
    return LogChannelContent{std::string(technology->identifier),
                             [replay = *options.replay, &log]() -> std::unique_ptr<MessageSource> {
                                 std::string reason;
                                 auto source = ReplaySource::open(replay, reason);
                                 if (!source)
                                     log.error("Cannot replay {}", reason);
                                 return source;
                             }};
}

int fail(std::string_view reason)
{
    complain("ventrik-telephony", reason);
    return EXIT_FAILURE;
}

int writeCapture(const ServiceOptions& options)
{
    const auto scenario = makeScenario(*options.technology, options.seed);
    std::string error;
    if (writeScenarioCapture(*scenario, options.messageCount, *options.technology,
                             *options.captureToWrite, error))
        return EXIT_SUCCESS;
    return fail(error);
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const ServiceOptions options = parseArguments(argc, argv);
    if (options.captureToWrite)
        return writeCapture(options);
    QCoreApplication application(argc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });

    LinuxPlatformOptions platformOptions;
    platformOptions.programName = "ventrik-telephony";
    platformOptions.verbose = options.verbose;
    platformOptions.logThreshold = options.logLevel;
    LinuxPlatform platform(platformOptions);

    std::string error;
    auto content = makeContent(options, platform.log(), error);
    if (!content)
        return fail(error);
    TelephonyService service(platform.mainQueue(), platform.ports(), platform.log(),
                             std::move(*content));
    if (!service.start(error)) {
        platform.log().flush(); // what it says there comes first
        return fail(error);
    }
    return QCoreApplication::exec();
}
