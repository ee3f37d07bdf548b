#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "TelephonyService/ReplaySource.h"
#include "TelephonyService/ScenarioCapture.h"
#include "TelephonyService/Scenarios.h"
#include "TelephonyService/TelephonyService.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"

#include <QCoreApplication>

#include <cstdlib>

#include <fmt/format.h>

using namespace ventrik;

namespace
{

struct ServiceOptions {
    std::optional<Technology> technology;
    std::uint32_t seed = 1;
    RecordsMode records = RecordsMode::Base;
    std::optional<std::string> captureToWrite;
    std::uint32_t messageCount = 10000;
    std::optional<ReplayOptions> replay;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

std::optional<double> speedValue(const std::string& text)
{
    return text == "max" ? std::nullopt : std::optional(positiveNumberValue(text));
}

Technology scenarioValue(const std::string& text)
{
    const Technology technology = technologyValue(text);
    if (!makeScenario(technology, 1))
        throw WrongValue(fmt::format("there is no scenario for '{}' yet", text));
    return technology;
}

void addScenarioOptions(CommandLine& line, ServiceOptions& result)
{
    line.addOption("--technology NAME", "the scenario of that technology: " + technologyNames(),
                   result.technology, scenarioValue);
    line.addOption("--seed N",
                   "another drive through the same scenario (default 1); the same number gives "
                   "the same drive",
                   result.seed, wholeNumberValue);
    line.addOption("--records LAYOUTS",
                   "the scenario's records: base (default); newer: in the layouts that devices of "
                   "today log; extended: also those that have no base layout",
                   result.records, recordsValue);
    line.addOption("--write CAPTURE",
                   "writes the scenario's messages to a capture instead, and ends",
                   result.captureToWrite, textValue);
    line.addOption("--count N", "so many of them (default 10000)", result.messageCount,
                   wholeNumberValue);
}

void addReplayOptions(CommandLine& line, ReplayOptions& result)
{
    line.beginGroup("Replay");
    line.addOption("--replay CAPTURE", "replays a capture with the pauses it was recorded with",
                   result.capture, textValue);
    line.addOption("--speed FACTOR", "replays that much faster; max: as fast as the viewer takes",
                   result.speed, speedValue);
    line.addFlag("--loop", "begins again at the capture's end", result.loop);
}

void refuseWrongTogether(const CommandLine& line)
{
    if (line.has("--technology") == line.has("--replay"))
        line.refuse("either --technology or --replay");
    if (!line.has("--replay") && (line.has("--speed") || line.has("--loop")))
        line.refuse("--speed and --loop go with --replay");
    if (line.has("--write") && !line.has("--technology"))
        line.refuse("--write goes with --technology");
}

ServiceOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-telephony",
                     "A telephony service for machines without a baseband: answers the log-channel "
                     "protocol and streams a built-in scenario, or a capture, to every viewer that "
                     "connects.");
    ServiceOptions result;
    ReplayOptions replay;
    line.addUsage("--technology NAME [OPTION]...");
    line.addUsage("--replay CAPTURE [OPTION]...");
    addScenarioOptions(line, result);
    addReplayOptions(line, replay);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error", result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "a signal ended it");
    line.addExitStatus(EXIT_FAILURE, "it could not start");
    line.parse(argc, argv);
    refuseWrongTogether(line);
    if (line.has("--replay"))
        result.replay = replay;
    return result;
}

// What the service streams, or none with the reason.
std::optional<LogChannelContent> makeContent(const ServiceOptions& options, SystemLog& log,
                                             std::string& error)
{
    if (options.technology) {
        return LogChannelContent{
            std::string(options.technology->identifier),
            [technology = *options.technology, seed = options.seed, records = options.records] {
                return makeScenario(technology, seed, records);
            }};
    }
    auto reader = CaptureReader::open(options.replay->capture, error);
    if (!reader)
        return std::nullopt;
    const auto type = reader->linkType();
    const auto technology = type ? reader->technology() : reader->guessTechnology();
    if (!technology) {
        error = type ? fmt::format("{}: link type {} names no technology", options.replay->capture,
                                   *type)
                     : fmt::format("{}: no record tells the technology", options.replay->capture);
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
    const auto scenario = makeScenario(*options.technology, options.seed, options.records);
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
