#pragma once

#include "Platform/MainQueue.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <utility>

namespace ventrik
{

/// What waits in a main queue, in the order in which it runs, and the queue's timers. The queue
/// derives from it its clock and takes out what is due; it holds it in a shared pointer, for timers
/// may outlive the queue (and are silent then), and a task may destroy it.
class TaskSchedule : public std::enable_shared_from_this<TaskSchedule>
{
  public:
    using Task = MainQueue::Task;
    using Duration = MainQueue::Duration;

    TaskSchedule() = default;
    virtual ~TaskSchedule() = default;
    TaskSchedule(const TaskSchedule&) = delete;
    TaskSchedule& operator=(const TaskSchedule&) = delete;

    /// A negative delay counts as 0.
    void after(Duration delay, Task task);
    /// The interval is 1 ns at least: time must pass between two ticks. The next tick takes its
    /// place in the order before the present one runs; a timer that was held up skips the ticks it
    /// missed and keeps its beat.
    [[nodiscard]] std::unique_ptr<RepeatingTimer> repeatEvery(Duration interval, Task task);
    /// Drops what waits; timers do not tick any more.
    void clear();

    /// How many tasks wait, each running timer counting as one.
    std::size_t size() const { return _tasks.size(); }
    /// The first task's due time on the queue's clock; none when nothing waits.
    std::optional<Duration> nextDue() const;

  protected:
    /// A task's place in the order of submission.
    using Place = std::uint64_t;

    /// The queue's clock.
    virtual Duration now() const = 0;
    /// Called when a task becomes the first.
    virtual void firstHasChanged() {}

    /// The place of the task that comes next.
    Place end() const { return _end; }
    /// Whether the first task is due at that time, and was submitted before that place.
    bool isDue(Duration time, Place before) const;
    /// Takes out the first task; there must be one.
    Task takeFirst();

  private:
    class Timer;
    using Key = std::pair<Duration, Place>;

    Key add(Duration due, Task task);

    Place _end = 0;
    std::map<Key, Task> _tasks;
};

} // namespace ventrik
