#include "Tests/Process/HeadlessViewer.h"
#include "Tests/Process/ProcessFixture.h"

#include <algorithm>
#include <utility>

#include <QTimer>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using Time = TimedSystemLog::Time;

constexpr const char* cellPath = "/Serving Cell Info/Physical Cell ID";

/// A service that misbehaves once in the named way and is a good one from then on, while all its
/// ports stay. Its cells bear 300 and the number of the attempt.
class LyingService : public ProcessFixture
{
  protected:
    void startViewer(const std::string& lie)
    {
        service = std::make_unique<Program>("/usr/bin/python3",
                                            Arguments{VENTRIK_LYING_SERVICE, lie}, environment);
        ASSERT_TRUE(waitUntil([this] { return service->prints("listening"); }))
            << service->errors();
        viewer.start();
    }
    bool waitForLie()
    {
        const bool lied = waitUntil([this] { return service->prints("lied"); });
        liedAt = std::chrono::steady_clock::now();
        return lied;
    }
    /// By the viewer's own ticks and retries alone.
    bool comesToShow(const std::string& cell)
    {
        return waitUntil([&] { return viewer.shown(cellPath) == cell; });
    }
    /// Through the lie and until data come, nothing else is kept waiting for long.
    void expectShortHold(const std::string& lie)
    {
        Time::duration longest{};
        Time last = std::chrono::steady_clock::now();
        QTimer everything;
        QObject::connect(&everything, &QTimer::timeout, [&] {
            const Time now = std::chrono::steady_clock::now();
            longest = std::max(longest, now - std::exchange(last, now));
        });
        everything.start(5ms);
        startViewer(lie);
        EXPECT_TRUE(comesToShow("302"));
        // A silent one holds it for 1 s; the rest is for machines that have much else to do.
        EXPECT_LT(longest, isSanitized ? 2000ms : 1200ms);
    }
    Time::duration timeSinceLie() const { return std::chrono::steady_clock::now() - liedAt; }

    ProgramPointer service;
    HeadlessViewer viewer{runtimeDirectory()};
    Time liedAt;
};

struct Fault {
    std::string lie;
    std::chrono::seconds recovery; // a second of it is for a machine that is busy with others
};

/// A stream that is lost while everything else of the channel stands.
class LostStream : public LyingService, public testing::WithParamInterface<Fault>
{
};

// A tick notices, the channel is opened anew at once, and a tick shows what came.
constexpr std::chrono::seconds twoTicks{5};

const std::vector<Fault> faults{
    {"close", twoTicks},
    {"half-close", twoTicks},
    {"bad-flags", twoTicks},
    {"bad-header", twoTicks},
    {"too-large", twoTicks},
    {"stall-in-header", 5s + twoTicks},
    {"stall-in-message", 5s + twoTicks},
};

std::string nameOfFault(const testing::TestParamInfo<Fault>& info)
{
    std::string name = info.param.lie;
    std::ranges::replace(name, '-', '_');
    return name;
}

} // namespace

TEST_P(LostStream, IsLiveAgainInTime)
{
    startViewer("stream:" + GetParam().lie);
    EXPECT_TRUE(comesToShow("301"));
    ASSERT_TRUE(waitForLie());
    EXPECT_TRUE(comesToShow("302"));
    EXPECT_LT(timeSinceLie(), GetParam().recovery + (isSanitized ? 5s : 0s));
    EXPECT_EQ(viewer.log().timesOf(" ***** INVALIDATED ").size(), 1U);
}

INSTANTIATE_TEST_SUITE_P(OfAStandingChannel, LostStream, testing::ValuesIn(faults), nameOfFault);

TEST_F(LyingService, WhoseStreamEndsBeforeItsFirstMessageIsOpenedAgain)
{
    startViewer("stream:close-at-once");
    ASSERT_TRUE(waitForLie());
    EXPECT_TRUE(comesToShow("302"));
    EXPECT_LT(timeSinceLie(), twoTicks + (isSanitized ? 5s : 0s));
}

TEST_F(LyingService, WhoseStreamIsSilentKeepsItsChannel)
{
    startViewer("stream:silent");
    EXPECT_TRUE(comesToShow("301"));
    ASSERT_TRUE(waitForLie());
    EXPECT_FALSE(waitUntil([&] { return viewer.log().contains(" ***** INVALIDATED "); }, 7s));
    EXPECT_TRUE(viewer.isConnected());
    ASSERT_TRUE(viewer.model().lastMessageTime());
    EXPECT_GE(LinuxClock().now() - *viewer.model().lastMessageTime(), 6s);
}

TEST_F(LyingService, ThatAnswersTheRequestWith64MebibytesHoldsTheViewerNoLongerThanASilentOne)
{
    expectShortHold("request:large");
}

TEST_F(LyingService, ThatTellsItsTechnologyIn64MebibytesHoldsTheViewerNoLongerThanASilentOne)
{
    expectShortHold("technology:large");
}

// A gigabyte a second for 8 s.
TEST_F(LyingService, ThatFloodsWithLargeMessagesFillsNoMoreThanThePeriodsOfTheHistory)
{
    environment.insert("ASAN_OPTIONS", "quarantine_size_mb=1");
    service = std::make_unique<Program>(
        "/usr/bin/python3", Arguments{VENTRIK_LYING_SERVICE, "stream:large-messages"}, environment);
    ASSERT_TRUE(waitUntil([this] { return service->prints("listening"); })) << service->errors();
    const auto watch = start("ventrik-watch", {}, Program::Output::Discarded);
    ASSERT_TRUE(waitUntil([this] { return service->prints("lied"); }));
    waitUntil([] { return false; }, 8s);
    EXPECT_TRUE(watch->isRunning());
    // Five periods of the history, the present one, and what grows while it is moved.
    EXPECT_LT(watch->peakMemory(), isSanitized ? 1'200'000 : 700'000);
    EXPECT_GT(watch->peakMemory(), 250'000);
}

} // namespace ventrik
