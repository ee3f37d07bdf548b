#include "Tests/Process/EmulatedPhone.h"

#include "Capture/HdlcFrames.h"
#include "Platform/Linux/Socket.h"
#include "Tests/Process/Program.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <filesystem>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <termios.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

// What is on its way before the other side has set up its end must not come back to us.
void switchOffEcho(int terminal)
{
    termios settings{};
    EXPECT_EQ(tcgetattr(terminal, &settings), 0);
    cfmakeraw(&settings);
    EXPECT_EQ(tcsetattr(terminal, TCSANOW, &settings), 0);
}

} // namespace

EmulatedPhone::EmulatedPhone(const std::string& link)
    : _master(posix_openpt(O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC))
{
    std::array<char, 64> name{};
    EXPECT_EQ(grantpt(_master), 0);
    EXPECT_EQ(unlockpt(_master), 0);
    EXPECT_EQ(ptsname_r(_master, name.data(), name.size()), 0);
    switchOffEcho(_master);
    std::filesystem::remove(link);
    std::filesystem::create_symlink(name.data(), link);
}

EmulatedPhone::~EmulatedPhone()
{
    close(_master);
}

bool EmulatedPhone::send(ByteView bytes)
{
    const Deadline deadline(patience);
    while (!bytes.empty() && waitForSocket(_master, POLLOUT, deadline)) {
        const ssize_t count = write(_master, bytes.data(), bytes.size());
        if (count < 0 && errno != EAGAIN)
            break;
        bytes = bytes.subspan(static_cast<std::size_t>(std::max<ssize_t>(count, 0)));
    }
    return bytes.empty();
}

const std::vector<Bytes>& EmulatedPhone::commands()
{
    receive();
    FrameAssembler assembler;
    ByteView rest = _received;
    _commands.clear();
    while (!rest.empty()) {
        rest = rest.subspan(assembler.take(rest));
        if (const auto frame = assembler.frame())
            _commands.emplace_back(frame->content.begin(), frame->content.end());
    }
    return _commands;
}

void EmulatedPhone::receive()
{
    std::array<std::uint8_t, 4096> block{};
    for (ssize_t count = 0; (count = read(_master, block.data(), block.size())) > 0;)
        _received.insert(_received.end(), block.begin(), block.begin() + count);
}

} // namespace ventrik
