#include "Tests/Process/ProcessFixture.h"

#include <csignal>
#include <filesystem>

#include <fmt/format.h>
#include <sys/stat.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::IsEmpty;
using testing::Lt;

/// How the viewer's process ends where that is made hard for it.
class WindowEnd : public ProcessFixture
{
  protected:
    std::string preferenceFile() const { return path("home/config/org.ventrik.HomeScreen.conf"); }
    ProgramPointer startWindow()
    {
        auto window = start("ventrik", {"--verbose"});
        EXPECT_TRUE(comesUp(*window)) << window->errors();
        return window;
    }
    /// With a service of its own, and alone with it in a process group.
    ProgramPointer startDemo()
    {
        environment.remove("VENTRIK_RUNTIME_DIR");
        auto window = std::make_unique<Program>(
            "/usr/bin/setsid", Arguments{VENTRIK_PROGRAMS "/ventrik", "--demo", "lte", "--verbose"},
            environment);
        EXPECT_TRUE(comesUp(*window)) << window->errors();
        return window;
    }
    static bool comesUp(const Program& window)
    {
        return waitUntil([&] { return window.says("Starting the display update timer"); });
    }
    static void expectEnd(Program& window)
    {
        window.send(SIGTERM);
        const auto asked = std::chrono::steady_clock::now();
        EXPECT_EQ(window.waitForEnd(), 0) << window.errors();
        EXPECT_THAT(std::chrono::steady_clock::now() - asked, Lt(isSanitized ? 6s : 2500ms));
    }
    static void expectQuietEndOfDemo(Program& window, int number)
    {
        EXPECT_EQ(kill(-window.processId(), number), 0);
        EXPECT_EQ(window.waitForEnd(), 0) << window.errors();
        EXPECT_FALSE(window.says("the demo service ended")) << window.errors();
    }
};

} // namespace

TEST_F(WindowEnd, ComesInItsOrderWhenTwoSignalsAskForItAtOnce)
{
    const auto service = startService({"--technology", "lte"});
    const auto window = startWindow();
    window->send(SIGSTOP);
    window->send(SIGHUP);
    window->send(SIGTERM);
    window->send(SIGCONT);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    EXPECT_EQ(readFile(preferenceFile()), "[General]\nHSShowGSMRSSI=false\n");
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(WindowEnd, WaitsOnlyShortlyForASessionBusThatIsStopped)
{
    const auto service = startService({"--technology", "lte"});
    const std::string address = "unix:path=" + path("bus");
    Program bus("/usr/bin/dbus-daemon",
                {"--session", "--nofork", "--print-address", "--address=" + address}, environment);
    ASSERT_TRUE(waitUntil([&] { return bus.prints(address); })) << bus.errors();
    environment.insert("DBUS_SESSION_BUS_ADDRESS", QString::fromStdString(address));
    const auto window = startWindow();
    bus.send(SIGSTOP);
    expectEnd(*window);
    EXPECT_TRUE(window->says("]: <3> The session bus was not told of the preference: "
                             "it does not answer\n"));
}

TEST_F(WindowEnd, WaitsOnlyShortlyForALogThatTakesNoLines)
{
    const auto service = startService({"--technology", "lte"});
    useStuckSystemLog();
    const auto window = startWindow();
    expectEnd(*window);
    EXPECT_EQ(readFile(preferenceFile()), "[General]\nHSShowGSMRSSI=false\n");
}

TEST_F(WindowEnd, LeavesAPipeInThePreferencesPlaceAlone)
{
    const auto service = startService({"--technology", "lte"});
    std::filesystem::create_directories(path("home/config"));
    ASSERT_EQ(mkfifo(preferenceFile().c_str(), 0600), 0);
    const auto window = startWindow();
    expectEnd(*window);
    EXPECT_TRUE(std::filesystem::is_fifo(preferenceFile()));
    EXPECT_TRUE(window->says("]: <3> The preference was not written: " + preferenceFile() +
                             ": it is no file\n"));
}

TEST_F(WindowEnd, LogsAPreferenceThatCannotBeWritten)
{
    const auto service = startService({"--technology", "lte"});
    writeFile("home/config", "no directory");
    const auto window = startWindow();
    expectEnd(*window);
    EXPECT_TRUE(window->says("]: <3> The preference was not written: " + preferenceFile() +
                             ": Not a directory\n"));
}

TEST_F(WindowEnd, OfADemoIsOrdinaryWhenTheTerminalAsksBothForIt)
{
    const auto window = startDemo();
    expectQuietEndOfDemo(*window, SIGINT);
}

TEST_F(WindowEnd, OfADemoIsOrdinaryWhenTheSessionAsksBothForIt)
{
    const auto window = startDemo();
    expectQuietEndOfDemo(*window, SIGTERM);
}

TEST_F(WindowEnd, OfADemoIsAFailureWhenItsServiceEndsByItself)
{
    const auto window = startDemo();
    Program kill("/bin/sh",
                 {"-c", fmt::format("for p in /proc/[0-9]*; do if grep -qs "
                                    "'^PPid:.{}$' $p/status && grep -qs telephony "
                                    "$p/cmdline; then kill -9 ${{p#/proc/}}; fi; done",
                                    window->processId())},
                 environment);
    EXPECT_EQ(window->waitForEnd(), 1);
    EXPECT_TRUE(window->says("ventrik: the demo service ended: "));
}

TEST_F(WindowEnd, OfADemoWithoutATemporaryDirectoryLeavesNothing)
{
    std::filesystem::create_directories(path("work"));
    writeFile("file", "no directory");
    for (const char* name : {"missing", "file"}) {
        environment.insert("TMPDIR", QString::fromStdString(path(name)));
        environment.remove("VENTRIK_RUNTIME_DIR");
        const auto window =
            startInShell("ventrik", {"--demo", "lte", "--verbose"}, "cd '" + path("work") + "'");
        EXPECT_TRUE(comesUp(*window)) << window->errors();
        EXPECT_THAT(namesIn(path("work")), IsEmpty());
        expectEnd(*window);
    }
}

} // namespace ventrik
