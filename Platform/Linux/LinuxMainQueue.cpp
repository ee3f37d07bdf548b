#include "Platform/Linux/LinuxMainQueue.h"

#include <QTimer>

#include <algorithm>
#include <cstdint>
#include <map>
#include <utility>

namespace ventrik
{

using std::chrono::steady_clock;

// One Qt timer stands for the earliest task: Qt alone would not keep equal due times in order, and
// would round long delays.
struct LinuxMainQueue::Core : std::enable_shared_from_this<Core> {
    using Key = std::pair<steady_clock::time_point, std::uint64_t>; // due time, order of submission

    Core()
    {
        wakeUp.setSingleShot(true);
        wakeUp.setTimerType(Qt::PreciseTimer);
        QObject::connect(&wakeUp, &QTimer::timeout, [this] { runDueTasks(); });
    }

    Key add(steady_clock::time_point due, Task task)
    {
        const Key key{due, nextSequence++};
        const auto position = tasks.emplace(key, std::move(task)).first;
        if (position == tasks.begin())
            arm();
        return key;
    }

    void arm()
    {
        if (tasks.empty())
            return wakeUp.stop();
        const auto delay = std::chrono::ceil<std::chrono::milliseconds>(tasks.begin()->first.first -
                                                                        steady_clock::now());
        constexpr std::int64_t longest = 24 * 60 * 60 * 1000; // what Qt counts in fits an int
        wakeUp.start(static_cast<int>(std::clamp<std::int64_t>(delay.count(), 0, longest)));
    }

    // Runs what is due at its start. What those tasks queue waits for the next turn, so that the
    // rest of the event loop gets its share.
    void runDueTasks()
    {
        const auto self = shared_from_this();
        const auto now = steady_clock::now();
        const auto end = nextSequence;
        while (!tasks.empty() && tasks.begin()->first.first <= now &&
               tasks.begin()->first.second < end) {
            auto entry = tasks.extract(tasks.begin());
            arm(); // a nested event loop within the task needs it
            entry.mapped()();
        }
        arm();
    }

    QTimer wakeUp;
    std::uint64_t nextSequence = 0;
    std::map<Key, Task> tasks;
};

class LinuxMainQueue::Timer : public RepeatingTimer
{
  public:
    Timer(const std::shared_ptr<Core>& core, Duration interval, Task task)
        : _state(std::make_shared<State>(State{core, interval, std::move(task), {}, true}))
    {
        schedule(_state, steady_clock::now() + interval);
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

    static void schedule(const std::shared_ptr<State>& state, steady_clock::time_point due)
    {
        const auto core = state->core.lock();
        if (core == nullptr)
            return;
        state->key = core->add(due, [state, due] {
            if (!state->isRunning)
                return;
            schedule(state, nextDue(due, state->interval));
            state->task();
        });
    }

    static steady_clock::time_point nextDue(steady_clock::time_point due, Duration interval)
    {
        const auto missed = std::max<std::int64_t>((steady_clock::now() - due) / interval, 0);
        return due + (missed + 1) * interval;
    }

    std::shared_ptr<State> _state;
};

LinuxMainQueue::LinuxMainQueue() : _core(std::make_shared<Core>()) {}

LinuxMainQueue::~LinuxMainQueue()
{
    // What a dropped task owns may stop timers: by then the map must not be in use any more.
    const auto dropped = std::exchange(_core->tasks, {});
    _core->wakeUp.stop();
}

void LinuxMainQueue::async(Task task)
{
    _core->add(steady_clock::now(), std::move(task));
}

void LinuxMainQueue::after(Duration delay, Task task)
{
    _core->add(steady_clock::now() + std::max(delay, Duration{0}), std::move(task));
}

std::unique_ptr<RepeatingTimer> LinuxMainQueue::repeatEvery(Duration interval, Task task)
{
    return std::make_unique<Timer>(_core, std::max(interval, Duration{1}), std::move(task));
}

} // namespace ventrik
