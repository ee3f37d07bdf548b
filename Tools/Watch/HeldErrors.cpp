#include "Tools/Watch/HeldErrors.h"

#include "Platform/Linux/StandardStreams.h"
#include "Tools/Watch/TerminalOutput.h"

#include <algorithm>
#include <array>
#include <cerrno>

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr off_t mostBytes = off_t{1} << 20;

bool isTheScreen()
{
    struct stat errors = {};
    struct stat output = {};
    if (!isatty(STDERR_FILENO) || fstat(STDERR_FILENO, &errors) != 0 ||
        fstat(STDOUT_FILENO, &output) != 0)
        return false;
    const dev_t ownTerminal = makedev(5, 0); // /dev/tty, whichever that is
    return errors.st_rdev == output.st_rdev || errors.st_rdev == ownTerminal;
}

// Where the last lines of a file begin.
off_t startOfLastLines(int file, off_t end, int mostLines)
{
    std::array<char, 4096> part{};
    const off_t limit = std::max<off_t>(0, end - mostBytes);
    int lines = 0;
    for (off_t start = end; start > limit;) {
        const off_t size = std::min<off_t>(part.size(), start - limit);
        start -= size;
        if (pread(file, part.data(), static_cast<std::size_t>(size), start) != size)
            return start + size;
        for (off_t place = size; place-- > 0;)
            if (part[static_cast<std::size_t>(place)] == '\n' && lines++ == mostLines)
                return start + place + 1;
    }
    return limit;
}

void copy(int file, off_t start, off_t end, int target)
{
    std::array<char, 4096> part{};
    while (start < end) {
        const auto size = static_cast<std::size_t>(std::min<off_t>(part.size(), end - start));
        const ssize_t got = pread(file, part.data(), size, start);
        if (got <= 0 ||
            !writeText(target, std::string_view(part.data(), std::size_t(got)), Patience::Brief))
            return;
        start += got;
    }
}

} // namespace

HeldErrors::HeldErrors(int mostLines) : _mostLines(mostLines)
{
    if (!isTheScreen())
        return;
    FileDescriptor kept(memfd_create("ventrik-errors", MFD_CLOEXEC));
    FileDescriptor former(fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
    FileDescriptor terminal = openedAnew(STDERR_FILENO);
    // Each line goes to the end, whoever writes it.
    if (!kept.isOpen() || !former.isOpen() || !terminal.isOpen() ||
        fcntl(kept.get(), F_SETFL, O_APPEND) != 0 || dup2(kept.get(), STDERR_FILENO) < 0)
        return;
    _kept = std::move(kept);
    _former = std::move(former);
    _terminal = std::move(terminal);
}

HeldErrors::~HeldErrors()
{
    release();
}

void HeldErrors::trim()
{
    struct stat status = {};
    if (!_kept.isOpen() || fstat(_kept.get(), &status) != 0)
        return;
    // The line break before them stays: it tells the next look where they begin.
    const off_t dropped = startOfLastLines(_kept.get(), status.st_size, _mostLines) - 1;
    if (dropped > 0)
        fallocate(_kept.get(), FALLOC_FL_PUNCH_HOLE | FALLOC_FL_KEEP_SIZE, 0, dropped);
}

void HeldErrors::release() noexcept
{
    struct stat status = {};
    if (_isReleased || !_kept.isOpen() || fstat(_kept.get(), &status) != 0)
        return;
    _isReleased = true;
    dup2(_former.get(), STDERR_FILENO);
    copy(_kept.get(), startOfLastLines(_kept.get(), status.st_size, _mostLines), status.st_size,
         _terminal.get());
}

} // namespace ventrik
