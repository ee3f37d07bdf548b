#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace ventrik
{

/// A timer that fires until it is stopped or destroyed. It may be stopped and destroyed from within
/// its own tick.
class RepeatingTimer
{
  public:
    virtual ~RepeatingTimer() = default;
    /// No tick comes after this.
    virtual void stop() = 0;
};

/// The one queue on which everything runs. Tasks run in the order of their due times, and of their
/// submission where those are equal; no task runs within the call that queues it.
class MainQueue
{
  public:
    using Task = std::function<void()>;
    using Duration = std::chrono::nanoseconds;

    virtual ~MainQueue() = default;

    virtual void async(Task task) = 0;
    virtual void after(Duration delay, Task task) = 0;
    /// Fires first after one interval.
    [[nodiscard]] virtual std::unique_ptr<RepeatingTimer> repeatEvery(Duration interval,
                                                                      Task task) = 0;
};

} // namespace ventrik
