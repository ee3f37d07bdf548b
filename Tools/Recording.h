#pragma once

#include "Capture/CaptureRecorder.h"
#include "Capture/RecordingPorts.h"
#include "Platform/Platform.h"

#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

class CommandLine;

/// --record and --rotate. `refuseWrongRecording` comes behind the parsing.
void addRecordingOptions(CommandLine& line, RecordingOptions& result);
void refuseWrongRecording(const CommandLine& line);

/// A program's recorder: what ends it is told by the log and on standard error.
std::unique_ptr<CaptureRecorder> makeRecorder(const std::string& program, MainQueue& queue,
                                              const Clock& clock, SystemLog& log,
                                              const RecordingOptions& options);

/// What a viewer records of its log channel. Where no path is given it is nothing, and costs
/// nothing.
class Recording
{
  public:
    /// The platform's parts outlive this.
    Recording(const std::string& program, const Platform& platform,
              const RecordingOptions& options);

    /// False when nothing can be recorded there, which has been told on standard error.
    bool isPossible() const { return _isPossible; }
    /// What the viewer is to use.
    Platform platform();

  private:
    Platform _platform;
    bool _isPossible = true;
    std::unique_ptr<CaptureRecorder> _recorder;
    std::optional<RecordingPorts> _ports;
};

/// False, and the reason on standard error, when nothing can be recorded there.
bool canRecord(const std::string& program, const RecordingOptions& options);

} // namespace ventrik
