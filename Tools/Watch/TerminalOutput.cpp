#include "Tools/Watch/TerminalOutput.h"

#include <cerrno>

#include <fcntl.h>
#include <fmt/format.h>
#include <poll.h>
#include <unistd.h>

namespace ventrik
{

FileDescriptor openedAnew(int terminal)
{
    const std::string name = fmt::format("/proc/self/fd/{}", terminal);
    FileDescriptor own(open(name.c_str(), O_WRONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
    return own.isOpen() ? std::move(own)
                        : FileDescriptor(fcntl(terminal, F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
}

TerminalOutput::TerminalOutput(int terminal, std::function<void()> taken)
    : _terminal(openedAnew(terminal)),
      _taken(std::move(taken)),
      _notifier(std::make_unique<QSocketNotifier>(_terminal.get(), QSocketNotifier::Write))
{
    _notifier->setEnabled(false);
    QObject::connect(_notifier.get(), &QSocketNotifier::activated, [this] {
        write();
        if (isIdle())
            _taken();
    });
}

void TerminalOutput::add(std::string_view bytes)
{
    _waiting += bytes;
    write();
}

void TerminalOutput::write()
{
    while (!_waiting.empty()) {
        const ssize_t written = ::write(_terminal.get(), _waiting.data(), _waiting.size());
        if (written > 0)
            _waiting.erase(0, static_cast<std::size_t>(written));
        else if (written < 0 && errno == EAGAIN)
            break;
        else if (written == 0 || errno != EINTR)
            _waiting.clear(); // the terminal has gone
    }
    _notifier->setEnabled(!_waiting.empty());
}

void TerminalOutput::finish()
{
    constexpr int longestWait = 500; // milliseconds
    const auto end = std::chrono::steady_clock::now() + std::chrono::milliseconds(longestWait);
    pollfd place{_terminal.get(), POLLOUT, 0};
    while (!_waiting.empty() && std::chrono::steady_clock::now() < end &&
           poll(&place, 1, longestWait) > 0)
        write();
    _waiting.clear();
    _notifier->setEnabled(false);
}

} // namespace ventrik
