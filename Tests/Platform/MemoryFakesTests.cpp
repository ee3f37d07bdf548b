#include "Tests/Support/CapturingSystemLog.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/MemoryPreferences.h"
#include "Tests/Support/MemoryResources.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;

TEST(CapturingSystemLog, KeepsEntriesWithTheirPriority)
{
    CapturingSystemLog log;
    log.error("a {}", 1);
    log.warning("b");
    log.error("a {}", 1);
    EXPECT_THAT(log.texts(), ElementsAre("a 1", "b", "a 1"));
    EXPECT_THAT(log.texts(LogPriority::warning), ElementsAre("b"));
    EXPECT_EQ(log.count("a 1"), 2U);
    EXPECT_FALSE(log.contains("a"));
    log.clear();
    EXPECT_TRUE(log.lines().empty());
}

TEST(CapturingSystemLog, FiltersAboveItsThreshold)
{
    CapturingSystemLog log(LogPriority::error);
    log.warning("w");
    log.log(8 + LogPriority::error, "e");
    EXPECT_THAT(log.lines(), ElementsAre(CapturingSystemLog::Line{11, "e"}));
}

TEST(FixedClock, StandsUntilItIsMoved)
{
    FixedClock clock;
    EXPECT_EQ(clock.now().time_since_epoch(), std::chrono::seconds(1794809428));
    clock.advance(std::chrono::milliseconds(1500));
    EXPECT_EQ(clock.now().time_since_epoch(), std::chrono::milliseconds(1794809429500));
    clock.setTimeZone({-3600, true});
    EXPECT_EQ(clock.timeZone(clock.now()).secondsFromUtc, -3600);
}

TEST(MemoryPreferences, RecordsCallsInOrder)
{
    MemoryPreferences preferences;
    preferences.setSynchronizeSucceeds(false);
    preferences.set("d", "k", true);
    EXPECT_FALSE(preferences.synchronize("d"));
    preferences.postChanged("d", "k");
    EXPECT_THAT(preferences.calls(), ElementsAre("set d k true", "synchronize d", "post d k"));
    EXPECT_EQ(preferences.value("d", "k"), true);
    EXPECT_EQ(preferences.value("d", "other"), std::nullopt);
}

TEST(MemoryResources, FindsFilesByNameAndType)
{
    MemoryResources resources;
    resources.add("/r/B.plist", "b");
    resources.add("/r/A.plist", "a");
    resources.add("/r/A.txt", "t");
    EXPECT_EQ(resources.path("A", "plist"), "/r/A.plist");
    EXPECT_EQ(resources.path("C", "plist"), std::nullopt);
    EXPECT_THAT(resources.paths("plist"), ElementsAre("/r/A.plist", "/r/B.plist"));
    EXPECT_EQ(resources.contents("/r/A.txt"), Bytes{'t'});
    resources.setApplicationVersion(std::nullopt);
    EXPECT_EQ(resources.applicationVersion(), std::nullopt);
}

} // namespace
} // namespace ventrik
