#include "Platform/Linux/TerminationSignals.h"

#include <atomic>
#include <chrono>
#include <csignal>
#include <system_error>
#include <thread>

#include <QSocketNotifier>

#include <sys/signalfd.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

std::atomic<bool> received = false;

bool isIgnored(int number)
{
    struct sigaction action = {};
    return sigaction(number, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

sigset_t signalsNotIgnored()
{
    sigset_t signals;
    sigemptyset(&signals);
    for (const int number : {SIGTERM, SIGINT, SIGHUP})
        if (!isIgnored(number))
            sigaddset(&signals, number);
    return signals;
}

const sigset_t& terminationSignals()
{
    static const sigset_t signals = signalsNotIgnored();
    return signals;
}

void unblock()
{
    pthread_sigmask(SIG_UNBLOCK, &terminationSignals(), nullptr);
}

// From here on the signals have their usual effect.
void endOnSignal()
{
    constexpr timespec atOnce{};
    while (sigtimedwait(&terminationSignals(), nullptr, &atOnce) > 0) {
    }
    int number = -1;
    while (number == -1)
        number = sigwaitinfo(&terminationSignals(), nullptr);
    unblock();
    raise(number);
}

// In a thread, because the orderly end may itself be what does not come to an end.
void endOnLaterSignal()
{
    try {
        std::thread([] {
            std::this_thread::sleep_for(std::chrono::seconds(1));
            endOnSignal();
        }).detach();
    } catch (const std::system_error&) {
        unblock();
    }
}

} // namespace

void TerminationSignals::block()
{
    pthread_sigmask(SIG_BLOCK, &terminationSignals(), nullptr);
}

bool TerminationSignals::haveCome()
{
    sigset_t pending;
    sigemptyset(&pending);
    sigpending(&pending);
    for (const int number : {SIGTERM, SIGINT, SIGHUP})
        if (sigismember(&pending, number) == 1 && sigismember(&terminationSignals(), number) == 1)
            return true;
    return received;
}

TerminationSignals::TerminationSignals(std::function<void()> terminate)
    : _terminate(std::move(terminate))
{
    block();
    _descriptor = signalfd(-1, &terminationSignals(), SFD_CLOEXEC | SFD_NONBLOCK);
    _notifier = std::make_unique<QSocketNotifier>(_descriptor, QSocketNotifier::Read);
    QObject::connect(_notifier.get(), &QSocketNotifier::activated, [this] { receive(); });
}

TerminationSignals::~TerminationSignals()
{
    _notifier.reset();
    close(_descriptor);
    if (!received)
        unblock();
}

void TerminationSignals::receive()
{
    signalfd_siginfo info{};
    if (read(_descriptor, &info, sizeof info) != static_cast<ssize_t>(sizeof info))
        return;
    _notifier->setEnabled(false);
    received = true;
    endOnLaterSignal();
    _terminate();
}

} // namespace ventrik
