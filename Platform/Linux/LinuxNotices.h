#pragma once

#include "Platform/Notices.h"
#include "Platform/SystemLog.h"

#include <atomic>
#include <chrono>
#include <optional>
#include <string>
#include <thread>

namespace ventrik
{

/// Notices by the session bus's org.freedesktop.Notifications; none where there is no such bus. A
/// thread sends each of them, since a bus may keep it waiting: what comes meanwhile is lost. Why
/// the bus took none goes to the log, once for as long as the reason stays.
class LinuxNotices : public Notices
{
  public:
    /// What the end may have to wait for.
    static constexpr std::chrono::milliseconds longestWait{500};

    /// The log takes lines from any thread and outlives it.
    explicit LinuxNotices(SystemLog& log) : _log(log) {}

    void post(const std::string& text) override;

  private:
    void send(const std::string& address, const std::string& text);

    SystemLog& _log;
    std::optional<std::string> _lastFailure; // the sender's
    std::atomic<bool> _isSending = false;
    std::jthread _sender; // the last member: it ends before what it uses goes
};

} // namespace ventrik
