#include "Platform/TaskSchedule.h"

#include <algorithm>

namespace ventrik
{

class TaskSchedule::Timer : public RepeatingTimer
{
  public:
    Timer(TaskSchedule& schedule, Duration interval, Task task)
        : _state(std::make_shared<State>(
              State{schedule.weak_from_this(), interval, std::move(task), {}}))
    {
        add(schedule, _state, schedule.now() + interval);
    }
    ~Timer() override { Timer::stop(); }

    void stop() override
    {
        if (const auto schedule = _state->schedule.lock())
            schedule->_tasks.erase(_state->key);
    }

  private:
    // Shared with the queued tick, so that the timer may go away while it ticks.
    struct State {
        std::weak_ptr<TaskSchedule> schedule;
        Duration interval;
        Task task;
        Key key;
    };

    static void add(TaskSchedule& schedule, const std::shared_ptr<State>& state, Duration due)
    {
        state->key = schedule.add(due, [state, due] { tick(state, due); });
    }

    static void tick(const std::shared_ptr<State>& state, Duration due)
    {
        if (const auto schedule = state->schedule.lock()) {
            const auto missed =
                std::max<std::int64_t>((schedule->now() - due) / state->interval, 0);
            add(*schedule, state, due + (missed + 1) * state->interval);
        }
        state->task();
    }

    std::shared_ptr<State> _state;
};

void TaskSchedule::after(Duration delay, Task task)
{
    add(now() + std::max(delay, Duration{0}), std::move(task));
}

std::unique_ptr<RepeatingTimer> TaskSchedule::repeatEvery(Duration interval, Task task)
{
    return std::make_unique<Timer>(*this, std::max(interval, Duration{1}), std::move(task));
}

void TaskSchedule::clear()
{
    // What a dropped task owns may stop timers: by then the map must not be in use any more.
    const auto dropped = std::exchange(_tasks, {});
}

std::optional<TaskSchedule::Duration> TaskSchedule::nextDue() const
{
    return _tasks.empty() ? std::nullopt : std::optional(_tasks.begin()->first.first);
}

bool TaskSchedule::isDue(Duration time, Place before) const
{
    if (_tasks.empty())
        return false;
    const auto& [due, place] = _tasks.begin()->first;
    return due <= time && place < before;
}

TaskSchedule::Task TaskSchedule::takeFirst()
{
    return std::move(_tasks.extract(_tasks.begin()).mapped());
}

TaskSchedule::Key TaskSchedule::add(Duration due, Task task)
{
    const Key key{due, _end++};
    const auto position = _tasks.emplace(key, std::move(task)).first;
    if (position == _tasks.begin())
        firstHasChanged();
    return key;
}

} // namespace ventrik
