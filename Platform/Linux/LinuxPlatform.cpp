#include "Platform/Linux/LinuxPlatform.h"

namespace ventrik
{

namespace
{

LinuxSystemLog::Copy copyOf(const LinuxPlatformOptions& options)
{
    if (options.verbose)
        return LinuxSystemLog::Copy::Everything;
    return options.showsErrors ? LinuxSystemLog::Copy::Errors : LinuxSystemLog::Copy::None;
}

} // namespace

LinuxPlatform::LinuxPlatform(const LinuxPlatformOptions& options)
    : _log(options.programName, copyOf(options), options.logThreshold),
      _ports(options.runtimeDirectory.empty() ? LinuxMessagePorts::defaultDirectory()
                                              : PortDirectory(options.runtimeDirectory),
             _log),
      _telephony(_ports, _mainQueue),
      _resources(options.resourceDirectories.empty() ? LinuxResources::defaultDirectories()
                                                     : options.resourceDirectories,
                 options.version),
      _preferences(_log),
      _notices(_log)
{
}

Platform LinuxPlatform::platform()
{
    return {_mainQueue, _ports, _telephony, _log, _resources, _preferences, _clock};
}

} // namespace ventrik
