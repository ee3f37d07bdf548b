#pragma once

#include <string>

#include <termios.h>

namespace ventrik
{

class HeldErrors;

/// Gives the terminal back as it was when a signal ends the process on the way: a crash, a failed
/// assertion, or a wish to end that the main loop did not come to. What was held of standard error
/// is written then too. One at a time exists.
class TerminalRescue
{
  public:
    /// The signals get their handlers, except those that are ignored. `restoring` is what the
    /// terminal is sent. Descriptor and errors outlive this.
    TerminalRescue(int terminal, const termios& former, std::string restoring, HeldErrors& errors);
    /// The signals have their former effect again.
    ~TerminalRescue();
    TerminalRescue(const TerminalRescue&) = delete;
    TerminalRescue& operator=(const TerminalRescue&) = delete;

    /// Whether there is a screen to be taken away; at first there is.
    void setShown(bool isShown);
};

} // namespace ventrik
