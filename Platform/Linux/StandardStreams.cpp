#include "Platform/Linux/StandardStreams.h"

#include "PropertyList/TerminalText.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include <fcntl.h>
#include <fmt/format.h>
#include <poll.h>
#include <stdio_ext.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

// At the end the library writes what is left, however long that takes.
void dropWhatNobodyTakes()
{
    constexpr int longestWait = 500; // milliseconds
    pollfd place{STDOUT_FILENO, POLLOUT, 0};
    if (__fpending(stdout) > 0 && poll(&place, 1, longestWait) == 0)
        __fpurge(stdout);
}

} // namespace

void prepareStandardStreams()
{
    std::signal(SIGPIPE, SIG_IGN);
    for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        // The lowest number that is free is the one to be opened: those below are open by now.
        if (fcntl(descriptor, F_GETFD) == -1)
            open("/dev/null", descriptor == STDIN_FILENO ? O_WRONLY : O_RDONLY);
    }
    std::setvbuf(stdout, nullptr, _IOFBF, BUFSIZ);
    std::atexit(dropWhatNobodyTakes);
}

bool writeText(int descriptor, std::string_view& text, Patience patience)
{
    // A pipe that is ready takes so much without making us wait.
    constexpr std::size_t largestPart = PIPE_BUF;
    const int longestWait = patience == Patience::Brief ? 1000 : -1; // milliseconds
    while (!text.empty()) {
        pollfd place{descriptor, POLLOUT, 0};
        const int ready = poll(&place, 1, longestWait);
        if (ready == 0) {
            errno = EAGAIN;
            return false;
        }
        const ssize_t written =
            ready < 0 ? -1 : write(descriptor, text.data(), std::min(text.size(), largestPart));
        if (written >= 0)
            text.remove_prefix(static_cast<std::size_t>(written));
        else if (errno != EINTR && errno != EAGAIN)
            return false;
    }
    return true;
}

void complain(std::string_view program, std::string_view reason, Patience patience)
{
    std::string line(program);
    line += ": ";
    line += terminalLine(reason);
    line += '\n';
    writeText(STDERR_FILENO, std::string_view(line), patience);
}

int takeStandardOutput(OthersOutput others)
{
    const int descriptor = dup(STDOUT_FILENO);
    dup2(others == OthersOutput::ToStandardError ? STDERR_FILENO : open("/dev/null", O_WRONLY),
         STDOUT_FILENO);
    std::setvbuf(stdout, nullptr, _IOLBF, BUFSIZ); // so that it comes in its place
    return descriptor;
}

int tellOutputFailure(std::string_view program, std::string_view what, int error)
{
    if (error == EPIPE)
        return 128 + SIGPIPE;
    complain(program, fmt::format("{}: {}", what, std::strerror(error)));
    return EXIT_FAILURE;
}

} // namespace ventrik
