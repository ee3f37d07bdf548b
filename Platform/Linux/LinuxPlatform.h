#pragma once

#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxMainQueue.h"
#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/LinuxNotices.h"
#include "Platform/Linux/LinuxPreferences.h"
#include "Platform/Linux/LinuxResources.h"
#include "Platform/Linux/LinuxSystemLog.h"
#include "Platform/Linux/LinuxTelephonyClient.h"
#include "Platform/Platform.h"

#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

struct LinuxPlatformOptions {
    std::string runtimeDirectory;                 ///< empty: the default one
    std::vector<std::string> resourceDirectories; ///< empty: the default ones
    bool verbose = false;                         ///< copies the system log to standard error
    bool showsErrors = false;                     ///< copies its errors there
    int logThreshold = LogPriority::error;        ///< the least urgent level in the system log
    std::string programName = "ventrik";
    std::optional<std::string> version;
};

/// The platform of a program on Linux; made after the QCoreApplication, and it outlives whatever
/// uses its bundle.
class LinuxPlatform
{
  public:
    explicit LinuxPlatform(const LinuxPlatformOptions& options);

    Platform platform();
    LinuxMessagePorts& ports() { return _ports; }
    LinuxMainQueue& mainQueue() { return _mainQueue; }
    LinuxSystemLog& log() { return _log; }
    LinuxPreferences& preferences() { return _preferences; }
    LinuxNotices& notices() { return _notices; }

  private:
    LinuxSystemLog _log;
    LinuxMainQueue _mainQueue;
    LinuxMessagePorts _ports;
    LinuxTelephonyClient _telephony;
    LinuxResources _resources;
    LinuxPreferences _preferences;
    LinuxClock _clock;
    LinuxNotices _notices;
};

} // namespace ventrik
