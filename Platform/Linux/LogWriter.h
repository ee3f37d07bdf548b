#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <thread>

namespace ventrik
{

struct LogLine {
    int priority = 0;
    std::string text;
};

/// Takes lines to a place that may be slow or stuck, from a thread of its own, so that whoever
/// writes them never waits. What does not fit into the queue is lost, and counted in a line of its
/// own as soon as half of the queue is free again.
///
/// The thread starts with the first line and takes no signals. One that is stuck at the end is left
/// to itself; it keeps what `Place` refers to by value.
class LogWriter
{
  public:
    struct Place {
        std::function<void(const LogLine&)> write;           ///< may block; on the writer's thread
        std::function<LogLine(std::size_t lost)> lossNotice; ///< on any thread
    };
    struct Limits {
        std::size_t lines = 4096;
        std::size_t bytes = std::size_t{4} << 20;
    };
    using Deadline = std::chrono::steady_clock::time_point;

    explicit LogWriter(Place place);
    LogWriter(Place place, Limits limits);
    ~LogWriter();
    LogWriter(const LogWriter&) = delete;
    LogWriter& operator=(const LogWriter&) = delete;

    void add(LogLine line);
    /// Waits until every line is written; false when the deadline comes first.
    bool flush(Deadline deadline);
    /// Ends the thread, or leaves it to itself where it is stuck: false then. Lines that still wait
    /// are dropped.
    bool end();

  private:
    struct State;

    void start();
    static void run(const std::shared_ptr<State>& state);

    std::shared_ptr<State> _state;
    std::thread _thread;
};

} // namespace ventrik
