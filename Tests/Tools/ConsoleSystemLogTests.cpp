#include "Tests/Support/CapturingSystemLog.h"
#include "Tools/ConsoleSystemLog.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <unistd.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::internal::CaptureStderr;
using testing::internal::GetCapturedStderr;

void writeLines(SystemLog& log)
{
    CaptureStderr();
    log.error("failed\n");
    log.log(LogPriority::debug, "tried");
    log.showOnConsole("looked\n");
}

} // namespace

TEST(ConsoleSystemLog, ShowsLinesUpToItsLevelAndTheConsole)
{
    ConsoleSystemLog log("ventrik-test", LogPriority::error);
    writeLines(log);
    EXPECT_EQ(GetCapturedStderr(), fmt::format("ventrik-test[{}]: <3> failed\nlooked\n", getpid()));
}

TEST(ConsoleSystemLog, ThatShowsNothingFormatsNothing)
{
    ConsoleSystemLog log("ventrik-test", ConsoleSystemLog::showNothing);
    EXPECT_FALSE(log.isEnabled(0));
    EXPECT_FALSE(log.isEnabled(16));
    writeLines(log);
    EXPECT_THAT(GetCapturedStderr(), IsEmpty());
}

TEST(ConsoleSystemLog, GivesEveryEntryToTheOtherLogAsItIs)
{
    CapturingSystemLog other;
    ConsoleSystemLog log("ventrik-test", ConsoleSystemLog::showNothing, &other);
    writeLines(log);
    EXPECT_THAT(GetCapturedStderr(), IsEmpty());
    EXPECT_THAT(other.texts(), ElementsAre("failed\n", "tried"));
}

} // namespace ventrik
