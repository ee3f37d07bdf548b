#pragma once

#include "Platform/SystemLog.h"

#include <string>
#include <string_view>

namespace ventrik
{

/// The system log by syslog(3); optionally each entry goes to standard error too, as one line. One
/// process has one of it, because syslog(3) keeps the program's name by reference.
class LinuxSystemLog : public SystemLog
{
  public:
    enum class Copy { None, StandardError };

    explicit LinuxSystemLog(std::string programName, Copy copy = Copy::None,
                            int threshold = LogPriority::notice);
    ~LinuxSystemLog() override;
    LinuxSystemLog(const LinuxSystemLog&) = delete;
    LinuxSystemLog& operator=(const LinuxSystemLog&) = delete;

    /// "PROGRAM[PID]: <PRIORITY> TEXT" without a line break at the end; breaks that end the text
    /// are dropped, others are shown as "\n".
    static std::string line(std::string_view programName, long processId, int priority,
                            std::string_view text);

  protected:
    void write(int priority, std::string_view text) override;

  private:
    std::string _programName;
    Copy _copy;
};

} // namespace ventrik
