#include "Tests/Process/Program.h"

#include <algorithm>
#include <csignal>
#include <fstream>
#include <sstream>

#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

#include <fmt/format.h>
#include <gtest/gtest.h>
#include <sys/prctl.h>

namespace ventrik
{

bool waitUntil(const std::function<bool()>& condition, Milliseconds timeout)
{
    if (condition())
        return true;
    QEventLoop loop;
    QElapsedTimer elapsed;
    elapsed.start();
    bool holds = false;
    QTimer poll;
    poll.setTimerType(Qt::PreciseTimer);
    QObject::connect(&poll, &QTimer::timeout, [&] {
        holds = condition();
        if (holds || elapsed.elapsed() > timeout.count())
            loop.quit();
    });
    poll.start(Milliseconds(10));
    loop.exec();
    return holds;
}

std::vector<std::string> linesOf(const std::string& text)
{
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

std::string withoutAddresses(const std::string& text)
{
    std::string result;
    std::size_t end = 0;
    for (auto at = text.find("0x"); at != std::string::npos; at = text.find("0x", end)) {
        result += text.substr(end, at - end) + "%p";
        end = std::min(text.find_first_not_of("0123456789abcdef", at + 2), text.size());
    }
    return result + text.substr(end);
}

Program::Program(const std::string& path, const std::vector<std::string>& arguments,
                 const QProcessEnvironment& environment, Output output)
{
    QObject::connect(&_process, &QProcess::readyReadStandardOutput,
                     [this] { _output += _process.readAllStandardOutput().toStdString(); });
    QObject::connect(&_process, &QProcess::readyReadStandardError,
                     [this] { _errors += _process.readAllStandardError().toStdString(); });
    QStringList list;
    for (const std::string& argument : arguments)
        list.append(QString::fromStdString(argument));
    _process.setProcessEnvironment(environment);
    // A test that is killed leaves no processes behind.
    _process.setChildProcessModifier([] { prctl(PR_SET_PDEATHSIG, SIGKILL); });
    if (output == Output::Discarded)
        _process.setStandardOutputFile(QProcess::nullDevice());
    _process.start(QString::fromStdString(path), list);
    EXPECT_TRUE(_process.waitForStarted()) << path;
    _processId = static_cast<pid_t>(_process.processId());
}

Program::~Program()
{
    _process.disconnect();
    if (isRunning()) {
        _process.kill();
        _process.waitForFinished();
    }
}

void Program::send(int signal) const
{
    ASSERT_TRUE(isRunning());
    EXPECT_EQ(::kill(_processId, signal), 0);
}

void Program::kill()
{
    send(SIGKILL);
    EXPECT_EQ(waitForEnd(), 128 + SIGKILL);
}

void Program::write(ByteView input)
{
    const std::string bytes(input.begin(), input.end());
    _process.write(bytes.data(), static_cast<qint64>(bytes.size()));
}

std::optional<int> Program::waitForEnd(Milliseconds timeout)
{
    if (!waitUntil([this] { return !isRunning(); }, timeout))
        return std::nullopt;
    const bool wasKilled = _process.exitStatus() == QProcess::CrashExit;
    return wasKilled ? 128 + _process.exitCode() : _process.exitCode();
}

std::string Program::statusField(const std::string& name) const
{
    std::ifstream status(fmt::format("/proc/{}/status", _processId));
    for (std::string line; std::getline(status, line);)
        if (line.starts_with(name + ":"))
            return line.substr(line.find_first_not_of(" \t", name.size() + 1));
    return {};
}

} // namespace ventrik
