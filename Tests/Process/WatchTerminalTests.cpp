#include "Tests/Process/CellMonitorCaptures.h"
#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ProcessFixture.h"
#include "Tests/Process/Terminal.h"

#include <algorithm>
#include <csignal>

namespace ventrik
{

namespace
{

using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr const char* program = VENTRIK_PROGRAMS "/ventrik-watch";

class WatchTerminal : public ProcessFixture
{
  protected:
    Terminal terminal(int columns = 80, int lines = 24) const
    {
        return {path(""), environment, columns, lines};
    }
    /// The viewer's process writes its number to a file; behind it the shell says how it ended.
    std::string viewer(const std::string& arguments = "") const
    {
        return fmt::format("stty -a > {0}/before; sh -c 'echo $$ > {0}/pid; exec {1} {2}'; "
                           "echo ended with $?; stty -a > {0}/after; echo done",
                           path(""), program, arguments);
    }
    pid_t processId() const
    {
        EXPECT_TRUE(waitUntil([&] { return readFile(path("pid")).ends_with('\n'); }));
        return static_cast<pid_t>(std::atoi(readFile(path("pid")).c_str()));
    }
    static bool isGone(pid_t process)
    {
        return waitUntil([process] { return ::kill(process, 0) != 0; });
    }
    void expectCleanEnd(Terminal& shown, int status)
    {
        EXPECT_TRUE(shown.shows(fmt::format("ended with {}\n", status)));
        EXPECT_TRUE(shown.shows("done"));
        EXPECT_FALSE(shown.isOnOtherScreen());
        EXPECT_TRUE(shown.showsCursor());
        EXPECT_THAT(readFile(path("before")), HasSubstr("icanon"));
        EXPECT_EQ(readFile(path("before")), readFile(path("after")));
    }
    ProgramPointer serve(const std::string& xml) const
    {
        const auto capture =
            PcapBytes(cellMonitorLinkType).record(captureStart, 0, cellMonitorMessage(xml));
        return startReplay("cells.pcap", capture.bytes());
    }
};

/// Ends of the viewer that it has no part in.
class WatchTerminalSignal : public WatchTerminal, public testing::WithParamInterface<int>
{
};

} // namespace

TEST_F(WatchTerminal, ShowsTheSectionsInTheTreesOrder)
{
    const auto service = startScenario();
    const auto once = start("ventrik-watch", {"--once"});
    ASSERT_EQ(once->waitForEnd(), 0);
    std::vector<std::string> sections;
    for (const std::string& line : linesOf(once->output()))
        if (line.starts_with("  ") && line[2] != ' ')
            sections.push_back(line.substr(2));
    ASSERT_GE(sections.size(), 5U);

    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    const auto lines = linesOf(shown.screen());
    EXPECT_EQ(lines.at(0), " Ventrik");
    for (std::size_t row = 0; row < sections.size(); ++row)
        EXPECT_THAT(lines.at(row + 1), testing::StartsWith(" " + sections[row] + " "));
}

TEST_F(WatchTerminal, DrillsDownAndBack)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("LTE · connected · updated"));
    EXPECT_TRUE(shown.isOnOtherScreen());
    EXPECT_FALSE(shown.showsCursor());
    shown.press({"Enter"});
    EXPECT_TRUE(shown.shows(" Ventrik › Serving Cell Info\n Physical Cell ID "));
    shown.press({"Escape"});
    EXPECT_TRUE(shown.hides("Physical Cell ID"));
    shown.press({"Down", "Right"});
    EXPECT_TRUE(shown.shows(" Ventrik › Serving Cell Measurements\n"));
    shown.press({"Left", "?"});
    EXPECT_TRUE(shown.shows("─ Keys ─"));
    shown.press({"q"});
    expectCleanEnd(shown, 0);
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(WatchTerminal, ShowsTheChannelOnAKeyAlsoWithoutAService)
{
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("waiting for the service"));
    shown.press({"c"});
    EXPECT_TRUE(shown.shows(" Ventrik › Channel\n"));
    EXPECT_TRUE(shown.shows("no service"));
    const auto service = startScenario();
    EXPECT_TRUE(shown.shows("open since "));
    shown.press({"c"});
    EXPECT_TRUE(shown.shows(" Serving Cell Info "));
    EXPECT_TRUE(shown.hides("Channel"));
}

TEST_F(WatchTerminal, FindsRowsOfTheWholeTree)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"/", "tracking a"});
    EXPECT_TRUE(shown.shows("\n/tracking a"));
    EXPECT_TRUE(shown.shows(" Serving Cell Info › Tracking Area Code "));
    EXPECT_TRUE(shown.showsCursor());
    shown.press({"Enter"});
    EXPECT_TRUE(shown.shows(" Ventrik › Serving Cell Info\n"));
    EXPECT_FALSE(shown.showsCursor());
    shown.press({"n"});
    EXPECT_TRUE(shown.shows("\n 1 of 1: tracking a"));
}

TEST_F(WatchTerminal, ShowsALongValueWholeInABox)
{
    const auto service = serve(fmt::format("<string>{} the end</string>", std::string(100, 'x')));
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"/", "xxx", "Enter"});
    EXPECT_TRUE(shown.shows(" Cell  xxxxx"));
    EXPECT_TRUE(shown.shows("xxx…\n"));
    shown.press({"Space"});
    EXPECT_TRUE(shown.shows("xx the end "));
}

TEST_F(WatchTerminal, FollowsTheTerminalsSize)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"Enter"});
    ASSERT_TRUE(shown.shows("Physical Cell ID"));
    shown.resize(120, 40);
    EXPECT_TRUE(shown.shows("\n Serving Cell Info                            › │ Physical Cell"));
    EXPECT_THAT(linesOf(shown.screen()).at(39), HasSubstr("q quit"));
    shown.resize(40, 10);
    EXPECT_TRUE(shown.hides("│"));
    EXPECT_THAT(linesOf(shown.screen()).at(9), HasSubstr("connected"));
    shown.resize(19, 5);
    EXPECT_TRUE(shown.shows("too small\n"));
    shown.resize(20, 5);
    EXPECT_TRUE(shown.hides("too small"));
    shown.press({"q"});
    EXPECT_TRUE(shown.shows("done"));
}

TEST_F(WatchTerminal, TellsThatTheServiceIsAwaitedLostAndThereAgain)
{
    Terminal shown = terminal();
    shown.run(viewer());
    EXPECT_TRUE(shown.shows("\n No service\n"));
    EXPECT_TRUE(shown.shows("\n waiting for the service · no service"));
    auto service = startScenario();
    ASSERT_TRUE(shown.shows("LTE · connected · updated"));
    shown.press({"Enter"});
    service->kill();
    EXPECT_TRUE(shown.shows("LTE · lost · last update"));
    EXPECT_TRUE(shown.shows("Physical Cell ID"));
    service = startScenario();
    EXPECT_TRUE(shown.shows("LTE · connected · updated"));
}

TEST_F(WatchTerminal, APaneOfAWithdrawnElementGoesBackToItsList)
{
    constexpr const char* twoCells = "<array><string/><dict><key>A</key><string>1</string>"
                                     "<key>B</key><string>17</string></dict>"
                                     "<string>18</string></array>";
    auto service = serve(twoCells);
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"/", "17", "Enter"});
    ASSERT_TRUE(shown.shows(" Ventrik › Cell › 0\n A "));
    service->kill();
    service = serve("<array><string/></array>");
    EXPECT_TRUE(shown.shows(" Ventrik › Cell\n This list is empty\n"));
}

TEST_F(WatchTerminal, MarksWhatCannotBeAndTellsWhy)
{
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(504));
    const auto service = startReplay("cell.pcap", capture.bytes());
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"Enter"});
    EXPECT_TRUE(shown.shows(" 504 !\n"));
    EXPECT_TRUE(shown.shows("! Physical cell identity is above 503\n"));
    EXPECT_THAT(shown.styledScreen(), HasSubstr("\033[33m"));
}

TEST_F(WatchTerminal, WithoutColorsMarksTheSame)
{
    environment.insert("NO_COLOR", "1");
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(504));
    const auto service = startReplay("cell.pcap", capture.bytes());
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"Enter"});
    EXPECT_TRUE(shown.shows(" 504 !\n"));
    EXPECT_THAT(shown.styledScreen(), Not(HasSubstr("\033[33m")));
}

TEST_F(WatchTerminal, ObeysNothingThatAValueHolds)
{
    const auto service = serve("<string>a&#x9b;7m\u202e&#x0d;b 東京 e\u0301 end</string>");
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"/", "東京", "Enter"});
    EXPECT_TRUE(shown.shows("a 7m  b 東京 e\u0301 end\n"));
}

TEST_F(WatchTerminal, KeepsTheLogFromTheScreenUntilTheEnd)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer("--verbose"));
    ASSERT_TRUE(shown.shows("connected · updated"));
    EXPECT_THAT(shown.screen(), Not(HasSubstr("<3>")));
    shown.press({"q"});
    expectCleanEnd(shown, 0);
    EXPECT_THAT(shown.history(), HasSubstr("<3> Starting the display update timer\n"));
}

TEST_F(WatchTerminal, TellsAtTheEndNoMoreThanWasAskedFor)
{
    const std::string drive = path("drive.pcap");
    const auto writer =
        start("ventrik-telephony", {"--technology", "utran", "--write", drive, "--count", "3000"});
    ASSERT_EQ(writer->waitForEnd(), 0);
    const auto service = startService({"--replay", drive, "--speed", "max"});
    Terminal shown = terminal(80, 60);
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"q"});
    expectCleanEnd(shown, 0);
    // The decoder tells of each state, asked or not.
    const auto lines = linesOf(shown.history());
    const auto told = std::ranges::count_if(
        lines, [](const std::string& line) { return line.starts_with("Display Dict = "); });
    EXPECT_GT(told, 10);
    EXPECT_LE(told, 20);
}

TEST_F(WatchTerminal, LetsTheLogGoToAFileAtOnce)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer("--verbose 2> " + path("log")));
    ASSERT_TRUE(shown.shows("connected · updated"));
    EXPECT_THAT(readFile(path("log")), HasSubstr("<3> Starting the display update timer\n"));
    shown.press({"q"});
    expectCleanEnd(shown, 0);
    EXPECT_THAT(shown.screen(), Not(HasSubstr("<3>")));
}

TEST_F(WatchTerminal, AFailedAssertionIsReadOnACleanTerminal)
{
    const auto service = serve("<integer>1</integer>");
    Terminal shown = terminal(200, 24);
    shown.run(viewer());
    expectCleanEnd(shown, 128 + SIGABRT);
    EXPECT_TRUE(shown.shows("Assertion failure: "));
}

TEST_F(WatchTerminal, WipesTheScreenWhereThereIsNoOtherOne)
{
    for (const char* end : {"q", "C-\\"}) {
        Terminal shown = terminal();
        shown.run("TERM=vt100 " + std::string(program) + "; echo ended");
        ASSERT_TRUE(shown.shows("waiting for the service"));
        EXPECT_FALSE(shown.isOnOtherScreen());
        shown.press({end});
        EXPECT_TRUE(shown.shows("ended\nshell:"));
        EXPECT_THAT(shown.screen(), Not(HasSubstr("waiting")));
        EXPECT_THAT(shown.screen(), Not(HasSubstr("$<")));
    }
}

TEST_P(WatchTerminalSignal, LeavesTheTerminalAsItWas)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    EXPECT_EQ(::kill(processId(), GetParam()), 0);
    const bool isOrderly = GetParam() == SIGTERM || GetParam() == SIGINT || GetParam() == SIGHUP;
    // The sanitizer ends a process with a bad access in its own way.
    const bool isReported = isSanitized && GetParam() == SIGBUS;
    expectCleanEnd(shown, isOrderly ? 0 : isReported ? 1 : 128 + GetParam());
}

INSTANTIATE_TEST_SUITE_P(AllEnds, WatchTerminalSignal,
                         testing::Values(SIGTERM, SIGINT, SIGHUP, SIGQUIT, SIGABRT, SIGBUS),
                         [](const auto& parameter) {
                             return std::string("SIG") + sigabbrev_np(parameter.param);
                         });

TEST_F(WatchTerminal, ControlCEndsIt)
{
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("waiting for the service"));
    shown.press({"C-c"});
    EXPECT_TRUE(shown.shows("shell:"));
    EXPECT_FALSE(shown.isOnOtherScreen());
    EXPECT_TRUE(isGone(processId()));
}

TEST_F(WatchTerminal, StopsAndGoesOn)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(program);
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"Enter"});
    ASSERT_TRUE(shown.shows("Physical Cell ID"));
    shown.press({"C-z"});
    EXPECT_TRUE(shown.shows("Stopped"));
    EXPECT_FALSE(shown.isOnOtherScreen());
    EXPECT_TRUE(shown.showsCursor());
    shown.run("fg");
    EXPECT_TRUE(shown.shows(" Ventrik › Serving Cell Info\n Physical Cell ID "));
    EXPECT_TRUE(shown.isOnOtherScreen());
    EXPECT_FALSE(shown.showsCursor());
    shown.press({"Down", "q"});
    EXPECT_TRUE(shown.shows("shell:"));
}

TEST_F(WatchTerminal, EndsWithTheTerminal)
{
    const auto service = startScenario();
    Terminal shown = terminal();
    shown.run(viewer());
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.hangUp();
    EXPECT_TRUE(isGone(processId()));
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(WatchTerminal, EndsWithTheTerminalWhateverSignalsItIgnores)
{
    Terminal shown = terminal();
    shown.run("trap '' HUP; " + viewer());
    ASSERT_TRUE(shown.shows("waiting for the service"));
    shown.hangUp();
    EXPECT_TRUE(isGone(processId()));
    EXPECT_THAT(sockets(), IsEmpty());
}

TEST_F(WatchTerminal, EndsWhileTheTerminalTakesNothing)
{
    const auto service = startScenario();
    Terminal shown = terminal(200, 60);
    shown.run(viewer("--verbose"));
    ASSERT_TRUE(shown.shows("connected · updated"));
    shown.press({"C-s"});
    for (int count = 0; count < 50; ++count)
        shown.press({"Enter", "C-l", "Escape", "C-l", "?", "C-l", "Escape", "C-l"});
    EXPECT_EQ(::kill(processId(), SIGTERM), 0);
    EXPECT_TRUE(isGone(processId()));
}

TEST_F(WatchTerminal, RefusesATerminalThatCannotPlaceText)
{
    Terminal shown = terminal(120, 24);
    shown.run("TERM=dumb " + std::string(program) + "; echo status $?");
    EXPECT_TRUE(shown.shows("ventrik-watch: the terminal cannot place text (TERM=dumb); --plain "
                            "prints the tree instead\nstatus 1\n"));
    shown.run("TERM=quarz " + std::string(program) + "; echo status $?");
    EXPECT_TRUE(shown.shows("ventrik-watch: the terminal's kind is not known (TERM=quarz); "
                            "--plain prints the tree instead\nstatus 1\n"));
    shown.run("env -u TERM " + std::string(program) + "; echo status $?");
    EXPECT_TRUE(shown.shows("ventrik-watch: TERM is not set, so the terminal's kind is not known; "
                            "--plain prints the tree instead\nstatus 1\n"));
}

TEST_F(WatchTerminal, PrintsTreesWhereThatIsWanted)
{
    const auto service = startScenario();
    Terminal shown = terminal(80, 200);
    shown.run("TERM=dumb " + std::string(program) + " --plain");
    EXPECT_TRUE(shown.shows("Ventrik\n  Serving Cell Info\n    Physical Cell ID: "));
    EXPECT_FALSE(shown.isOnOtherScreen());
    shown.press({"C-c"});
    EXPECT_TRUE(shown.shows("shell:"));
}

TEST_F(WatchTerminal, PrintsOneTreeBelowWhatIsThere)
{
    const auto service = startScenario();
    Terminal shown = terminal(200, 200);
    shown.run("echo before; " + std::string(program) + " --once");
    EXPECT_TRUE(shown.shows("\nbefore\nVentrik\n  Serving Cell Info\n    Physical Cell ID: "));
}

} // namespace ventrik
