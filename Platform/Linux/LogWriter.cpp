#include "Platform/Linux/LogWriter.h"

#include <condition_variable>
#include <csignal>
#include <deque>
#include <mutex>
#include <system_error>
#include <utility>

namespace ventrik
{

// All but the first two are guarded by the mutex.
struct LogWriter::State {
    State(Place newPlace, Limits newLimits) : place(std::move(newPlace)), limits(newLimits) {}

    bool isDone() const { return lines.empty() && !isWriting; }
    // After a loss only from half of the limits on, or losses and single lines would take turns.
    bool fits(const LogLine& line) const
    {
        const std::size_t part = lost > 0 ? 2 : 1;
        return lines.size() < limits.lines / part &&
               bytes + line.text.size() <= limits.bytes / part;
    }
    void push(LogLine line)
    {
        bytes += line.text.size();
        lines.push_back(std::move(line));
    }
    LogLine pop()
    {
        LogLine line = std::move(lines.front());
        lines.pop_front();
        bytes -= line.text.size();
        return line;
    }
    void tellLoss()
    {
        if (lost > 0)
            push(place.lossNotice(std::exchange(lost, 0)));
    }

    const Place place;
    const Limits limits;
    std::mutex mutex;
    std::condition_variable changed;
    std::deque<LogLine> lines;
    std::size_t bytes = 0;
    std::size_t lost = 0;
    bool isWriting = false;
    bool ends = false;
};

LogWriter::LogWriter(Place place) : LogWriter(std::move(place), Limits()) {}

LogWriter::LogWriter(Place place, Limits limits)
    : _state(std::make_shared<State>(std::move(place), limits))
{
}

LogWriter::~LogWriter()
{
    end();
}

void LogWriter::add(LogLine line)
{
    const std::lock_guard lock(_state->mutex);
    if (!_state->fits(line)) {
        ++_state->lost;
        return;
    }
    _state->tellLoss();
    _state->push(std::move(line));
    if (!_thread.joinable())
        start();
    _state->changed.notify_all();
}

// Without a thread the lines wait, and those that do not fit are lost; the program goes on.
void LogWriter::start()
{
    sigset_t all;
    sigset_t previous;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &previous);
    try {
        _thread = std::thread([state = _state] { run(state); });
    } catch (const std::system_error&) {
    }
    pthread_sigmask(SIG_SETMASK, &previous, nullptr);
}

void LogWriter::run(const std::shared_ptr<State>& state)
{
    std::unique_lock lock(state->mutex);
    for (;;) {
        state->changed.wait(lock, [&] { return state->ends || !state->lines.empty(); });
        if (state->lines.empty())
            return;
        const LogLine line = state->pop();
        state->isWriting = true;
        lock.unlock();
        state->place.write(line);
        lock.lock();
        state->isWriting = false;
        if (state->lines.empty())
            state->tellLoss();
        state->changed.notify_all();
    }
}

bool LogWriter::flush(Deadline deadline)
{
    std::unique_lock lock(_state->mutex);
    return _state->changed.wait_until(lock, deadline, [this] { return _state->isDone(); });
}

bool LogWriter::end()
{
    bool isStuck = false;
    {
        const std::lock_guard lock(_state->mutex);
        _state->ends = true;
        _state->lines.clear();
        _state->lost = 0;
        isStuck = _state->isWriting;
    }
    _state->changed.notify_all();
    if (!_thread.joinable())
        return true;
    isStuck ? _thread.detach() : _thread.join();
    return !isStuck;
}

} // namespace ventrik
