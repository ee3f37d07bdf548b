#include "Tests/Process/ProcessFixture.h"

#include <csignal>
#include <filesystem>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class EndSignal : public ProcessFixture
{
  protected:
    ProgramPointer startSlowEnd()
    {
        auto program = start("slow-end", {});
        EXPECT_TRUE(waitUntil([&] { return program->prints("running\n"); }));
        return program;
    }
};

} // namespace

TEST_F(EndSignal, BelongsToAnotherOneThatIsPendingWithIt)
{
    const auto program = startSlowEnd();
    program->send(SIGSTOP);
    for (const int number : {SIGHUP, SIGTERM, SIGINT})
        program->send(number);
    program->send(SIGCONT);
    EXPECT_EQ(program->waitForEnd(), 0);
    EXPECT_EQ(program->output(), "running\nasked\nended\n");
}

TEST_F(EndSignal, BelongsToOneThatCameJustBefore)
{
    const auto program = startSlowEnd();
    program->send(SIGHUP);
    ASSERT_TRUE(waitUntil([&] { return program->prints("asked\n"); }));
    program->send(SIGTERM);
    program->send(SIGHUP);
    EXPECT_EQ(program->waitForEnd(), 0);
    EXPECT_EQ(program->output(), "running\nasked\nended\n");
}

TEST_F(EndSignal, ThatComesLaterEndsTheProcessAtOnce)
{
    const auto program = startSlowEnd();
    program->send(SIGTERM);
    ASSERT_TRUE(waitUntil([&] { return program->prints("asked\n"); }));
    waitUntil([] { return false; }, 2000ms);
    program->send(SIGTERM);
    EXPECT_EQ(program->waitForEnd(), 128 + SIGTERM);
    EXPECT_EQ(program->output(), "running\nasked\n");
}

TEST_F(EndSignal, ThatItWasStartedToIgnoreStaysIgnored)
{
    const auto program = startInShell("slow-end", {}, "trap '' HUP INT");
    ASSERT_TRUE(waitUntil([&] { return program->prints("running\n"); }));
    program->send(SIGHUP);
    program->send(SIGINT);
    EXPECT_FALSE(waitUntil([&] { return program->prints("asked\n"); }, 200ms));
    program->send(SIGTERM);
    EXPECT_EQ(program->waitForEnd(), 0);
}

TEST_F(EndSignal, OfATerminalEndsTheTreeThereAndItsServiceQuietly)
{
    std::filesystem::create_directories(path("temporary"));
    environment.insert("TMPDIR", QString::fromStdString(path("temporary")));
    for (const int number : {SIGINT, SIGTERM}) {
        Program script("/usr/bin/setsid",
                       {VENTRIK_SCRIPTS "/run-in-terminal", VENTRIK_PROGRAMS, "lte"}, environment);
        ASSERT_TRUE(waitUntil([&] { return script.prints("Ventrik\n"); })) << script.errors();
        EXPECT_EQ(kill(-script.processId(), number), 0);
        EXPECT_EQ(script.waitForEnd(), number == SIGINT ? 0 : 128 + number);
        EXPECT_THAT(script.errors(), testing::IsEmpty());
        EXPECT_THAT(namesIn(path("temporary")), testing::IsEmpty());
    }
}

TEST_F(EndSignal, OfATerminalDoesNotReachAServiceThatWasStartedWithoutHangups)
{
    const auto service = startInShell("ventrik-telephony", {"--technology", "lte"}, "trap '' HUP");
    ASSERT_TRUE(waitUntil([&] { return !sockets().empty(); }));
    service->send(SIGHUP);
    EXPECT_FALSE(waitUntil([&] { return !service->isRunning(); }, 300ms));
    service->send(SIGTERM);
    EXPECT_EQ(service->waitForEnd(), 0) << service->errors();
}

} // namespace ventrik
