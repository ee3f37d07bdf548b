#pragma once

#include "PropertyList/PlistValue.h"

#include <chrono>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include <QProcess>

#include <sys/types.h>

namespace ventrik
{

#if defined(VENTRIK_SANITIZED)
inline constexpr bool isSanitized = true;
#else
inline constexpr bool isSanitized = false;
#endif

using Milliseconds = std::chrono::milliseconds;

/// How long a test waits for what should come soon, on a machine that is busy with others.
inline constexpr Milliseconds patience{isSanitized ? 40000 : 20000};

/// Runs the event loop until the condition holds; false when it does not in that time.
bool waitUntil(const std::function<bool()>& condition, Milliseconds timeout = patience);

std::vector<std::string> linesOf(const std::string& text);
/// The text with each address, 0x and hexadecimal digits, as %p.
std::string withoutAddresses(const std::string& text);

/// A child process whose output is kept. It is killed with the object, and with the test process.
class Program
{
  public:
    enum class Output { Kept, Discarded };

    /// Starts the program and gives it a standard input that stays open.
    Program(const std::string& path, const std::vector<std::string>& arguments,
            const QProcessEnvironment& environment, Output output = Output::Kept);
    ~Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    pid_t processId() const { return _processId; }
    bool isRunning() const { return _process.state() != QProcess::NotRunning; }
    void send(int signal) const;
    /// Sends SIGKILL and waits until the process is gone.
    void kill();

    void write(ByteView input);
    bool hasTakenInput() const { return _process.bytesToWrite() == 0; }
    void closeInput() { _process.closeWriteChannel(); }

    const std::string& output() const { return _output; }
    const std::string& errors() const { return _errors; }
    bool says(std::string_view text) const { return _errors.find(text) != std::string::npos; }
    bool prints(std::string_view text) const { return _output.find(text) != std::string::npos; }

    /// The exit status, 128 and the number for one that a signal ended; none while it runs on.
    std::optional<int> waitForEnd(Milliseconds timeout = patience);

    /// A field of /proc/PID/status, such as "VmHWM"; empty when there is none.
    std::string statusField(const std::string& name) const;
    /// Resident memory in KiB, now and at its highest.
    long residentMemory() const { return std::atol(statusField("VmRSS").c_str()); }
    long peakMemory() const { return std::atol(statusField("VmHWM").c_str()); }

  private:
    QProcess _process;
    pid_t _processId = 0;
    std::string _output;
    std::string _errors;
};

} // namespace ventrik
