#include "Tests/Process/CellMonitorCaptures.h"
#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ToolUsageFixture.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <regex>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* timerStarted = "Starting the display update timer";

std::size_t count(const std::string& text, std::string_view part)
{
    std::size_t result = 0;
    for (auto at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++result;
    return result;
}

/// State and parent of a process; state 'X' when there is none.
struct ProcessState {
    char state = 'X';
    pid_t parent = 0;
};

ProcessState stateOf(pid_t processId)
{
    std::ifstream file(fmt::format("/proc/{}/stat", processId));
    std::string line;
    std::getline(file, line);
    ProcessState result;
    // The name in parentheses may hold anything; the fields go on behind it.
    const auto name = line.rfind(')');
    if (name != std::string::npos)
        std::sscanf(line.c_str() + name + 1, " %c %d", &result.state, &result.parent);
    return result;
}

bool hasEnded(pid_t processId)
{
    const char state = stateOf(processId).state;
    return state == 'X' || state == 'Z';
}

std::vector<pid_t> childrenOf(pid_t parent)
{
    std::vector<pid_t> children;
    for (const auto& entry : std::filesystem::directory_iterator("/proc")) {
        const pid_t processId = std::atoi(entry.path().filename().c_str());
        if (processId > 0 && stateOf(processId).parent == parent && !hasEnded(processId))
            children.push_back(processId);
    }
    return children;
}

class WindowProcess : public ToolUsageFixture
{
  protected:
    ProgramPointer startWindow()
    {
        auto window = start("ventrik", {"--verbose"});
        EXPECT_TRUE(waitUntil([&] { return window->says(timerStarted); })) << window->errors();
        return window;
    }
    /// A window that somebody reads.
    ProgramPointer startReadWindow(const Arguments& arguments)
    {
        environment.insert("QT_PLUGIN_PATH", VENTRIK_TEST_PLUGINS);
        environment.insert("QT_QPA_GENERIC_PLUGINS", "typist:reads");
        return start("ventrik", arguments);
    }
    static bool saysLine(const Program& program, const std::string& pattern)
    {
        return std::regex_search(program.errors(), std::regex(pattern));
    }
    std::string homeScreenPreferences() const
    {
        return readFile(path("home/config/org.ventrik.HomeScreen.conf"));
    }
    /// A session bus of our own, of which an interface is watched, once it is there; the
    /// environment names it from then on.
    ProgramPointer startBus(const std::string& interface = "org.ventrik.Preferences")
    {
        auto bus = std::make_unique<Program>("/usr/bin/dbus-run-session",
                                             Arguments{"--", "/bin/sh", "-c",
                                                       "echo \"$DBUS_SESSION_BUS_ADDRESS\"; "
                                                       "exec dbus-monitor \"interface='$0'\"",
                                                       interface},
                                             environment);
        // The monitor is told its own name once it watches.
        EXPECT_TRUE(waitUntil([&] { return bus->prints("NameLost"); })) << bus->errors();
        environment.insert("DBUS_SESSION_BUS_ADDRESS",
                           QString::fromStdString(linesOf(bus->output()).front()));
        return bus;
    }
    /// A window with a service of its own; whatever it makes, it makes in this directory.
    ProgramPointer startDemo()
    {
        std::filesystem::create_directories(temporary);
        std::filesystem::permissions(temporary, std::filesystem::perms::owner_all);
        environment.remove("VENTRIK_RUNTIME_DIR");
        environment.insert("TMPDIR", QString::fromStdString(temporary));
        environment.insert("XDG_RUNTIME_DIR", QString::fromStdString(temporary));
        auto window = start("ventrik", {"--demo", "lte", "--verbose"});
        EXPECT_TRUE(waitUntil([&] { return window->says(timerStarted); })) << window->errors();
        return window;
    }

    /// The window of a cell-monitor service whose second message is this.
    void expectAbort(const Bytes& message, const std::string& line)
    {
        const auto service =
            startReplay("cells.pcap", PcapBytes(cellMonitorLinkType)
                                          .record(captureStart, 0, cellMonitorMessage(text))
                                          .record(captureStart, 1, message)
                                          .bytes());
        const auto window = startWindow();
        EXPECT_EQ(window->waitForEnd(), 128 + SIGABRT);
        const auto lines = linesOf(window->errors());
        ASSERT_GE(lines.size(), 2U);
        EXPECT_EQ(lines.back(), line);
        // Before that the system log's line, of error priority.
        EXPECT_THAT(lines[lines.size() - 2], EndsWith("]: <3> " + line));
    }

    static constexpr const char* text = "<string>-70 dBm</string>";
    std::string temporary = path("temporary");
};

} // namespace

TEST_F(WindowProcess, ConnectsAndEndsOnSIGTERM)
{
    const auto service = startScenario();
    const auto window = startWindow();
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(WindowProcess, ResetsTheHomeScreenOnlyWhenItEndsHoweverItIsAsked)
{
    const auto service = startScenario();
    for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
        const auto window = startWindow();
        EXPECT_EQ(homeScreenPreferences(), "");
        window->send(signal);
        EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
        EXPECT_EQ(homeScreenPreferences(), "[General]\nHSShowGSMRSSI=false\n");
        std::filesystem::remove(path("home/config/org.ventrik.HomeScreen.conf"));
    }
}

TEST_F(WindowProcess, ResetsTheHomeScreenAlsoWhenTheDisplayGoesAway)
{
    const auto service = startScenario();
    environment.insert("QT_PLUGIN_PATH", VENTRIK_TEST_PLUGINS);
    environment.insert("QT_QPA_GENERIC_PLUGINS", "typist:loses-display");
    const auto window = start("ventrik", {});
    EXPECT_EQ(window->waitForEnd(), 1) << window->errors();
    EXPECT_EQ(homeScreenPreferences(), "[General]\nHSShowGSMRSSI=false\n");
}

TEST_F(WindowProcess, SaysWhyTheChannelIsDownOnceTheServiceHasDied)
{
    const auto service = startScenario();
    const auto window = startReadWindow({"--verbose"});
    EXPECT_TRUE(waitUntil([&] { return window->says("Ventrik – LTE | Updated "); }))
        << window->errors();
    service->kill();
    EXPECT_TRUE(waitUntil([&] {
        return saysLine(*window, R"(Connecting\.\.\. \| last update [0-9:]{8} · no service)");
    })) << window->errors();
}

TEST_F(WindowProcess, SaysWhichTemplateIsBroken)
{
    const auto service = startScenario();
    const std::string broken = writeFile("broken/LTE.plist", "<plist><dict>");
    environment.insert("VENTRIK_RESOURCE_DIRECTORY", QString::fromStdString(path("broken")));
    const auto window = startReadWindow({});
    EXPECT_TRUE(waitUntil([&] { return window->says("display template " + broken + ": "); }))
        << window->errors();
}

TEST_F(WindowProcess, SaysThatAnotherViewerHoldsThePort)
{
    const auto service = startScenario();
    const auto first = startWindow();
    const auto second = startReadWindow({});
    EXPECT_TRUE(waitUntil([&] { return second->says("another viewer holds the port"); }))
        << second->errors();
}

TEST_F(WindowProcess, WritesTimesTheSameInEveryLanguage)
{
    const auto service = startScenario();
    environment.insert("LC_ALL", "ar_EG.UTF-8");
    const auto window = startReadWindow({});
    EXPECT_TRUE(waitUntil([&] { return window->says("| Updated "); })) << window->errors();
    EXPECT_TRUE(saysLine(*window, "Updated [0-9]{4}-[0-9]{2}-[0-9]{2} at [0-9:]{8}"))
        << window->errors();
}

TEST_F(WindowProcess, KeepsTheSizeThatItIsGiven)
{
    const auto service = startScenario();
    const auto window = startReadWindow({"--save-button", "--size", "200x480"});
    EXPECT_TRUE(waitUntil([&] { return window->says("| Updated "); })) << window->errors();
    EXPECT_EQ(count(window->errors(), " | "), 2 * count(window->errors(), "200x480 Ventrik"))
        << window->errors();
}

TEST_F(WindowProcess, OpensACaptureWithoutAService)
{
    const std::string capture = path("drive.pcap");
    const auto writer =
        start("ventrik-telephony", {"--technology", "lte", "--write", capture, "--count", "500"});
    EXPECT_EQ(writer->waitForEnd(), 0) << writer->errors();
    const auto window = startReadWindow({"--open", capture});
    EXPECT_TRUE(waitUntil([&] {
        return window->says("Ventrik – drive.pcap – LTE | drive.pcap at 20");
    })) << window->errors();
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

TEST_F(WindowProcess, RefusesToOpenWhatIsNoCapture)
{
    const std::string file = writeFile("no.pcap", "this is none");
    const auto window = start("ventrik", {"--open", file});
    EXPECT_EQ(window->waitForEnd(), 1);
    EXPECT_TRUE(window->says("ventrik: " + file + ": ")) << window->errors();
}

TEST_F(WindowProcess, TellsTheSessionBusThatThePreferenceHasChanged)
{
    const auto bus = startBus();
    const auto service = startScenario();
    const auto window = startWindow();
    EXPECT_FALSE(bus->prints("member=Changed"));
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    EXPECT_TRUE(waitUntil([&] { return bus->prints("string \"HSShowGSMRSSI\""); }));
    EXPECT_THAT(bus->output(),
                HasSubstr("path=/org/ventrik/Preferences; interface=org.ventrik.Preferences; "
                          "member=Changed\n   string \"org.ventrik.HomeScreen\"\n"
                          "   string \"HSShowGSMRSSI\"\n"));
}

TEST_F(WindowProcess, HasTheDesktopTellOfAnAlert)
{
    const auto bus = startBus("org.freedesktop.Notifications");
    const auto service = startScenario();
    // One of them is crossed soon.
    Arguments arguments{"--verbose"};
    for (int threshold = -120; threshold < -60; ++threshold)
        arguments.insert(
            arguments.end(),
            {"--alert", "/Serving Cell Measurements/Measured RSRP < " + std::to_string(threshold)});
    const auto window = start("ventrik", arguments);
    EXPECT_TRUE(waitUntil([&] { return bus->prints("string \"Measured RSRP is "); }))
        << bus->output() << window->errors();
    EXPECT_THAT(bus->output(), HasSubstr("path=/org/freedesktop/Notifications; "
                                         "interface=org.freedesktop.Notifications; "
                                         "member=Notify\n   string \"Ventrik\"\n   uint32 0\n"
                                         "   string \"ventrik\"\n   string \"Measured RSRP is -"));
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

TEST_F(WindowProcess, ReconnectsAfterTheServiceWasKilled)
{
    auto service = startScenario();
    const auto window = startWindow();
    service->kill();
    service = startScenario();
    EXPECT_TRUE(waitUntil([&] { return count(window->errors(), timerStarted) == 2; }));
    EXPECT_TRUE(window->says(" ***** INVALIDATED "));
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

TEST_F(WindowProcess, OfADemoTakesItsServiceAlongWhenItEnds)
{
    const auto window = startDemo();
    const auto children = childrenOf(window->processId());
    EXPECT_FALSE(children.empty());
    EXPECT_FALSE(namesIn(temporary).empty());
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    for (const pid_t child : children)
        EXPECT_TRUE(waitUntil([&] { return hasEnded(child); }));
    EXPECT_THAT(namesIn(temporary), IsEmpty());
}

TEST_F(WindowProcess, OfADemoTakesItsServiceAlongWhenItIsKilled)
{
    const auto window = startDemo();
    const auto children = childrenOf(window->processId());
    EXPECT_FALSE(children.empty());
    window->kill();
    for (const pid_t child : children)
        EXPECT_TRUE(waitUntil([&] { return hasEnded(child); }));
    EXPECT_THAT(namesIn(temporary), IsEmpty());
}

TEST_F(WindowProcess, EndsOnACellMonitorMessageWithANumber)
{
    expectAbort(cellMonitorMessage("<integer>-70</integer>"),
                "Assertion failure: Unknown object of type integer encountered "
                "(LogGenerator/GSM/GSMLogGenerator, line 78)");
}

TEST_F(WindowProcess, EndsOnACellMonitorMessageThatIsNoPropertyList)
{
    for (const Bytes& message : {Bytes{}, Bytes{'c', 'e', 'l', 'l'}, Bytes(20, 0xFF)})
        expectAbort(message, "Assertion failure: Could not deserialize the object "
                             "(LogGenerator/GSM/GSMLogGenerator, line 90)");
}

TEST_F(WindowProcess, RefusesWhatIsWrong)
{
    expectRefused("ventrik", {{"--unheard-of"},
                              {"more"},
                              {"--demo"},
                              {"--demo", "5g"},
                              {"--log-level"},
                              {"--demo", "lte", "--replay", "x"},
                              {"--demo", "lte", "--open", "x"},
                              {"--open", "x", "--record", "y"},
                              {"--open", "-"},
                              {"--serial", "/dev/null"},
                              {"--technology", "lte"},
                              {"--speed", "2"},
                              {"--replay", "x", "--speed", "0"},
                              {"--alert", "RSRP < -110"},
                              {"--alert", "/Cell/RSRP"},
                              {"--history", "7M"},
                              {"--history-age", "24"},
                              {"--bands", "RSRP=good"}});
}

TEST_F(WindowProcess, TellsItsUsageAndVersion)
{
    expectHelpAndVersion("ventrik", "[OPTION]...");
}

TEST_F(WindowProcess, ExportsItsTwoFunctions)
{
    Program nm("/usr/bin/nm", {"-D", "--defined-only", VENTRIK_PROGRAMS "/ventrik"}, environment);
    EXPECT_EQ(nm.waitForEnd(), 0) << nm.errors();
    EXPECT_THAT(nm.output(), HasSubstr(" T ETLDLFAddVersionReport\n"));
    EXPECT_THAT(nm.output(), HasSubstr(" T lz4_decode_fast\n"));
}

} // namespace ventrik
