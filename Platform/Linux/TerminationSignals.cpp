#include "Platform/Linux/TerminationSignals.h"

#include <csignal>

#include <QSocketNotifier>

#include <sys/signalfd.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

sigset_t terminationSignals()
{
    sigset_t signals;
    sigemptyset(&signals);
    for (const int number : {SIGTERM, SIGINT, SIGHUP})
        sigaddset(&signals, number);
    return signals;
}

} // namespace

void TerminationSignals::block()
{
    const sigset_t signals = terminationSignals();
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
}

TerminationSignals::TerminationSignals(std::function<void()> terminate)
    : _terminate(std::move(terminate))
{
    block();
    const sigset_t signals = terminationSignals();
    _descriptor = signalfd(-1, &signals, SFD_CLOEXEC | SFD_NONBLOCK);
    _notifier = std::make_unique<QSocketNotifier>(_descriptor, QSocketNotifier::Read);
    QObject::connect(_notifier.get(), &QSocketNotifier::activated, [this] { receive(); });
}

TerminationSignals::~TerminationSignals()
{
    _notifier.reset();
    close(_descriptor);
    const sigset_t signals = terminationSignals();
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
}

void TerminationSignals::receive()
{
    signalfd_siginfo info{};
    if (read(_descriptor, &info, sizeof info) != static_cast<ssize_t>(sizeof info))
        return;
    // From here on the signals have their usual effect again.
    const sigset_t signals = terminationSignals();
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
    _terminate();
}

} // namespace ventrik
