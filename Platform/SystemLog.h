#pragma once

#include <cstdio>
#include <string_view>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

/// Priorities as syslog(3) numbers them.
namespace LogPriority
{
inline constexpr int emergency = 0;
inline constexpr int alert = 1;
inline constexpr int critical = 2;
inline constexpr int error = 3;
inline constexpr int warning = 4;
inline constexpr int notice = 5;
inline constexpr int info = 6;
inline constexpr int debug = 7;
} // namespace LogPriority

/// The system log. A line that is filtered out is not formatted: it costs one comparison.
class SystemLog
{
  public:
    virtual ~SystemLog() = default;

    /// The level is the priority's low three bits; the rest is a facility.
    bool isEnabled(int priority) const { return (priority & 7) <= _threshold; }

    template <typename... Args>
    void log(int priority, fmt::format_string<Args...> format, Args&&... args)
    {
        if (isEnabled(priority))
            write(priority, fmt::format(format, std::forward<Args>(args)...));
    }
    template <typename... Args>
    void error(fmt::format_string<Args...> format, Args&&... args)
    {
        log(LogPriority::error, format, std::forward<Args>(args)...);
    }
    template <typename... Args>
    void warning(fmt::format_string<Args...> format, Args&&... args)
    {
        log(LogPriority::warning, format, std::forward<Args>(args)...);
    }

    /// Shows a line to whoever watches the program's console; it is no entry of the log.
    virtual void showOnConsole(std::string_view line)
    {
        std::fwrite(line.data(), 1, line.size(), stderr);
    }
    /// Waits until all that was written is where it goes, for a bounded time; false when it is not.
    virtual bool flush() { return true; }

  protected:
    explicit SystemLog(int threshold) : _threshold(threshold) {}

    /// Writes one entry; the text may end with or hold line breaks.
    virtual void write(int priority, std::string_view text) = 0;

  private:
    int _threshold; // the least urgent level that is written; -1: none
};

} // namespace ventrik
