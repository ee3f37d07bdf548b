#include "Platform/Linux/LinuxMainQueue.h"

#include "Platform/TaskSchedule.h"

#include <QTimer>

#include <algorithm>
#include <cstdint>
#include <utility>

namespace ventrik
{

// One Qt timer stands for the first task: Qt alone would not keep equal due times in order, and
// would round long delays.
struct LinuxMainQueue::Core : TaskSchedule {
    Core()
    {
        wakeUp.setSingleShot(true);
        wakeUp.setTimerType(Qt::PreciseTimer);
        QObject::connect(&wakeUp, &QTimer::timeout, [this] { runDueTasks(); });
    }

    Duration now() const override { return std::chrono::steady_clock::now().time_since_epoch(); }
    void firstHasChanged() override { arm(); }

    void arm()
    {
        const auto due = nextDue();
        if (!due)
            return wakeUp.stop();
        const auto delay = std::chrono::ceil<std::chrono::milliseconds>(*due - now());
        constexpr std::int64_t longest = 24 * 60 * 60 * 1000; // what Qt counts in fits an int
        wakeUp.start(static_cast<int>(std::clamp<std::int64_t>(delay.count(), 0, longest)));
    }

    // Runs what is due at its start. What those tasks queue waits for the next turn, so that the
    // rest of the event loop gets its share.
    void runDueTasks()
    {
        const auto self = shared_from_this();
        const auto time = now();
        const auto before = end();
        while (isDue(time, before)) {
            const Task task = takeFirst();
            arm(); // a nested event loop within the task needs it
            task();
        }
        arm();
    }

    QTimer wakeUp;
};

LinuxMainQueue::LinuxMainQueue() : _core(std::make_shared<Core>()) {}

LinuxMainQueue::~LinuxMainQueue()
{
    _core->clear();
    _core->wakeUp.stop();
}

void LinuxMainQueue::async(Task task)
{
    _core->after(Duration{0}, std::move(task));
}

void LinuxMainQueue::after(Duration delay, Task task)
{
    _core->after(delay, std::move(task));
}

std::unique_ptr<RepeatingTimer> LinuxMainQueue::repeatEvery(Duration interval, Task task)
{
    return _core->repeatEvery(interval, std::move(task));
}

} // namespace ventrik
