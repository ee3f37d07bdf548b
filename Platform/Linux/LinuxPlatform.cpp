#include "Platform/Linux/LinuxPlatform.h"

namespace ventrik
{

LinuxPlatform::LinuxPlatform(const LinuxPlatformOptions& options)
    : _log(options.programName,
           options.verbose ? LinuxSystemLog::Copy::StandardError : LinuxSystemLog::Copy::None,
           options.logThreshold),
      _ports(options.runtimeDirectory.empty() ? LinuxMessagePorts::defaultDirectory()
                                              : PortDirectory(options.runtimeDirectory),
             _log),
      _telephony(_ports, _mainQueue),
      _resources(options.resourceDirectories.empty() ? LinuxResources::defaultDirectories()
                                                     : options.resourceDirectories,
                 options.version),
      _preferences(_log)
{
}

Platform LinuxPlatform::platform()
{
    return {_mainQueue, _ports, _telephony, _log, _resources, _preferences, _clock};
}

} // namespace ventrik
