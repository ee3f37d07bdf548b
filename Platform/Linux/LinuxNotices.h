#pragma once

#include "Platform/Notices.h"

#include <atomic>
#include <chrono>
#include <thread>

namespace ventrik
{

/// Notices by the session bus's org.freedesktop.Notifications; none where there is no such bus. A
/// thread sends each of them, since a bus may keep it waiting: what comes meanwhile is lost.
class LinuxNotices : public Notices
{
  public:
    /// What the end may have to wait for.
    static constexpr std::chrono::milliseconds longestWait{500};

    void post(const std::string& text) override;

  private:
    std::atomic<bool> _isSending = false;
    std::jthread _sender; // the last member: it ends before what it uses goes
};

} // namespace ventrik
