#include "Tests/Support/ManualMainQueue.h"

#include <algorithm>
#include <cstdint>
#include <map>
#include <utility>

namespace ventrik
{

struct ManualMainQueue::Core {
    using Key = std::pair<Duration, std::uint64_t>; // due time, order of submission

    Key add(Duration due, Task task)
    {
        const Key key{due, nextSequence++};
        tasks.emplace(key, std::move(task));
        return key;
    }

    void runUntil(Duration end)
    {
        while (!tasks.empty() && tasks.begin()->first.first <= end) {
            auto entry = tasks.extract(tasks.begin());
            now = std::max(now, entry.key().first);
            entry.mapped()();
        }
    }

    Duration now{0};
    std::uint64_t nextSequence = 0;
    std::map<Key, Task> tasks;
};

class ManualMainQueue::Timer : public RepeatingTimer
{
  public:
    Timer(const std::shared_ptr<Core>& core, Duration interval, Task task)
        : _state(std::make_shared<State>(State{core, interval, std::move(task), {}, true}))
    {
        schedule(_state, core->now + interval);
    }
    ~Timer() override { Timer::stop(); }

    void stop() override
    {
        _state->isRunning = false;
        if (const auto core = _state->core.lock())
            core->tasks.erase(_state->key);
    }

  private:
    // Shared with the queued tick, so that the timer may go away while it ticks.
    struct State {
        std::weak_ptr<Core> core;
        Duration interval;
        Task task;
        Core::Key key;
        bool isRunning;
    };

    static void schedule(const std::shared_ptr<State>& state, Duration due)
    {
        const auto core = state->core.lock();
        if (core == nullptr)
            return;
        state->key = core->add(due, [state, due] {
            if (!state->isRunning)
                return;
            schedule(state, due + state->interval);
            state->task();
        });
    }

    std::shared_ptr<State> _state;
};

ManualMainQueue::ManualMainQueue() : _core(std::make_shared<Core>()) {}

ManualMainQueue::~ManualMainQueue()
{
    // What a dropped task owns may stop timers: by then the map must not be in use any more.
    const auto dropped = std::exchange(_core->tasks, {});
}

void ManualMainQueue::async(Task task)
{
    _core->add(_core->now, std::move(task));
}

void ManualMainQueue::after(Duration delay, Task task)
{
    _core->add(_core->now + std::max(delay, Duration{0}), std::move(task));
}

std::unique_ptr<RepeatingTimer> ManualMainQueue::repeatEvery(Duration interval, Task task)
{
    return std::make_unique<Timer>(_core, std::max(interval, Duration{1}), std::move(task));
}

void ManualMainQueue::run()
{
    advance(Duration{0});
}

void ManualMainQueue::advance(Duration duration)
{
    const auto core = _core;
    const Duration end = core->now + duration;
    core->runUntil(end);
    core->now = std::max(core->now, end);
}

ManualMainQueue::Duration ManualMainQueue::now() const
{
    return _core->now;
}

std::size_t ManualMainQueue::pendingCount() const
{
    return _core->tasks.size();
}

} // namespace ventrik
