#include "App/VentrikApp.h"
#include "Capture/CaptureTechnology.h"
#include "Platform/Linux/DiagnosticLogs.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Tools/CommandLine.h"
#include "Tools/DemoDirectory.h"
#include "Tools/DemoService.h"

#include <QApplication>
#include <QIcon>

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>

#include <fmt/format.h>
#include <getopt.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik [--demo TECHNOLOGY] [--save-button] [--snapshot-directory DIR]\n"
    "               [--size WIDTHxHEIGHT] [--no-animation] [--plain] [--log-level LEVEL]\n"
    "               [--verbose]\n"
    "\n"
    "Shows what the baseband tells, as a tree of tables that is brought up to date every 2 s.\n"
    "\n"
    "  --demo TECHNOLOGY         brings its own telephony service (lte, gsm, utran, c2k or ifx)\n"
    "  --save-button             offers Save also where it is switched off\n"
    "  --snapshot-directory DIR  saves snapshots in DIR\n"
    "  --size WIDTHxHEIGHT       the window's size (default: that of the main screen)\n"
    "  --no-animation            every change shows at once\n"
    "  --plain                   no animation, and values that have changed are not tinted\n"
    "  --log-level LEVEL         the least urgent lines that go to the system log: debug, info,\n"
    "                            notice, warning, error (default), critical, alert or emergency\n"
    "  --verbose                 copies every line of the log to standard error\n"
    "  --help, --version\n"
    "\n"
    "Exit status: 0 ended, 1 there is no display or no demo service, 2 wrong usage.\n";

struct ViewerOptions {
    VentrikAppOptions app;
    std::string demoTechnology; // empty: no demo
    int logLevel = LogPriority::error;
    bool verbose = false;
};

// A side of the window, from 1 to 99999; none for anything else.
std::optional<int> sideOf(std::string_view text)
{
    int side = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), side);
    if (error != std::errc() || end != text.data() + text.size() || side < 1 || side > 99999)
        return std::nullopt;
    return side;
}

QSize sizeArgument(const CommandLine& line)
{
    const std::string_view text = line.value();
    const std::size_t cross = std::min(text.find('x'), text.size());
    const auto width = sideOf(text.substr(0, cross));
    const auto height = sideOf(text.substr(std::min(cross + 1, text.size())));
    if (!width || !height)
        line.refuse(fmt::format("--size takes WIDTHxHEIGHT, not '{}'", text));
    return {*width, *height};
}

std::string technologyArgument(const CommandLine& line)
{
    if (!technologyNamed(line.value()))
        line.refuse(fmt::format("there is no technology '{}'", line.value()));
    return line.value();
}

ViewerOptions parseArguments(int argc, char** argv)
{
    static const option options[] = {{"demo", required_argument, nullptr, 'd'},
                                     {"snapshot-directory", required_argument, nullptr, 's'},
                                     {"size", required_argument, nullptr, 'z'},
                                     {"save-button", no_argument, nullptr, 'b'},
                                     {"no-animation", no_argument, nullptr, 'n'},
                                     {"plain", no_argument, nullptr, 'p'},
                                     {"log-level", required_argument, nullptr, 'L'},
                                     {"verbose", no_argument, nullptr, 'V'},
                                     {"help", no_argument, nullptr, 'h'},
                                     {"version", no_argument, nullptr, 'v'},
                                     {}};
    CommandLine line("ventrik", argc, argv);
    ViewerOptions result;
    result.app.snapshotDirectory = defaultDiagnosticLogDirectory();
    for (int letter = 0; (letter = line.next(options)) != -1;) {
        if (letter == 'd')
            result.demoTechnology = technologyArgument(line);
        else if (letter == 's')
            result.app.snapshotDirectory = line.value();
        else if (letter == 'z')
            result.app.windowSize = sizeArgument(line);
        else if (letter == 'b')
            result.app.saveButton = true;
        else if (letter == 'n')
            result.app.animation = false;
        else if (letter == 'p')
            result.app.animation = result.app.tintsChanges = false;
        else if (letter == 'L')
            result.logLevel = line.logLevel();
        else if (letter == 'V')
            result.verbose = true;
        else
            line.tell(letter == 'h' ? usage : "ventrik " VENTRIK_VERSION "\n");
    }
    if (!line.arguments().empty())
        line.refuse(fmt::format("what is '{}'?", line.arguments().front()));
    return result;
}

void complain(std::string_view reason)
{
    ventrik::complain("ventrik", reason);
}

bool hasDisplay()
{
    return !qEnvironmentVariableIsEmpty("DISPLAY") ||
           !qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY") ||
           !qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM");
}

// A display that is named and cannot be used is fatal to the toolkit: it would abort the process.
void endWithoutDisplay(QtMsgType type, const QMessageLogContext&, const QString&)
{
    if (type != QtFatalMsg)
        return;
    complain("the display cannot be opened; ventrik-watch needs none");
    std::_Exit(EXIT_FAILURE);
}

std::unique_ptr<QApplication> makeApplication(int& argc, char** argv)
{
    const QtMessageHandler usual = qInstallMessageHandler(endWithoutDisplay);
    auto application = std::make_unique<QApplication>(argc, argv);
    qInstallMessageHandler(usual);
    QGuiApplication::setDesktopFileName(QStringLiteral("ventrik"));
    return application;
}

void setWindowIcon(const Resources& resources)
{
    if (const auto icon = resources.path("ventrik", "png"))
        QApplication::setWindowIcon(QIcon(QString::fromStdString(*icon)));
}

struct Running {
    VentrikApp& app;
    SystemLog& log;
};
std::optional<Running> running;

// The toolkit ends the process when the display goes away, as it may at the session's end. There is
// nothing left to take down in order then, but the setting is undone all the same.
void undoSettingAtExit()
{
    if (!running)
        return;
    running->app._setGSMRSSI(false);
    running->log.flush();
}

int runViewer(const ViewerOptions& options, const std::string& runtimeDirectory)
{
    LinuxPlatformOptions platformOptions;
    platformOptions.runtimeDirectory = runtimeDirectory;
    platformOptions.verbose = options.verbose;
    platformOptions.logThreshold = options.logLevel;
    platformOptions.version = VENTRIK_VERSION;
    LinuxPlatform platform(platformOptions);
    setWindowIcon(platform.platform().resources);
    VentrikApp app(platform.platform(), options.app);
    app.applicationDidFinishLaunching();
    running.emplace(Running{app, platform.log()});
    std::atexit(undoSettingAtExit);
    const int status = QApplication::exec();
    running.reset();
    app.applicationWillTerminate();
    return status;
}

int runDemo(const ViewerOptions& options, const DemoDirectory& directory)
{
    if (directory.path().empty()) {
        complain("no directory for the demo: " + directory.error());
        return EXIT_FAILURE;
    }
    DemoService service;
    if (!service.start(directory, options.demoTechnology))
        return EXIT_FAILURE;
    return runViewer(options, directory.path());
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const ViewerOptions options = parseArguments(argc, argv);
    if (!hasDisplay()) {
        complain("there is no display; ventrik-watch needs none");
        return EXIT_FAILURE;
    }
    TerminationSignals::block(); // the toolkit starts threads
    std::optional<DemoDirectory> demoDirectory;
    if (!options.demoTechnology.empty())
        demoDirectory.emplace();
    int toolkitArgc = 1;
    const auto application = makeApplication(toolkitArgc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });
    return demoDirectory ? runDemo(options, *demoDirectory) : runViewer(options, {});
}
