#pragma once

#include "Platform/Linux/LogWriter.h"
#include "Platform/SystemLog.h"

#include <memory>
#include <string>
#include <string_view>

namespace ventrik
{

/// The system log by syslog(3), up to a threshold; optionally its errors or all entries go to
/// standard error too, as one line. Neither makes the program wait: a place that takes no lines
/// loses them. One process has one of it, because syslog(3) keeps the program's name by reference.
class LinuxSystemLog : public SystemLog
{
  public:
    enum class Copy { None, Errors, Everything };

    explicit LinuxSystemLog(const std::string& programName, Copy copy = Copy::None,
                            int threshold = LogPriority::error);
    /// Flushes; what is stuck then is left behind.
    ~LinuxSystemLog() override;
    LinuxSystemLog(const LinuxSystemLog&) = delete;
    LinuxSystemLog& operator=(const LinuxSystemLog&) = delete;

    /// "PROGRAM[PID]: <PRIORITY> TEXT" without a line break at the end; breaks that end the text
    /// are dropped, others are shown as "\n", and a terminal obeys nothing in it.
    static std::string line(std::string_view programName, long processId, int priority,
                            std::string_view text);

    void showOnConsole(std::string_view text) override;
    /// Waits half a second at most.
    bool flush() override;

  protected:
    void write(int priority, std::string_view text) override;

  private:
    LogWriter::Place systemLog() const;
    LogWriter::Place standardError() const;

    std::shared_ptr<const std::string> _programName; // also a stuck writer's
    int _copyThreshold;
    int _threshold;
    LogWriter _systemLog;
    LogWriter _standardError;
};

} // namespace ventrik
