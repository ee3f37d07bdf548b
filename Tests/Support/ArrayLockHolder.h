#pragma once

#include "LogGenerator/Orbel/ArrayLock.h"

#include <chrono>
#include <functional>
#include <future>
#include <thread>

namespace ventrik
{

/// Does the action wait while another thread holds the array lock, and go on when that lets go of
/// it? Waits 50 ms for real.
inline bool waitsForArrayLock(const std::function<void()>& action)
{
    ArrayLock::lock().lock();
    std::packaged_task<void()> task(action);
    std::future<void> done = task.get_future();
    std::thread actor(std::move(task));
    const bool waits = done.wait_for(std::chrono::milliseconds(50)) == std::future_status::timeout;
    ArrayLock::lock().unlock();
    actor.join();
    return waits;
}

} // namespace ventrik
