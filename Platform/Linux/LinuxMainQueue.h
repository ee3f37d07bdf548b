#pragma once

#include "Platform/MainQueue.h"

#include <memory>

namespace ventrik
{

/// The main queue on Qt's event loop. Make and use it on the thread that runs the loop; timers may
/// outlive it and are silent then. Nothing runs before its due time. A task may destroy the queue
/// or run a nested event loop, in which the queue goes on.
class LinuxMainQueue : public MainQueue
{
  public:
    LinuxMainQueue();
    /// Drops the tasks that have not run.
    ~LinuxMainQueue() override;
    LinuxMainQueue(const LinuxMainQueue&) = delete;
    LinuxMainQueue& operator=(const LinuxMainQueue&) = delete;

    void async(Task task) override;
    void after(Duration delay, Task task) override;
    [[nodiscard]] std::unique_ptr<RepeatingTimer> repeatEvery(Duration interval,
                                                              Task task) override;

  private:
    struct Core;

    std::shared_ptr<Core> _core;
};

} // namespace ventrik
