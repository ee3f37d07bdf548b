#include "Tests/Support/ManualMainQueue.h"

#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using namespace std::chrono_literals;
using ::testing::ElementsAre;

class ManualMainQueueTest : public ::testing::Test
{
  protected:
    MainQueue::Task note(const std::string& text)
    {
        return [this, text] { notes.push_back(text); };
    }

    ManualMainQueue queue;
    std::vector<std::string> notes;
};

TEST_F(ManualMainQueueTest, RunsNothingByItself)
{
    queue.async(note("a"));
    EXPECT_TRUE(notes.empty());
    EXPECT_EQ(queue.pendingCount(), 1U);
}

TEST_F(ManualMainQueueTest, RunsTasksInTheirOrderWithWhatTheyQueue)
{
    queue.async([this] {
        notes.push_back("a");
        queue.async(note("c"));
    });
    queue.async(note("b"));
    queue.run();
    EXPECT_THAT(notes, ElementsAre("a", "b", "c"));
    EXPECT_EQ(queue.pendingCount(), 0U);
}

TEST_F(ManualMainQueueTest, RunsLaterTasksByDueTimeThenByInsertion)
{
    queue.after(2s, note("late"));
    queue.after(1s, note("first"));
    queue.after(1s, note("second"));
    queue.run();
    EXPECT_TRUE(notes.empty());
    queue.advance(2s);
    EXPECT_THAT(notes, ElementsAre("first", "second", "late"));
}

TEST_F(ManualMainQueueTest, StandsAtEachTasksDueTime)
{
    std::vector<MainQueue::Duration> times;
    queue.after(1s, [&] {
        times.push_back(queue.now());
        queue.after(1s, [&] { times.push_back(queue.now()); });
    });
    queue.advance(5s);
    EXPECT_THAT(times, ElementsAre(1s, 2s));
    EXPECT_EQ(queue.now(), 5s);
}

TEST_F(ManualMainQueueTest, RunsNothingBeforeItsTime)
{
    queue.after(1s, note("a"));
    queue.advance(999999999ns);
    EXPECT_TRUE(notes.empty());
    queue.advance(1ns);
    EXPECT_THAT(notes, ElementsAre("a"));
}

TEST_F(ManualMainQueueTest, TicksAfterEachInterval)
{
    const auto timer = queue.repeatEvery(2s, note("tick"));
    queue.advance(1s);
    EXPECT_TRUE(notes.empty());
    queue.advance(5s);
    EXPECT_EQ(notes.size(), 3U);
}

TEST_F(ManualMainQueueTest, LetsATimerStopInItsTick)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = queue.repeatEvery(1s, [&] {
        notes.push_back("tick");
        timer->stop();
    });
    queue.advance(5s);
    EXPECT_THAT(notes, ElementsAre("tick"));
    EXPECT_EQ(queue.pendingCount(), 0U);
}

TEST_F(ManualMainQueueTest, LetsATimerBeDestroyedInItsTick)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = queue.repeatEvery(1s, [&, text = std::string(100, 't')] {
        timer.reset();
        notes.push_back(text); // what the tick holds lives on while it runs
    });
    queue.advance(5s);
    EXPECT_THAT(notes, ElementsAre(std::string(100, 't')));
}

TEST_F(ManualMainQueueTest, ForgetsAStoppedTimer)
{
    const auto timer = queue.repeatEvery(1s, note("tick"));
    timer->stop();
    queue.advance(3s);
    EXPECT_TRUE(notes.empty());
}

TEST(ManualMainQueueEnd, DropsTasksAndSilencesTimers)
{
    auto queue = std::make_unique<ManualMainQueue>();
    const auto owned = std::make_shared<int>(1);
    queue->async([owned] {});
    const auto timer = queue->repeatEvery(1s, [] {});
    queue.reset();
    EXPECT_EQ(owned.use_count(), 1);
    timer->stop();
}

} // namespace
} // namespace ventrik
