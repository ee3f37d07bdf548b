#include "Platform/TaskSchedule.h"

#include <limits>
#include <string>
#include <vector>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

// A queue's schedule whose clock the test sets.
class Schedule : public TaskSchedule
{
  public:
    using TaskSchedule::end;

    Duration now() const override { return time; }
    void firstHasChanged() override { ++changesOfFirst; }

    // Runs what is due without moving the clock.
    void run(Place before = std::numeric_limits<Place>::max())
    {
        while (isDue(time, before))
            takeFirst()();
    }

    Duration time{100s};
    int changesOfFirst = 0;
};

class TaskScheduleTest : public testing::Test
{
  protected:
    MainQueue::Task note(const std::string& text)
    {
        return [this, text] { notes.push_back(text); };
    }
    void runAt(MainQueue::Duration time)
    {
        schedule->time = time;
        schedule->run();
    }

    std::shared_ptr<Schedule> schedule = std::make_shared<Schedule>();
    std::vector<std::string> notes;
};

} // namespace

TEST_F(TaskScheduleTest, RunsByDueTimeThenBySubmission)
{
    schedule->after(2s, note("late"));
    schedule->after(1s, note("first"));
    schedule->after(1s, note("second"));
    runAt(102s);
    EXPECT_THAT(notes, ElementsAre("first", "second", "late"));
    EXPECT_EQ(schedule->size(), 0U);
}

TEST_F(TaskScheduleTest, HasNothingDueBeforeItsTime)
{
    schedule->after(1s, note("a"));
    EXPECT_EQ(schedule->nextDue(), 101s);
    runAt(101s - 1ns);
    EXPECT_TRUE(notes.empty());
    runAt(101s);
    EXPECT_THAT(notes, ElementsAre("a"));
    EXPECT_EQ(schedule->nextDue(), std::nullopt);
}

TEST_F(TaskScheduleTest, TakesANegativeDelayForNone)
{
    schedule->after(0s, note("first"));
    schedule->after(-1s, note("second"));
    schedule->run();
    EXPECT_THAT(notes, ElementsAre("first", "second"));
}

TEST_F(TaskScheduleTest, LeavesWhatWasSubmittedFromAPlaceOn)
{
    schedule->after(0s, note("before"));
    const auto place = schedule->end();
    schedule->after(0s, note("behind"));
    schedule->run(place);
    EXPECT_THAT(notes, ElementsAre("before"));
}

TEST_F(TaskScheduleTest, TellsWhenAnotherTaskIsTheFirst)
{
    schedule->after(2s, [] {});
    EXPECT_EQ(schedule->changesOfFirst, 1);
    schedule->after(2s, [] {});
    EXPECT_EQ(schedule->changesOfFirst, 1);
    schedule->after(1s, [] {});
    EXPECT_EQ(schedule->changesOfFirst, 2);
}

TEST_F(TaskScheduleTest, TicksAfterEachInterval)
{
    const auto timer = schedule->repeatEvery(2s, note("tick"));
    EXPECT_EQ(schedule->nextDue(), 102s);
    runAt(102s);
    EXPECT_EQ(schedule->nextDue(), 104s);
    runAt(104s);
    EXPECT_EQ(notes.size(), 2U);
}

TEST_F(TaskScheduleTest, SkipsMissedTicksAndKeepsTheBeat)
{
    const auto timer = schedule->repeatEvery(2s, note("tick"));
    runAt(109s);
    EXPECT_EQ(notes.size(), 1U);
    EXPECT_EQ(schedule->nextDue(), 110s);
    runAt(112s);
    EXPECT_EQ(notes.size(), 2U);
    EXPECT_EQ(schedule->nextDue(), 114s);
}

TEST_F(TaskScheduleTest, PlacesTheNextTickBeforeWhatThePresentOneQueues)
{
    const auto timer = schedule->repeatEvery(2s, [&] {
        notes.emplace_back("tick");
        schedule->after(2s, note("queued"));
    });
    runAt(102s);
    runAt(104s);
    EXPECT_THAT(notes, ElementsAre("tick", "tick", "queued"));
}

TEST_F(TaskScheduleTest, LetsTimePassBetweenTicks)
{
    for (const auto interval : {0s, -1s}) {
        const auto timer = schedule->repeatEvery(interval, [] {});
        EXPECT_EQ(schedule->nextDue(), schedule->time + 1ns);
    }
}

TEST_F(TaskScheduleTest, ForgetsAStoppedTimer)
{
    const auto timer = schedule->repeatEvery(1s, note("tick"));
    timer->stop();
    EXPECT_EQ(schedule->size(), 0U);
}

TEST_F(TaskScheduleTest, LetsATimerStopInItsTick)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = schedule->repeatEvery(1s, [&] { timer->stop(); });
    runAt(101s);
    EXPECT_EQ(schedule->size(), 0U);
}

TEST_F(TaskScheduleTest, LetsATimerBeDestroyedInItsTick)
{
    std::unique_ptr<RepeatingTimer> timer;
    timer = schedule->repeatEvery(1s, [&, text = std::string(100, 't')] {
        timer.reset();
        notes.push_back(text); // what the tick holds lives on while it runs
    });
    runAt(101s);
    EXPECT_THAT(notes, ElementsAre(std::string(100, 't')));
    EXPECT_EQ(schedule->size(), 0U);
}

TEST_F(TaskScheduleTest, DoesNotTickWhenATimerIsStoppedByTheTaskBefore)
{
    std::unique_ptr<RepeatingTimer> timer;
    schedule->after(1s, [&] { timer->stop(); });
    timer = schedule->repeatEvery(1s, note("tick"));
    runAt(101s);
    EXPECT_TRUE(notes.empty());
}

TEST_F(TaskScheduleTest, DropsTasksThatOwnTimers)
{
    std::shared_ptr<RepeatingTimer> timer = schedule->repeatEvery(1s, note("tick"));
    schedule->after(1s, [owned = std::move(timer)] {});
    schedule->after(1s, note("task"));
    schedule->clear();
    EXPECT_EQ(schedule->size(), 0U);
    runAt(200s);
    EXPECT_TRUE(notes.empty());
}

TEST_F(TaskScheduleTest, LetsATimerOutliveIt)
{
    const auto timer = schedule->repeatEvery(1s, note("tick"));
    schedule.reset();
    timer->stop();
    EXPECT_TRUE(notes.empty());
}

} // namespace ventrik
