#include "Tools/Watch/TerminalRescue.h"

#include "Platform/Linux/StandardStreams.h"
#include "Tools/Watch/HeldErrors.h"

#include <array>
#include <atomic>
#include <csignal>

#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr std::array endingSignals{SIGABRT, SIGSEGV, SIGBUS, SIGFPE, SIGILL,
                                   SIGQUIT, SIGTERM, SIGINT, SIGHUP};

// What the handler needs. All of it is made before the handlers are installed.
struct Rescue {
    int terminal = -1;
    termios former = {};
    std::string restoring;
    HeldErrors* errors = nullptr;
    std::array<struct sigaction, endingSignals.size()> actions = {};
};
Rescue rescue;
std::atomic<bool> isWanted = false;
std::atomic<bool> isShown = false;

void restoreAction(int number)
{
    for (std::size_t place = 0; place < endingSignals.size(); ++place)
        if (endingSignals[place] == number)
            sigaction(number, &rescue.actions[place], nullptr);
}

// What the processor raised does so by itself when the handler returns.
bool comesAgain(const siginfo_t& info)
{
    const bool isFault = info.si_signo == SIGSEGV || info.si_signo == SIGBUS ||
                         info.si_signo == SIGFPE || info.si_signo == SIGILL;
    return isFault && info.si_code > 0;
}

void handle(int number, siginfo_t* info, void*)
{
    if (isWanted.exchange(false)) {
        if (isShown.exchange(false)) {
            writeText(rescue.terminal, std::string_view(rescue.restoring), Patience::Brief);
            tcsetattr(STDIN_FILENO, TCSANOW, &rescue.former);
        }
        rescue.errors->release();
    }
    restoreAction(number);
    if (!comesAgain(*info))
        raise(number);
}

// A stack that is full is no place for a handler.
void provideStack()
{
    alignas(16) static std::array<char, std::size_t{64} << 10> stack;
    stack_t present = {};
    if (sigaltstack(nullptr, &present) != 0 || (present.ss_flags & SS_DISABLE) == 0)
        return;
    const stack_t own{stack.data(), 0, stack.size()};
    sigaltstack(&own, nullptr);
}

} // namespace

TerminalRescue::TerminalRescue(int terminal, const termios& former, std::string restoring,
                               HeldErrors& errors)
{
    rescue = {terminal, former, std::move(restoring), &errors, {}};
    isShown = true;
    isWanted = true;
    provideStack();
    struct sigaction action = {};
    action.sa_sigaction = handle;
    action.sa_flags = SA_SIGINFO | SA_ONSTACK;
    for (std::size_t place = 0; place < endingSignals.size(); ++place) {
        sigaction(endingSignals[place], nullptr, &rescue.actions[place]);
        if (rescue.actions[place].sa_handler != SIG_IGN)
            sigaction(endingSignals[place], &action, nullptr);
    }
}

TerminalRescue::~TerminalRescue()
{
    isWanted = false;
    for (const int number : endingSignals)
        restoreAction(number);
}

void TerminalRescue::setShown(bool shown)
{
    isShown = shown;
}

} // namespace ventrik
