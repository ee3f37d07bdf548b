#pragma once

#include <functional>
#include <memory>

class QSocketNotifier;

namespace ventrik
{

/// SIGTERM, SIGINT and SIGHUP as calls on the main queue, so that a program can end in its own
/// order. A second signal of these while the first is being handled ends the process at once.
///
/// The signals are blocked for the process meanwhile. Where a library starts threads before this
/// can be made, `block` must come before them: a thread that takes a signal ends the process.
class TerminationSignals
{
  public:
    static void block();

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
