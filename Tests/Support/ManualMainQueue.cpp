#include "Tests/Support/ManualMainQueue.h"

#include "Platform/TaskSchedule.h"

#include <algorithm>
#include <utility>

namespace ventrik
{

struct ManualMainQueue::Core : TaskSchedule {
    Duration now() const override { return time; }

    void runUntil(Duration last)
    {
        while (nextDue() && *nextDue() <= last) {
            time = std::max(time, *nextDue());
            takeFirst()();
        }
        time = std::max(time, last);
    }

    Duration time{0};
};

ManualMainQueue::ManualMainQueue() : _core(std::make_shared<Core>()) {}

ManualMainQueue::~ManualMainQueue()
{
    _core->clear();
}

void ManualMainQueue::async(Task task)
{
    _core->after(Duration{0}, std::move(task));
}

void ManualMainQueue::after(Duration delay, Task task)
{
    _core->after(delay, std::move(task));
}

std::unique_ptr<RepeatingTimer> ManualMainQueue::repeatEvery(Duration interval, Task task)
{
    return _core->repeatEvery(interval, std::move(task));
}

void ManualMainQueue::run()
{
    advance(Duration{0});
}

void ManualMainQueue::advance(Duration duration)
{
    const auto core = _core;
    core->runUntil(core->time + duration);
}

ManualMainQueue::Duration ManualMainQueue::now() const
{
    return _core->time;
}

std::size_t ManualMainQueue::pendingCount() const
{
    return _core->size();
}

} // namespace ventrik
