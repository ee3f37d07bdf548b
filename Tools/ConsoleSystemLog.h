#pragma once

#include "Platform/SystemLog.h"

#include <string>
#include <string_view>

namespace ventrik
{

/// The system log of a program that runs in the foreground and ends: up to a level on standard
/// error, and whole to another log where there is one. Unlike the system's own log it waits for
/// whoever reads, so that no line is lost. What nobody reads is not formatted.
class ConsoleSystemLog : public SystemLog
{
  public:
    static constexpr int showNothing = -1;

    /// Lines up to that level are shown, and the console with them. The other log outlives this.
    ConsoleSystemLog(std::string programName, int shownLevel, SystemLog* other = nullptr);

    void showOnConsole(std::string_view line) override;
    bool flush() override;

  protected:
    void write(int priority, std::string_view text) override;

  private:
    std::string _programName;
    int _shownLevel;
    SystemLog* _other;
};

} // namespace ventrik
