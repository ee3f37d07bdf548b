#include "Tests/Process/DecodeFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::AllOf;
using testing::Contains;
using testing::Each;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Lt;
using testing::Not;
using testing::StartsWith;

class SystemLogProcess : public DecodeFixture
{
  protected:
    static std::size_t treesOf(const Program& watch)
    {
        std::size_t trees = 0;
        for (const std::string& line : linesOf(watch.output()))
            trees += line == "Ventrik";
        return trees;
    }
    /// A viewer whose log is stuck goes on showing what comes, and ends in its order.
    void expectToGoOn(Program& watch)
    {
        EXPECT_TRUE(waitUntil([&] { return treesOf(watch) >= 2; }));
        watch.send(SIGTERM);
        const auto asked = std::chrono::steady_clock::now();
        EXPECT_EQ(watch.waitForEnd(), 0);
        EXPECT_THAT(std::chrono::steady_clock::now() - asked, Lt(isSanitized ? 6s : 3s));
        EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
    }
    /// The system log's lines of a viewer that has shown a tree.
    std::vector<std::string> logOfWatch(Arguments arguments)
    {
        const auto service = startScenario();
        useSystemLogFile(path("log"));
        arguments.emplace_back("--once");
        const auto watch = start("ventrik-watch", arguments);
        EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
        return linesOf(readFile(path("log")));
    }
};

} // namespace

TEST_F(SystemLogProcess, WhoseDaemonTakesNoLinesHoldsNothingUp)
{
    const auto service = startScenario();
    useStuckSystemLog();
    const auto watch = start("ventrik-watch", {"--log-level", "debug"});
    expectToGoOn(*watch);
    EXPECT_THAT(watch->errors(), IsEmpty());
}

TEST_F(SystemLogProcess, WhoseDaemonTakesNoLinesStillShowsThemToWhoeverAsks)
{
    const auto service = startScenario();
    useStuckSystemLog();
    const auto watch = start("ventrik-watch", {"--verbose"});
    EXPECT_TRUE(waitUntil([&] { return watch->says("Starting the display update timer"); }));
    expectToGoOn(*watch);
}

TEST_F(SystemLogProcess, WhoseReaderTakesNoLinesHoldsNothingUp)
{
    const auto service = startScenario();
    const auto watch = startInShell("ventrik-watch", {"--verbose"}, "", "2>" + fullPipe());
    expectToGoOn(*watch);
}

TEST_F(SystemLogProcess, HoldsErrorsAlone)
{
    const auto log = logOfWatch({});
    EXPECT_THAT(log,
                AllOf(Contains("3 Starting the display update timer"), Each(StartsWith("3 "))));
}

TEST_F(SystemLogProcess, HoldsWhatItsLevelAsksFor)
{
    EXPECT_THAT(
        logOfWatch({"--log-level", "warning"}),
        AllOf(Contains("3 Starting the display update timer"), Contains("4 Serving Cell Info")));
    EXPECT_THAT(logOfWatch({"--log-level", "critical", "--verbose"}).size(),
                logOfWatch({"--log-level", "critical"}).size());
}

TEST_F(SystemLogProcess, IsWholeOnStandardErrorWhateverItsLevel)
{
    const auto service = startScenario();
    const auto watch = start("ventrik-watch", {"--once", "--verbose", "--log-level", "emergency"});
    EXPECT_EQ(watch->waitForEnd(), 0);
    EXPECT_TRUE(watch->says("]: <3> Starting the display update timer\n"));
    EXPECT_TRUE(watch->says("]: <4> Serving Cell Info\n"));
}

TEST_F(SystemLogProcess, OfADecoderShowsOnStandardErrorWithTheConsoleWhereAsked)
{
    const Result result = decode(cellCapture(), {"--verbose", "--format", "json"});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, StartsWith(R"({"technology": "lte", "packets": 2)"));
    const auto lines = linesOf(result.errors);
    EXPECT_THAT(lines, Contains(HasSubstr("]: <3> Creating LTELogGenerator object")));
    EXPECT_THAT(lines, Contains(HasSubstr("]: <4> Serving Cell Info")));
    EXPECT_THAT(lines, Contains("Deallocing ClassIndex"));
}

TEST_F(SystemLogProcess, OfADecoderShowsUpToItsLevelAndIsWholeInItsFile)
{
    const Result result = decode(
        cellCapture(), {"--verbose", "--log-level", "error", "--system-log", path("system.log")});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(linesOf(result.errors),
                AllOf(Contains(HasSubstr("]: <3> ")), Each(Not(HasSubstr("]: <4> ")))));
    EXPECT_THAT(linesOf(readFile(path("system.log"))),
                AllOf(Contains("3\tClass Index: 1"), Contains("4\tServing Cell Info")));
}

TEST_F(SystemLogProcess, OfADecoderLeavesItsConsoleAloneWhereNotAsked)
{
    const PcapBytes capture =
        PcapBytes(151).record(captureStart, 0, PacketBuilder(0xD0E0).u8(13, 1).u8(14, 3).build());
    const std::string file = writeFile("utran.pcap", capture.bytes());
    const auto quiet = start("ventrik-decode", {file});
    EXPECT_EQ(quiet->waitForEnd(), 0);
    EXPECT_THAT(quiet->errors(), IsEmpty());
    const auto verbose = start("ventrik-decode", {"--verbose", file});
    EXPECT_EQ(verbose->waitForEnd(), 0);
    EXPECT_TRUE(verbose->says("rrc mode = 3 Cell DCH\n")) << verbose->errors();
}

} // namespace ventrik
