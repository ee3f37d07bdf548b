#include "Tools/OwnDirectory.h"

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <thread>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

// Whoever is still ending may put or take a file in between, which makes a removal fail.
void removeAll(const std::string& path)
{
    using namespace std::chrono_literals;
    constexpr int attempts = 100;
    std::error_code ignored;
    for (int attempt = 0; attempt < attempts; ++attempt) {
        std::filesystem::remove_all(path, ignored);
        if (!std::filesystem::exists(path, ignored))
            return;
        std::this_thread::sleep_for(10ms);
    }
}

void closeStandardStreams()
{
    const int null = open("/dev/null", O_RDWR);
    for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO})
        dup2(null, descriptor);
}

// What ends the other process by a signal to the whole group must not end this one.
[[noreturn]] void keep(const std::string& path, int lifeline)
{
    for (const int number : {SIGTERM, SIGINT, SIGHUP, SIGQUIT})
        std::signal(number, SIG_IGN);
    closeStandardStreams();
    char byte = 0;
    while (read(lifeline, &byte, 1) == -1 && errno == EINTR) {
    }
    removeAll(path);
    _exit(EXIT_SUCCESS);
}

} // namespace

OwnDirectory::OwnDirectory()
{
    if (!make() || !startKeeper())
        fail();
}

bool OwnDirectory::make()
{
    std::error_code error;
    const auto temporary = std::filesystem::temp_directory_path(error);
    std::string name = (error ? "/tmp" : temporary) / "ventrik-XXXXXX";
    if (mkdtemp(name.data()) == nullptr)
        return false;
    _path = name;
    return true;
}

bool OwnDirectory::startKeeper()
{
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) == -1)
        return false;
    _lifeline = ends[1];
    _keeper = fork();
    if (_keeper == 0) {
        close(ends[1]);
        keep(_path, ends[0]);
    }
    close(ends[0]);
    return _keeper != -1;
}

void OwnDirectory::fail()
{
    _error = std::strerror(errno);
    removeAll(_path);
    _path.clear();
}

OwnDirectory::~OwnDirectory()
{
    if (_lifeline != -1)
        close(_lifeline);
    if (_keeper > 0)
        waitpid(_keeper, nullptr, 0);
}

} // namespace ventrik
