#include "Platform/Linux/LinuxSystemLog.h"

#include "Platform/Linux/StandardStreams.h"
#include "PropertyList/TerminalText.h"

#include <algorithm>
#include <limits>

#include <syslog.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

std::string lossNotice(std::size_t lost)
{
    return fmt::format("{} lines of the log did not fit and were lost", lost);
}

// The least urgent level that is copied.
int thresholdOf(LinuxSystemLog::Copy copy)
{
    constexpr int nothing = LogPriority::emergency - 1;
    if (copy == LinuxSystemLog::Copy::None)
        return nothing;
    return copy == LinuxSystemLog::Copy::Errors ? LogPriority::error : LogPriority::debug;
}

} // namespace

LinuxSystemLog::LinuxSystemLog(const std::string& programName, Copy copy, int threshold)
    : SystemLog(std::max(threshold, thresholdOf(copy))),
      _programName(std::make_shared<const std::string>(programName)),
      _copyThreshold(thresholdOf(copy)),
      _threshold(threshold),
      _systemLog(systemLog()),
      _standardError(standardError())
{
    openlog(_programName->c_str(), LOG_PID, LOG_USER);
}

LinuxSystemLog::~LinuxSystemLog()
{
    flush();
    _standardError.end();
    // It would wait for a writer that is stuck.
    if (_systemLog.end())
        closelog();
}

LogWriter::Place LinuxSystemLog::systemLog() const
{
    return {[name = _programName](const LogLine& line) {
                constexpr std::size_t longest = std::numeric_limits<int>::max();
                const auto size = static_cast<int>(std::min(line.text.size(), longest));
                syslog(line.priority, "%.*s", size, line.text.data());
            },
            [](std::size_t lost) {
                return LogLine{LogPriority::error, lossNotice(lost)};
            }};
}

LogWriter::Place LinuxSystemLog::standardError() const
{
    return {[](const LogLine& line) {
                writeText(STDERR_FILENO, std::string_view(line.text), Patience::Endless);
            },
            [name = _programName](std::size_t lost) {
                return LogLine{LogPriority::error,
                               line(*name, getpid(), LogPriority::error, lossNotice(lost)) + '\n'};
            }};
}

std::string LinuxSystemLog::line(std::string_view programName, long processId, int priority,
                                 std::string_view text)
{
    return fmt::format("{}[{}]: <{}> {}", programName, processId, priority, terminalLine(text));
}

void LinuxSystemLog::showOnConsole(std::string_view text)
{
    _standardError.add({LogPriority::debug, terminalLine(text) + '\n'});
}

bool LinuxSystemLog::flush()
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(500);
    const bool isLogged = _systemLog.flush(deadline);
    return _standardError.flush(deadline) && isLogged;
}

void LinuxSystemLog::write(int priority, std::string_view text)
{
    if ((priority & 7) <= _threshold)
        _systemLog.add({priority, std::string(text)});
    if ((priority & 7) <= _copyThreshold)
        _standardError.add({priority, line(*_programName, getpid(), priority, text) + '\n'});
}

} // namespace ventrik
