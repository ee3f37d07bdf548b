#pragma once

#include "Tests/Process/Program.h"

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// A terminal with a shell in it, and somebody at it. It is a multiplexer's, with a socket of its
/// own, and goes with the object.
class Terminal
{
  public:
    /// `directory` is the test's own. Waits for the shell.
    Terminal(const std::string& directory, const QProcessEnvironment& environment, int columns = 80,
             int lines = 24);

    /// A line for the shell.
    void run(const std::string& command);
    /// Keys by their names, as "Enter", "C-c", "Down", or texts.
    void press(const std::vector<std::string>& keys);
    void resize(int columns, int lines);
    /// The terminal goes away while programs use it.
    void hangUp();

    /// What shows now, a line each, without the blanks at their ends.
    std::string screen();
    /// With what has gone out at the top.
    std::string history();
    /// What shows with the sequences that give texts their looks.
    std::string styledScreen();
    /// Whether the text comes to show, or comes to be gone, within the patience of tests.
    bool shows(const std::string& text);
    bool hides(const std::string& text);
    /// Whether a full screen's program has the terminal, and whether the cursor is to be seen.
    bool isOnOtherScreen();
    bool showsCursor();

  private:
    std::string ask(const std::vector<std::string>& command);

    std::string _socket;
    QProcessEnvironment _environment;
    std::unique_ptr<Program> _server;
};

} // namespace ventrik
