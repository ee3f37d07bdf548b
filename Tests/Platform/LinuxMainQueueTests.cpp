#include "Platform/Linux/LinuxMainQueue.h"
#include "Tests/Platform/PortsFixture.h"

namespace ventrik
{
namespace
{

using namespace std::chrono_literals;
using ::testing::ElementsAre;

// These run on the real clock, some milliseconds each.
class LinuxMainQueueTest : public ::testing::Test
{
  protected:
    MainQueue::Task note(int number)
    {
        return [this, number] { notes.push_back(number); };
    }

    std::unique_ptr<LinuxMainQueue> queue = std::make_unique<LinuxMainQueue>();
    std::vector<int> notes;
};

TEST_F(LinuxMainQueueTest, RunsTasksLaterAndInOrder)
{
    for (int i = 0; i < 5; ++i)
        queue->async(note(i));
    EXPECT_TRUE(notes.empty());
    EXPECT_TRUE(runUntil([&] { return notes.size() == 5; }));
    EXPECT_THAT(notes, ElementsAre(0, 1, 2, 3, 4));
}

TEST_F(LinuxMainQueueTest, RunsDelayedTasksByDueTime)
{
    queue->after(20ms, note(2));
    queue->after(10ms, note(1));
    queue->async(note(0));
    const double seconds =
        secondsOf([&] { EXPECT_TRUE(runUntil([&] { return notes.size() == 3; })); });
    EXPECT_THAT(notes, ElementsAre(0, 1, 2));
    EXPECT_GE(seconds, 0.019);
}

TEST_F(LinuxMainQueueTest, KeepsTheOrderOfTasksThatAreCloserThanAMillisecond)
{
    queue->after(5900us, note(3));
    queue->after(5100us, note(1));
    queue->after(5500us, note(2));
    EXPECT_TRUE(runUntil([&] { return notes.size() == 3; }));
    EXPECT_THAT(notes, ElementsAre(1, 2, 3));
}

TEST_F(LinuxMainQueueTest, TicksUntilStopped)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = queue->repeatEvery(2ms, [&] {
        notes.push_back(1);
        if (notes.size() == 3)
            timer->stop();
    });
    EXPECT_TRUE(runUntil([&] { return notes.size() == 3; }));
    queue->after(10ms, note(9));
    EXPECT_TRUE(runUntil([&] { return !notes.empty() && notes.back() == 9; }));
    EXPECT_EQ(notes.size(), 4U);
}

TEST_F(LinuxMainQueueTest, LetsATimerBeDestroyedInItsTick)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = queue->repeatEvery(1ms, [&] {
        timer.reset();
        notes.push_back(1);
    });
    queue->after(10ms, note(9));
    EXPECT_TRUE(runUntil([&] { return notes.size() >= 2; }));
    EXPECT_THAT(notes, ElementsAre(1, 9));
}

TEST_F(LinuxMainQueueTest, DropsItsTasksWhenDestroyed)
{
    const auto owned = std::make_shared<int>(1);
    queue->async([owned, task = note(1)] { task(); });
    const auto timer = queue->repeatEvery(1ms, note(2));
    queue.reset();
    runReadyEvents();
    EXPECT_TRUE(notes.empty());
    EXPECT_EQ(owned.use_count(), 1);
}

TEST_F(LinuxMainQueueTest, MayBeDestroyedByATask)
{
    queue->async([&] { queue.reset(); });
    queue->async(note(1));
    EXPECT_TRUE(runUntil([&] { return queue == nullptr; }));
    runReadyEvents();
    EXPECT_TRUE(notes.empty());
}

TEST_F(LinuxMainQueueTest, GoesOnInANestedEventLoop)
{
    queue->async([&] { EXPECT_TRUE(runUntil([&] { return notes.size() == 1; })); });
    queue->async(note(1));
    EXPECT_TRUE(runUntil([&] { return notes.size() == 1; }));
}

TEST_F(LinuxMainQueueTest, LeavesRoomForTheRestOfTheEventLoop)
{
    bool hasRun = false;
    std::function<void()> again = [&] {
        if (!hasRun)
            queue->async(again);
    };
    queue->async(again);
    QTimer::singleShot(2, [&] { hasRun = true; });
    EXPECT_TRUE(runUntil([&] { return hasRun; }));
}

} // namespace
} // namespace ventrik
