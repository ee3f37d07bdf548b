#include "Tests/Process/DecodeFixture.h"

#include <csignal>
#include <filesystem>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr const char* programs[] = {"ventrik", "ventrik-watch", "ventrik-telephony",
                                    "ventrik-decode"};

class StandardStream : public DecodeFixture
{
  protected:
    std::string captureFile() const { return writeFile("c.pcap", cellCapture().bytes()); }
    ProgramPointer end(const std::string& name, const Arguments& arguments,
                       const std::string& redirections, int status)
    {
        auto program = startInShell(name, arguments, "", redirections);
        EXPECT_EQ(program->waitForEnd(), status) << name << ' ' << redirections;
        return program;
    }
    void expectFailureToWrite(const std::string& name, const Arguments& arguments)
    {
        const auto program = end(name, arguments, ">/dev/full", 1);
        EXPECT_THAT(linesOf(program->errors()),
                    ElementsAre(testing::MatchesRegex(name + ": .*: No space left on device")));
        EXPECT_THAT(end(name, arguments, ">&-", 1)->errors(), Not(IsEmpty()));
    }
    /// The reader of standard output has gone before the program writes.
    void expectQuietEnd(const std::string& name, const Arguments& arguments)
    {
        const auto program = startInShell(
            name, arguments,
            "mkfifo \"$HOME.pipe\"; : <\"$HOME.pipe\" & exec 3>\"$HOME.pipe\"; wait", ">&3");
        EXPECT_EQ(program->waitForEnd(), 128 + SIGPIPE) << name;
        EXPECT_THAT(program->errors(), IsEmpty());
        std::remove((path("home") + ".pipe").c_str());
    }
};

} // namespace

TEST_F(StandardStream, OfErrorsThatTakesNoneEndsNoProgram)
{
    for (const char* redirection : {"2>/dev/full", "2>&-"}) {
        for (const char* name : programs) {
            end(name, {"--unheard-of"}, redirection, 2);
            end(name, {"--help"}, redirection, 0);
        }
        end("ventrik-decode", {path("missing.pcap")}, redirection, 1);
        end("ventrik-telephony", {"--replay", path("missing.pcap")}, redirection, 1);
        environment.remove("QT_QPA_PLATFORM");
        end("ventrik", {}, redirection, 1);
    }
}

TEST_F(StandardStream, OfErrorsThatTakesNoneLeavesALogThatIsCopiedThereRunning)
{
    const auto service = startScenario();
    for (const char* redirection : {"2>/dev/full", "2>&-"})
        end("ventrik-watch", {"--once", "--verbose"}, redirection, 0);
}

TEST_F(StandardStream, OfErrorsThatTakesNoneLeavesTheResultAlone)
{
    const std::string file = captureFile();
    for (const char* redirection : {"2>/dev/full", "2>&-", "2>&- <&-"}) {
        const auto program =
            end("ventrik-decode", withResources({"--verbose", "--format", "json", file}),
                redirection, 0);
        EXPECT_THAT(linesOf(program->output()), ElementsAre(HasSubstr("\"packets\": 2")));
    }
}

TEST_F(StandardStream, ThatTakesNoOutputIsTold)
{
    for (const char* name : programs) {
        expectFailureToWrite(name, {"--help"});
        expectFailureToWrite(name, {"--version"});
    }
    expectFailureToWrite("ventrik-decode", withResources({captureFile()}));
    expectFailureToWrite("ventrik-decode", withResources({"--format", "jsonl", captureFile()}));
    const auto service = startScenario();
    expectFailureToWrite("ventrik-watch", {});
}

TEST_F(StandardStream, WhoseReaderHasGoneEndsAProgramQuietly)
{
    for (const char* name : programs)
        expectQuietEnd(name, {"--help"});
    expectQuietEnd("ventrik-decode", withResources({captureFile()}));
    const auto service = startScenario();
    expectQuietEnd("ventrik-watch", {});
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(StandardStream, ThatIsClosedLeavesItsNumberToNoSocket)
{
    const auto service = startScenario();
    const auto watch = startInShell("ventrik-watch", {"--verbose"}, "", "<&- 2>&-");
    EXPECT_TRUE(waitUntil([&] { return watch->prints("Ventrik\n"); }));
    for (const char* number : {"0", "2"})
        EXPECT_EQ(std::filesystem::read_symlink(
                      fmt::format("/proc/{}/fd/{}", watch->processId(), number)),
                  "/dev/null");
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0);
}

TEST_F(StandardStream, WhoseReaderTakesNothingDoesNotKeepAProgramFromItsEnd)
{
    const auto service = startScenario();
    const auto watch = startInShell("ventrik-watch", {}, "", ">" + fullPipe());
    ASSERT_TRUE(waitUntil([&] { return sockets().size() == 3; }));
    waitUntil([] { return false; }, Milliseconds(2500)); // it has a tree to print by now
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0);
}

TEST_F(StandardStream, OfErrorsShowsNothingThatATerminalWouldObey)
{
    const auto program = start("ventrik-decode", {path("a\nb\x1b[2J\xc2\x9b.pcap")});
    EXPECT_EQ(program->waitForEnd(), 1);
    EXPECT_THAT(linesOf(program->errors()), ElementsAre(HasSubstr("a\\nb [2J .pcap")));
}

} // namespace ventrik
