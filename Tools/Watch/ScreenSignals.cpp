#include "Tools/Watch/ScreenSignals.h"

#include <csignal>

#include <QSocketNotifier>

#include <sys/signalfd.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

bool isIgnored(int number)
{
    struct sigaction action = {};
    return sigaction(number, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

sigset_t screenSignals()
{
    sigset_t handled;
    sigemptyset(&handled);
    for (const int number : {SIGWINCH, SIGTSTP, SIGCONT})
        if (!isIgnored(number))
            sigaddset(&handled, number);
    return handled;
}

const sigset_t& handledSignals()
{
    static const sigset_t set = screenSignals();
    return set;
}

} // namespace

ScreenSignals::ScreenSignals(Handlers handlers) : _handlers(std::move(handlers))
{
    pthread_sigmask(SIG_BLOCK, &handledSignals(), nullptr);
    _descriptor = signalfd(-1, &handledSignals(), SFD_CLOEXEC | SFD_NONBLOCK);
    _notifier = std::make_unique<QSocketNotifier>(_descriptor, QSocketNotifier::Read);
    QObject::connect(_notifier.get(), &QSocketNotifier::activated, [this] { receive(); });
}

// What is still to come finds no screen any more: it does what it does to any program.
ScreenSignals::~ScreenSignals()
{
    _notifier.reset();
    close(_descriptor);
    pthread_sigmask(SIG_UNBLOCK, &handledSignals(), nullptr);
}

void ScreenSignals::receive()
{
    signalfd_siginfo info{};
    while (read(_descriptor, &info, sizeof info) == static_cast<ssize_t>(sizeof info)) {
        if (info.ssi_signo == SIGWINCH)
            _handlers.resized();
        else if (info.ssi_signo == SIGCONT)
            _handlers.goingOn();
        else
            stop();
    }
}

// The system itself stops the process, so that whoever waits for it learns of it. Where nobody
// could let it go on, nothing happens.
void ScreenSignals::stop()
{
    _handlers.stopping();
    sigset_t stopSignal;
    sigemptyset(&stopSignal);
    sigaddset(&stopSignal, SIGTSTP);
    raise(SIGTSTP);
    pthread_sigmask(SIG_UNBLOCK, &stopSignal, nullptr);
    pthread_sigmask(SIG_BLOCK, &stopSignal, nullptr);
    _handlers.goingOn();
}

} // namespace ventrik
