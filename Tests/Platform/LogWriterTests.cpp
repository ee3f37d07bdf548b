#include "Platform/Linux/LogWriter.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <condition_variable>
#include <csignal>
#include <mutex>
#include <vector>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// A place that takes as many lines as it is allowed to.
class Gate
{
  public:
    void take(const std::string& text)
    {
        std::unique_lock lock(_mutex);
        ++_reached;
        _changed.notify_all();
        _changed.wait(lock, [this] { return _allowed > 0; });
        --_allowed;
        _taken.push_back(text);
    }
    void allow(std::size_t lines)
    {
        const std::lock_guard lock(_mutex);
        _allowed += lines;
        _changed.notify_all();
    }
    /// Until so many lines have come to the gate.
    void waitUntilReached(std::size_t lines)
    {
        std::unique_lock lock(_mutex);
        EXPECT_TRUE(_changed.wait_for(lock, 20s, [&] { return _reached == lines; }));
    }
    std::vector<std::string> taken()
    {
        const std::lock_guard lock(_mutex);
        return _taken;
    }

  private:
    std::mutex _mutex;
    std::condition_variable _changed;
    std::size_t _reached = 0;
    std::size_t _allowed = 0;
    std::vector<std::string> _taken;
};

class LogWriterTest : public testing::Test
{
  protected:
    LogWriter::Place place() const
    {
        return {[gate = gate](const LogLine& line) { gate->take(line.text); },
                [](std::size_t lost) {
                    return LogLine{3, fmt::format("{} lost", lost)};
                }};
    }
    void add(const std::vector<std::string>& texts)
    {
        for (const std::string& text : texts)
            writer.add({3, text});
    }
    /// One line is being written, and the queue is full behind it.
    void fill()
    {
        add({"1"});
        gate->waitUntilReached(1);
        add({"2", "3", "4", "5"});
    }
    bool flush(std::chrono::milliseconds time = 20s)
    {
        return writer.flush(std::chrono::steady_clock::now() + time);
    }

    const std::shared_ptr<Gate> gate = std::make_shared<Gate>();
    LogWriter writer{place(), {.lines = 4, .bytes = 100}};
};

} // namespace

TEST_F(LogWriterTest, WritesLinesInTheirOrder)
{
    gate->allow(3);
    add({"a", "b", "c"});
    EXPECT_TRUE(flush());
    EXPECT_THAT(gate->taken(), ElementsAre("a", "b", "c"));
}

TEST_F(LogWriterTest, TellsHowManyLinesDidNotFitBehindThoseThatDid)
{
    fill();
    add({"6", "7"});
    EXPECT_THAT(gate->taken(), IsEmpty());
    gate->allow(6);
    EXPECT_TRUE(flush());
    EXPECT_THAT(gate->taken(), ElementsAre("1", "2", "3", "4", "5", "2 lost"));
}

TEST_F(LogWriterTest, TakesLinesAgainWhenHalfOfTheQueueIsFree)
{
    fill();
    add({"6"});
    gate->allow(1);
    gate->waitUntilReached(2);
    add({"7"}); // a place is free, but no half
    gate->allow(3);
    gate->waitUntilReached(5);
    add({"8"});
    gate->allow(3);
    EXPECT_TRUE(flush());
    EXPECT_THAT(gate->taken(), ElementsAre("1", "2", "3", "4", "5", "2 lost", "8"));
}

TEST_F(LogWriterTest, HoldsSoManyBytesOnly)
{
    add({"1"});
    gate->waitUntilReached(1);
    add({std::string(60, 'a'), std::string(41, 'b')});
    gate->allow(3);
    EXPECT_TRUE(flush());
    EXPECT_THAT(gate->taken(), ElementsAre("1", std::string(60, 'a'), "1 lost"));
}

TEST_F(LogWriterTest, WaitsNoLongerThanItIsTold)
{
    add({"1"});
    EXPECT_FALSE(flush(10ms));
}

TEST_F(LogWriterTest, EndsBesideAPlaceThatIsStuck)
{
    fill();
    EXPECT_FALSE(writer.end());
    gate->allow(5); // what waited is dropped
    gate->waitUntilReached(1);
}

TEST_F(LogWriterTest, EndsWhenAllIsWritten)
{
    gate->allow(1);
    add({"1"});
    EXPECT_TRUE(flush());
    EXPECT_TRUE(writer.end());
}

TEST_F(LogWriterTest, TakesNoSignals)
{
    sigset_t mask;
    sigemptyset(&mask);
    LogWriter other({[&](const LogLine&) { pthread_sigmask(SIG_SETMASK, nullptr, &mask); },
                     [](std::size_t) { return LogLine(); }});
    other.add({3, "1"});
    EXPECT_TRUE(other.flush(std::chrono::steady_clock::now() + 20s));
    for (const int number : {SIGTERM, SIGINT, SIGHUP, SIGCHLD, SIGUSR1})
        EXPECT_EQ(sigismember(&mask, number), 1) << number;
}

} // namespace ventrik
