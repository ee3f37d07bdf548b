#pragma once

#include "Platform/MainQueue.h"

#include <cstddef>
#include <memory>

namespace ventrik
{

/// A main queue that a test pumps by hand, on a virtual clock that starts at 0. Nothing runs but in
/// `run` and `advance`. Timers may outlive the queue; they never tick again then.
class ManualMainQueue : public MainQueue
{
  public:
    ManualMainQueue();
    /// Drops the tasks that have not run.
    ~ManualMainQueue() override;
    ManualMainQueue(const ManualMainQueue&) = delete;
    ManualMainQueue& operator=(const ManualMainQueue&) = delete;

    void async(Task task) override;
    void after(Duration delay, Task task) override;
    [[nodiscard]] std::unique_ptr<RepeatingTimer> repeatEvery(Duration interval,
                                                              Task task) override;

    /// Runs everything that is due now, and what those tasks queue for now.
    void run();
    /// Moves the time on by that much. What falls due is run on the way, in due-time order; time
    /// stands at each task's own due time while it runs.
    void advance(Duration duration);

    Duration now() const;
    /// Tasks that wait, each running timer counting as one.
    std::size_t pendingCount() const;

  private:
    struct Core;

    std::shared_ptr<Core> _core;
};

} // namespace ventrik
