#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/LinuxSerialPort.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "TelephonyService/DiagnosticPort.h"
#include "TelephonyService/ReplaySource.h"
#include "TelephonyService/ScenarioCapture.h"
#include "TelephonyService/Scenarios.h"
#include "TelephonyService/StreamRecording.h"
#include "TelephonyService/TelephonyService.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"
#include "Tools/Recording.h"

#include <QCoreApplication>

#include <cstdlib>

#include <fmt/format.h>

using namespace ventrik;

namespace
{

constexpr const char* programName = "ventrik-telephony";

struct ServiceOptions {
    std::optional<Technology> technology;
    std::uint32_t seed = 1;
    RecordsMode records = RecordsMode::Base;
    std::optional<std::string> captureToWrite;
    std::uint32_t messageCount = 10000;
    std::optional<ReplayOptions> replay;
    std::optional<std::string> serialDevice;
    RecordingOptions recording;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

void addScenarioOptions(CommandLine& line, ServiceOptions& result)
{
    line.addOption("--technology NAME",
                   "the scenario of that technology, or what the capture or the port speaks: " +
                       technologyNames(),
                   result.technology, technologyValue);
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

void addSerialOptions(CommandLine& line, ServiceOptions& result)
{
    line.beginGroup("Serial port");
    line.addOption("--serial DEVICE",
                   "streams what a phone's diagnostic port measures, live; while it is away it is "
                   "tried again every 5 s",
                   result.serialDevice, textValue);
}

// A diagnostic port sends records of log codes, and the cell monitor has none.
bool hasLogCodes(const Technology& technology)
{
    return technology.identifier != Technologies::cellMonitor.identifier;
}

void refuseWrongTogether(const CommandLine& line, const ServiceOptions& options)
{
    if (!line.has("--technology") && !line.has("--replay"))
        line.refuse(line.has("--serial") ? "--serial goes with --technology"
                                         : "either --technology, --replay or --serial");
    if (line.has("--serial") && line.has("--replay"))
        line.refuse("either --replay or --serial");
    if (line.has("--serial") && !hasLogCodes(*options.technology))
        line.refuse("the cell monitor's messages do not come from a diagnostic port");
    if (!line.has("--replay") && (line.has("--speed") || line.has("--loop")))
        line.refuse("--speed and --loop go with --replay");
    if (line.has("--write") && (line.has("--replay") || line.has("--serial")))
        line.refuse("--write goes with a scenario");
    if (line.has("--write") && line.has("--record"))
        line.refuse("either --write or --record");
}

ServiceOptions parseArguments(int argc, char** argv)
{
    CommandLine line(programName,
                     "A telephony service for machines without a baseband: answers the log-channel "
                     "protocol and streams a built-in scenario, a capture, or what a phone's "
                     "diagnostic port measures, to every viewer that connects.");
    ServiceOptions result;
    ReplayOptions replay;
    line.addUsage("--technology NAME [OPTION]...");
    line.addUsage("--replay CAPTURE [OPTION]...");
    line.addUsage("--serial DEVICE --technology NAME [OPTION]...");
    addScenarioOptions(line, result);
    addReplayOptions(line, replay);
    addSerialOptions(line, result);
    addRecordingOptions(line, result.recording);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error", result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "a signal ended it");
    line.addExitStatus(EXIT_FAILURE, "it could not start");
    line.parse(argc, argv);
    refuseWrongTogether(line, result);
    refuseWrongRecording(line);
    if (line.has("--replay"))
        result.replay = replay;
    return result;
}

LogChannelContent scenarioContent(const ServiceOptions& options)
{
    return {std::string(options.technology->identifier),
            [technology = *options.technology, seed = options.seed, records = options.records] {
                return makeScenario(technology, seed, records);
            }};
}

// The one that was named, else the capture's; none with the reason.
std::optional<Technology> technologyOfReplay(const ServiceOptions& options, std::string& error)
{
    auto reader = CaptureReader::open(options.replay->capture, error);
    if (!reader || options.technology)
        return reader ? options.technology : std::nullopt;
    const auto type = reader->linkType();
    const auto technology = type ? reader->technology() : reader->guessTechnology();
    if (!technology)
        error = type ? fmt::format("{}: link type {} names no technology; say which with "
                                   "--technology",
                                   options.replay->capture, *type)
                     : fmt::format("{}: no record tells the technology; say which with "
                                   "--technology",
                                   options.replay->capture);
    return technology;
}

std::optional<LogChannelContent> replayContent(const ServiceOptions& options, SystemLog& log,
                                               std::string& error)
{
    const auto technology = technologyOfReplay(options, error);
    if (!technology)
        return std::nullopt;
    return LogChannelContent{std::string(technology->identifier),
                             [replay = *options.replay, &log]() -> std::unique_ptr<MessageSource> {
                                 std::string reason;
                                 auto source = ReplaySource::open(replay, reason);
                                 if (!source)
                                     log.error("Cannot replay {}", reason);
                                 return source;
                             }};
}

LogChannelContent serialContent(const ServiceOptions& options, DiagnosticPort& port)
{
    return {std::string(options.technology->identifier), [&port] { return port.makeSource(); }};
}

int fail(std::string_view reason)
{
    complain(programName, reason);
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

/// What the service streams, on its way into captures.
struct ServiceRecording {
    ServiceRecording(const RecordingOptions& options, const PlistValue& technology,
                     const Platform& platform)
        : recorder(
              makeRecorder(programName, platform.mainQueue, platform.clock, platform.log, options)),
          observer(*recorder)
    {
        recorder->setTechnology(technologyOfIdentifier(technology));
    }

    std::unique_ptr<CaptureRecorder> recorder;
    StreamRecording observer;
};

int serve(const ServiceOptions& options, LinuxPlatform& platform)
{
    LinuxSerialPorts serialPorts;
    std::optional<DiagnosticPort> diagnosticPort;
    if (options.serialDevice)
        diagnosticPort.emplace(platform.mainQueue(), serialPorts, platform.log(),
                               *options.serialDevice);
    std::string error;
    auto content = diagnosticPort   ? serialContent(options, *diagnosticPort)
                   : options.replay ? replayContent(options, platform.log(), error)
                                    : scenarioContent(options);
    if (!content)
        return fail(error);
    std::optional<ServiceRecording> recording;
    if (!options.recording.path.empty())
        content->observer =
            &recording.emplace(options.recording, content->technology, platform.platform())
                 .observer;
    TelephonyService service(platform.mainQueue(), platform.ports(), platform.log(),
                             std::move(*content));
    if (!service.start(error)) {
        platform.log().flush(); // what it says there comes first
        return fail(error);
    }
    if (diagnosticPort)
        diagnosticPort->open();
    return QCoreApplication::exec();
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const ServiceOptions options = parseArguments(argc, argv);
    if (options.captureToWrite)
        return writeCapture(options);
    if (!canRecord(programName, options.recording))
        return EXIT_FAILURE;
    QCoreApplication application(argc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });

    LinuxPlatformOptions platformOptions;
    platformOptions.programName = programName;
    platformOptions.verbose = options.verbose;
    platformOptions.logThreshold = options.logLevel;
    // Who waits for a phone wants to know what is wrong with it.
    platformOptions.showsErrors = options.serialDevice.has_value();
    LinuxPlatform platform(platformOptions);
    return serve(options, platform);
}
