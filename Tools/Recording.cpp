#include "Tools/Recording.h"

#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"

#include <csignal>

namespace ventrik
{

namespace
{

void takeRotation(const std::string& text, RecordingOptions& result)
{
    const Rotation rotation = rotationValue(text);
    result.rotationSize = rotation.size;
    result.rotationTime = rotation.time;
}

} // namespace

void addRecordingOptions(CommandLine& line, RecordingOptions& result)
{
    line.beginGroup("Recording");
    line.addOption("--record CAPTURE",
                   "writes every message of the log channel to a capture, which must not be there "
                   "yet and can be read while it grows",
                   result.path, textValue);
    line.addOption("--rotate LIMIT",
                   "begins a new file at a size (such as 100M) or an age (such as 1h); the files "
                   "are numbered, as in NAME-0001.pcap. Units: K, M, G; s, min, h, d",
                   [&result](const std::string& text) { takeRotation(text, result); });
}

void refuseWrongRecording(const CommandLine& line)
{
    if (line.has("--rotate") && !line.has("--record"))
        line.refuse("--rotate goes with --record");
}

bool canRecord(const std::string& program, const RecordingOptions& options)
{
    const std::string fault =
        options.path.empty() ? std::string() : CaptureRecorder::faultOf(options);
    if (!fault.empty())
        complain(program, fault);
    return fault.empty();
}

std::unique_ptr<CaptureRecorder> makeRecorder(const std::string& program, MainQueue& queue,
                                              const Clock& clock, SystemLog& log,
                                              const RecordingOptions& options)
{
    // A file that may not grow is then an error of the write, and not the program's end.
    std::signal(SIGXFSZ, SIG_IGN);
    return std::make_unique<CaptureRecorder>(queue, clock, options,
                                             [program, &log](const std::string& line) {
                                                 log.error("{}", line);
                                                 complain(program, line);
                                             });
}

Recording::Recording(const std::string& program, const Platform& platform,
                     const RecordingOptions& options)
    : _platform(platform), _isPossible(canRecord(program, options))
{
    if (options.path.empty() || !_isPossible)
        return;
    _recorder = makeRecorder(program, platform.mainQueue, platform.clock, platform.log, options);
    _ports.emplace(platform.ports, *_recorder);
}

Platform Recording::platform()
{
    if (!_ports)
        return _platform;
    return {_platform.mainQueue, *_ports,
            _platform.telephony, _platform.log,
            _platform.resources, _platform.preferences,
            _platform.clock};
}

} // namespace ventrik
