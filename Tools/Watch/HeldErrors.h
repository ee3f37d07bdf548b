#pragma once

#include "Platform/Linux/Socket.h"

namespace ventrik
{

/// Keeps what is written to standard error away from a terminal that shows a screen, and writes the
/// last lines of it to the terminal at the end, a mebibyte at most. Where standard error is no
/// terminal, or another one than standard output, it is left alone.
class HeldErrors
{
  public:
    explicit HeldErrors(int mostLines);
    /// Gives standard error back, and writes what was kept.
    ~HeldErrors();
    HeldErrors(const HeldErrors&) = delete;
    HeldErrors& operator=(const HeldErrors&) = delete;

    /// Lets go of all but the last lines; to be called now and then.
    void trim();
    /// What the end does, for a signal handler too: nothing that could want a lock.
    void release() noexcept;

  private:
    int _mostLines;
    FileDescriptor _kept;     // none: nothing is held
    FileDescriptor _former;   // standard error as it was
    FileDescriptor _terminal; // the same, for writing without waiting
    bool _isReleased = false;
};

} // namespace ventrik
