#include "Tests/Process/Terminal.h"

#include <fstream>

#include <gtest/gtest.h>

namespace ventrik
{

Terminal::Terminal(const std::string& directory, const QProcessEnvironment& environment,
                   int columns, int lines)
    : _socket(directory + "/terminal"), _environment(environment)
{
    _environment.insert("LC_ALL", "C.UTF-8");
    _environment.remove("TMUX");
    const std::string startup = directory + "/terminal-startup";
    std::ofstream(startup) << "PS1='shell: '\n";
    // In the foreground, so that it goes with the test.
    _server = std::make_unique<Program>(
        "/usr/bin/tmux", std::vector<std::string>{"-u", "-D", "-S", _socket, "-f", "/dev/null"},
        _environment);
    EXPECT_TRUE(waitUntil([&] {
        return !ask({"new-session", "-d", "-P", "-x", std::to_string(columns), "-y",
                     std::to_string(lines), "bash --rcfile " + startup + " -i"})
                    .empty();
    }));
    EXPECT_TRUE(shows("shell:"));
}

std::string Terminal::ask(const std::vector<std::string>& command)
{
    // The server is ours alone to start.
    QStringList arguments{"-N", "-u", "-S", QString::fromStdString(_socket)};
    for (const std::string& word : command)
        arguments.append(QString::fromStdString(word));
    QProcess client;
    client.setProcessEnvironment(_environment);
    client.start("/usr/bin/tmux", arguments);
    client.waitForFinished();
    return client.readAllStandardOutput().toStdString();
}

void Terminal::run(const std::string& command)
{
    ask({"send-keys", "-l", command});
    press({"Enter"});
}

void Terminal::press(const std::vector<std::string>& keys)
{
    std::vector<std::string> command{"send-keys"};
    command.insert(command.end(), keys.begin(), keys.end());
    ask(command);
}

void Terminal::resize(int columns, int lines)
{
    ask({"resize-window", "-x", std::to_string(columns), "-y", std::to_string(lines)});
}

void Terminal::hangUp()
{
    ask({"kill-session"});
}

std::string Terminal::screen()
{
    return ask({"capture-pane", "-p"});
}

std::string Terminal::history()
{
    return ask({"capture-pane", "-p", "-S", "-"});
}

std::string Terminal::styledScreen()
{
    return ask({"capture-pane", "-p", "-e"});
}

bool Terminal::shows(const std::string& text)
{
    const bool isShown = waitUntil([&] { return screen().find(text) != std::string::npos; });
    EXPECT_TRUE(isShown) << text << " does not come to show in\n" << screen();
    return isShown;
}

bool Terminal::hides(const std::string& text)
{
    const bool isHidden = waitUntil([&] { return screen().find(text) == std::string::npos; });
    EXPECT_TRUE(isHidden) << text << " stays in\n" << screen();
    return isHidden;
}

bool Terminal::isOnOtherScreen()
{
    return ask({"display-message", "-p", "#{alternate_on}"}) == "1\n";
}

bool Terminal::showsCursor()
{
    return ask({"display-message", "-p", "#{cursor_flag}"}) == "1\n";
}

} // namespace ventrik
