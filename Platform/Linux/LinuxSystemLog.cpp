#include "Platform/Linux/LinuxSystemLog.h"

#include <algorithm>
#include <cstdio>
#include <limits>
#include <utility>

#include <syslog.h>
#include <unistd.h>

namespace ventrik
{

LinuxSystemLog::LinuxSystemLog(std::string programName, Copy copy, int threshold)
    : SystemLog(threshold), _programName(std::move(programName)), _copy(copy)
{
    openlog(_programName.c_str(), LOG_PID, LOG_USER);
}

LinuxSystemLog::~LinuxSystemLog()
{
    closelog();
}

std::string LinuxSystemLog::line(std::string_view programName, long processId, int priority,
                                 std::string_view text)
{
    text = text.substr(0, text.find_last_not_of("\r\n") + 1);
    std::string line = fmt::format("{}[{}]: <{}> ", programName, processId, priority);
    for (const char character : text) {
        if (character == '\n')
            line += "\\n";
        else
            line += character;
    }
    return line;
}

void LinuxSystemLog::write(int priority, std::string_view text)
{
    constexpr std::size_t longest = std::numeric_limits<int>::max();
    syslog(priority, "%.*s", static_cast<int>(std::min(text.size(), longest)), text.data());
    if (_copy == Copy::StandardError)
        fmt::print(stderr, "{}\n", line(_programName, getpid(), priority, text));
}

} // namespace ventrik
