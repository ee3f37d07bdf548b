#pragma once

#include "Platform/Linux/Socket.h"

#include <functional>
#include <memory>
#include <string>

namespace ventrik
{

/// A terminal opened anew, so that writing does not wait: whether it does is a matter of the open
/// file, which others share with us. A terminal of another user cannot be opened; its descriptor is
/// copied, and may make us wait.
FileDescriptor openedAnew(int terminal);

/// Writes to a terminal without waiting for it: one that takes nothing (Ctrl+S, a stuck connection)
/// holds up neither the service's messages nor the end of the program.
class TerminalOutput
{
  public:
    /// `taken` is called on the main queue when all has been taken that had to wait.
    TerminalOutput(int terminal, std::function<void()> taken);

    void add(std::string_view bytes);
    bool isIdle() const { return _waiting.empty(); }
    /// Waits half a second at most; what is not taken by then is dropped.
    void finish();
    int descriptor() const { return _terminal.get(); }

  private:
    void write();

    FileDescriptor _terminal;
    std::string _waiting;
    std::function<void()> _taken;
    std::unique_ptr<QSocketNotifier> _notifier;
};

} // namespace ventrik
