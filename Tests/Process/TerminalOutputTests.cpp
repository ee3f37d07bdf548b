#include "Tests/Process/Program.h"
#include "Tools/Watch/HeldErrors.h"
#include "Tools/Watch/TerminalOutput.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <atomic>
#include <thread>

#include <fcntl.h>
#include <fmt/format.h>
#include <pty.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

using testing::EndsWith;
using testing::StartsWith;

/// A terminal whose other side the test has.
class PseudoTerminal : public testing::Test
{
  protected:
    PseudoTerminal()
    {
        int master = -1;
        int slave = -1;
        EXPECT_EQ(openpty(&master, &slave, nullptr, nullptr, nullptr), 0);
        user = FileDescriptor(master);
        program = FileDescriptor(slave);
        fcntl(master, F_SETFL, O_NONBLOCK);
        termios modes = {};
        tcgetattr(slave, &modes);
        cfmakeraw(&modes);
        tcsetattr(slave, TCSANOW, &modes);
    }
    /// Takes what has come to the user.
    void read()
    {
        std::array<char, 4096> part{};
        for (ssize_t size = 0; (size = ::read(user.get(), part.data(), part.size())) > 0;)
            seen.append(part.data(), static_cast<std::size_t>(size));
    }

    FileDescriptor user;
    FileDescriptor program;
    std::string seen;
};

class TerminalOutputTest : public PseudoTerminal
{
  protected:
    int taken = 0;
    TerminalOutput output{program.get(), [this] { ++taken; }};
};

/// Standard output and standard error are that terminal meanwhile.
class HeldErrorsTest : public PseudoTerminal
{
  protected:
    HeldErrorsTest()
    {
        std::fflush(stdout);
        dup2(program.get(), STDOUT_FILENO);
        dup2(program.get(), STDERR_FILENO);
    }
    ~HeldErrorsTest() override
    {
        dup2(formerOutput.get(), STDOUT_FILENO);
        dup2(formerErrors.get(), STDERR_FILENO);
    }
    static void writeLines(int first, int last)
    {
        for (int line = first; line <= last; ++line)
            dprintf(STDERR_FILENO, "line %d\n", line);
    }
    /// Ends the holding while somebody reads.
    void release(std::optional<HeldErrors>& held)
    {
        std::atomic<bool> isOver = false;
        std::thread reader([&] {
            while (!isOver)
                read();
        });
        held.reset();
        isOver = true;
        reader.join();
        read();
    }

    FileDescriptor formerOutput{dup(STDOUT_FILENO)};
    FileDescriptor formerErrors{dup(STDERR_FILENO)};
};

} // namespace

TEST_F(TerminalOutputTest, WritesAtOnceWhatIsTaken)
{
    output.add("some text");
    EXPECT_TRUE(output.isIdle());
    read();
    EXPECT_EQ(seen, "some text");
    EXPECT_EQ(taken, 0);
}

TEST_F(TerminalOutputTest, DoesNotWaitForATerminalThatTakesNothing)
{
    const std::string much(1'000'000, 'x');
    output.add(much);
    EXPECT_FALSE(output.isIdle());
    output.add("end");
    EXPECT_TRUE(waitUntil([&] {
        read();
        return seen.size() == much.size() + 3;
    }));
    EXPECT_THAT(seen, EndsWith("xend"));
    EXPECT_TRUE(waitUntil([&] { return taken == 1; }));
    EXPECT_TRUE(output.isIdle());
}

TEST_F(TerminalOutputTest, DropsAtTheEndWhatIsNotTaken)
{
    output.add(std::string(1'000'000, 'x'));
    output.finish();
    EXPECT_TRUE(output.isIdle());
    read();
    EXPECT_LT(seen.size(), 100'000U);
}

TEST_F(TerminalOutputTest, IsIdleWhenTheTerminalHasGone)
{
    user = FileDescriptor();
    output.add("text");
    EXPECT_TRUE(output.isIdle());
}

TEST_F(HeldErrorsTest, KeepStandardErrorAndGiveTheLastThousandLines)
{
    std::optional<HeldErrors> held(std::in_place, 1000);
    writeLines(1, 2500);
    read();
    EXPECT_EQ(seen, "");
    release(held);
    EXPECT_THAT(seen, StartsWith("line 1501\nline 1502\n"));
    EXPECT_THAT(seen, EndsWith("line 2500\n"));
    dprintf(STDERR_FILENO, "later\n");
    read();
    EXPECT_THAT(seen, EndsWith("line 2500\nlater\n"));
}

TEST_F(HeldErrorsTest, AFewLinesComeWhole)
{
    std::optional<HeldErrors> held(std::in_place, 1000);
    writeLines(1, 2);
    dprintf(STDERR_FILENO, "no end");
    held->trim();
    release(held);
    EXPECT_EQ(seen, "line 1\nline 2\nno end");
}

TEST_F(HeldErrorsTest, TakeNoMoreMemoryThanTheirLastLines)
{
    std::optional<HeldErrors> held(std::in_place, 1000);
    const std::string line(1000, 'x');
    for (int count = 0; count < 20'000; ++count)
        dprintf(STDERR_FILENO, "%s\n", line.c_str());
    held->trim();
    struct stat status = {};
    fstat(STDERR_FILENO, &status);
    EXPECT_LT(status.st_blocks * 512, 1'100'000);
    release(held);
    EXPECT_EQ(seen.size(), 1'001'000U);
}

TEST_F(HeldErrorsTest, OfLongLinesTheLastMebibyteComes)
{
    std::optional<HeldErrors> held(std::in_place, 1000);
    const std::string line(3 << 20, 'x');
    dprintf(STDERR_FILENO, "%s\n", line.c_str());
    release(held);
    EXPECT_EQ(seen.size(), std::size_t{1} << 20);
}

TEST_F(HeldErrorsTest, GiveUpOnATerminalThatTakesNothing)
{
    std::optional<HeldErrors> held(std::in_place, 1000);
    const std::string line(1000, 'x');
    for (int count = 0; count < 1000; ++count)
        dprintf(STDERR_FILENO, "%s\n", line.c_str());
    held.reset(); // comes back although nobody reads
    read();
    EXPECT_THAT(seen, StartsWith("xxx"));
    EXPECT_LT(seen.size(), 100'000U);
}

TEST_F(HeldErrorsTest, LeaveAloneWhatGoesElsewhere)
{
    const FileDescriptor file(memfd_create("errors", MFD_CLOEXEC));
    dup2(file.get(), STDERR_FILENO);
    std::optional<HeldErrors> held(std::in_place, 1000);
    writeLines(1, 1);
    struct stat status = {};
    fstat(file.get(), &status);
    EXPECT_EQ(status.st_size, 7);
    release(held);
    EXPECT_EQ(seen, "");
}

} // namespace ventrik
