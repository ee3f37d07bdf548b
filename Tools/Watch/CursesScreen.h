#pragma once

#include "Tools/Watch/HeldErrors.h"
#include "Tools/Watch/TerminalOutput.h"
#include "Tools/Watch/TerminalRescue.h"
#include "Tools/Watch/WatchFrame.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <termios.h>

namespace ventrik
{

/// The terminal that standard input and output are, as a screen. It is given back as it was when
/// this goes, and also when the process dies. Nothing but this writes to it meanwhile: what goes to
/// standard error is kept and comes at the end.
class CursesScreen
{
  public:
    /// Throws std::runtime_error, with the reason in one line, where the terminal cannot be a
    /// screen; nothing has happened to it then. `ready` is called on the main queue
    /// when a screen can be drawn again after `canDraw` was false. So many lines of standard error
    /// are kept for the end.
    CursesScreen(int mostErrorLines, std::function<void()> ready);
    ~CursesScreen();
    CursesScreen(const CursesScreen&) = delete;
    CursesScreen& operator=(const CursesScreen&) = delete;

    ScreenSize size() const;
    /// False while the terminal has not taken the last drawing.
    bool canDraw() const { return _output.isIdle(); }
    void draw(const WatchFrame& frame);
    /// The next drawing draws all anew.
    void redrawAll();

    /// Keys that have come; some at most, others at the next call.
    std::vector<KeyPress> readKeys();
    /// Nobody is at the terminal any more.
    bool hasEnded() const;

    /// Gives the terminal back for a while, and takes it again, whatever was done to it.
    void leave();
    void enter();
    HeldErrors& errors() { return _errors; }

  private:
    struct Curses;

    void send();
    void sizeUp();

    HeldErrors _errors;
    TerminalOutput _output;
    termios _former = {};
    termios _own = {};
    std::unique_ptr<Curses> _curses;
    std::optional<TerminalRescue> _rescue;
    std::optional<WatchFrame> _drawn;
    bool _isShown = true;
};

} // namespace ventrik
