#pragma once

#include <functional>
#include <memory>

class QSocketNotifier;

namespace ventrik
{

/// SIGTERM, SIGINT and SIGHUP as a call on the main queue, so that a program can end in its own
/// order. Those that follow the first within a second belong to it: a session's end sends several.
/// A later one ends the process at once. A signal that the process was started to ignore, as by
/// nohup, stays ignored.
///
/// The signals are blocked for the process meanwhile, and after the first one to its end. Where a
/// library starts threads before this can be made, `block` must come before them: a thread that
/// takes a signal ends the process.
class TerminationSignals
{
  public:
    static void block();
    /// Has the process been asked to end, even if the call is still to come?
    static bool haveCome();

    explicit TerminationSignals(std::function<void()> terminate);
    ~TerminationSignals();
    TerminationSignals(const TerminationSignals&) = delete;
    TerminationSignals& operator=(const TerminationSignals&) = delete;

  private:
    void receive();

    std::function<void()> _terminate;
    int _descriptor;
    std::unique_ptr<QSocketNotifier> _notifier;
};

} // namespace ventrik
