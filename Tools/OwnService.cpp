#include "Tools/OwnService.h"

#include "Platform/Linux/PortDirectory.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Platform/TelephonyConstants.h"

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include <QCoreApplication>
#include <QElapsedTimer>

#include <fmt/format.h>
#include <sys/prctl.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr std::size_t longestComplaint = 4096;

} // namespace

bool OwnService::start(const OwnDirectory& directory)
{
    auto environment = QProcessEnvironment::systemEnvironment();
    environment.insert("VENTRIK_RUNTIME_DIR", QString::fromStdString(directory.path()));
    _process.setProcessEnvironment(environment);
    _process.setStandardOutputFile(QProcess::nullDevice());
    _process.setChildProcessModifier([parent = getpid()] {
        // What a terminal sends, it sends to both; the service ends when this process says so.
        for (const int number : {SIGINT, SIGHUP})
            std::signal(number, SIG_IGN);
        // The signal mask is inherited; the service shall see its own signals.
        sigset_t none;
        sigemptyset(&none);
        sigprocmask(SIG_SETMASK, &none, nullptr);
        prctl(PR_SET_PDEATHSIG, SIGTERM);
        if (getppid() != parent)
            _exit(EXIT_FAILURE);
    });
    QObject::connect(&_process, &QProcess::readyReadStandardError, qApp,
                     [this] { takeComplaints(); });
    _process.start(QCoreApplication::applicationDirPath() + "/ventrik-telephony",
                   _options.arguments);
    if (!waitUntilListening(directory.path()))
        return false;
    _serves = true;
    QObject::connect(&_process, &QProcess::finished, qApp, [this] {
        // Who is told to end may have been told together with the service.
        if (TerminationSignals::haveCome())
            return;
        tellEnd();
        QCoreApplication::exit(EXIT_FAILURE);
    });
    return true;
}

bool OwnService::waitUntilListening(const std::string& runtimeDirectory)
{
    constexpr int longestWait = 5000; // milliseconds
    constexpr int turn = 20;
    const std::string socket = PortDirectory(runtimeDirectory).socketPath(telephonyServicePortName);
    QElapsedTimer elapsed;
    elapsed.start();
    while (access(socket.c_str(), F_OK) != 0) {
        if (_process.waitForFinished(turn) || _process.state() == QProcess::NotRunning) {
            tellEnd();
            return false;
        }
        if (elapsed.hasExpired(longestWait)) {
            complain("ventrik", fmt::format("the {} service does not come up", _options.name));
            return false;
        }
    }
    return true;
}

// While it does not serve, its last words are told as the reason.
void OwnService::takeComplaints()
{
    const std::string text = _process.readAllStandardError().toStdString();
    if (_serves)
        writeText(STDERR_FILENO, text, Patience::Brief);
    _complaints += text;
    if (_complaints.size() > longestComplaint)
        _complaints.erase(0, _complaints.size() - longestComplaint);
}

// Or how it ended, where it had none.
std::string OwnService::lastWords() const
{
    const QStringList lines = QString::fromStdString(_complaints).split('\n', Qt::SkipEmptyParts);
    if (!lines.isEmpty())
        return lines.last().toStdString();
    if (_process.error() == QProcess::FailedToStart || _process.exitStatus() == QProcess::CrashExit)
        return _process.errorString().toStdString();
    return fmt::format("exit status {}", _process.exitCode());
}

void OwnService::tellEnd()
{
    takeComplaints();
    complain("ventrik", fmt::format("the {} service ended: {}", _options.name, lastWords()));
}

OwnService::~OwnService()
{
    constexpr int longestWait = 2000; // milliseconds
    _process.disconnect(qApp);
    if (_process.state() == QProcess::NotRunning)
        return;
    _process.terminate();
    if (!_process.waitForFinished(longestWait)) {
        _process.kill();
        _process.waitForFinished(longestWait);
    }
    takeComplaints();
}

} // namespace ventrik
