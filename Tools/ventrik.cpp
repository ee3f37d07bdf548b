#include "App/VentrikApp.h"
#include "Platform/Linux/DiagnosticLogs.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Tools/CommandLine.h"
#include "Tools/OpenedCapture.h"
#include "Tools/OptionValues.h"
#include "Tools/OwnDirectory.h"
#include "Tools/OwnService.h"
#include "Tools/Recording.h"

#include <QApplication>
#include <QIcon>

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>

#include <fmt/format.h>

using namespace ventrik;

namespace
{

struct ViewerOptions {
    VentrikAppOptions app;
    std::string demoTechnology; // empty: no demo
    std::optional<std::string> serialDevice;
    std::optional<std::string> capture; // to be replayed
    std::optional<std::string> opened;  // a capture, to be shown without a service
    std::string speed = "1";            // of the replay
    std::string technology;             // of the port or the capture
    std::optional<RecordsMode> records; // none: the preference's
    bool remembersRecords = false;
    RecordingOptions recording;
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

QSize sizeValue(const std::string& value)
{
    const std::string_view text = value;
    const std::size_t cross = std::min(text.find('x'), text.size());
    const auto width = sideOf(text.substr(0, cross));
    const auto height = sideOf(text.substr(std::min(cross + 1, text.size())));
    if (!width || !height)
        throw WrongValue(fmt::format("'{}' is no WIDTHxHEIGHT", text));
    return {*width, *height};
}

// The service reads the capture anew for each channel.
std::string fileValue(const std::string& text)
{
    if (text == "-")
        throw WrongValue("standard input cannot be replayed");
    return text;
}

std::string openedValue(const std::string& text)
{
    if (text == "-")
        throw WrongValue("standard input cannot be opened");
    return text;
}

void addServiceOptions(CommandLine& line, ViewerOptions& result)
{
    line.addOption("--demo TECHNOLOGY", "brings its own telephony service: " + technologyNames(),
                   result.demoTechnology,
                   [](const std::string& text) { return technologyValue(text).name; });
    line.addOption("--serial DEVICE",
                   "shows what a phone's diagnostic port measures, live; goes with --technology",
                   result.serialDevice, textValue);
    line.addOption("--replay CAPTURE", "shows a capture, with the pauses it was recorded with",
                   result.capture, fileValue);
    line.addOption("--speed FACTOR", "replays that much faster; max: as fast as it can be shown",
                   result.speed, [](const std::string& text) {
                       speedValue(text); // which refuses what is none
                       return text;
                   });
    line.addOption("--open CAPTURE", "shows a whole capture at once, without a service",
                   result.opened, openedValue);
    line.addOption(
        "--technology NAME",
        "what the port speaks, or the capture where it does not tell: " + technologyNames(),
        result.technology, [](const std::string& text) { return technologyValue(text).name; });
}

void addTimeLineOptions(CommandLine& line, VentrikAppOptions& app)
{
    line.addFlag("--timeline",
                 "in a narrow window a button leads to the time line; Ctrl+T does, too",
                 app.timeLineButton);
    line.addOption("--history SIZE",
                   "how much the time line keeps at most (default: 64M, of --open 1G)",
                   app.historyLimits.bytes, historySizeValue);
    line.addOption("--history-age TIME",
                   "for how long it keeps that (default: 24h, of --open any time)",
                   app.historyLimits.age, historyAgeValue);
    line.addOption("--bands LIMITS",
                   "from where on a signal is excellent, good and fair, as in "
                   "RSRP=-80,-100,-110; may be given again",
                   [&app](const std::string& text) { changeBands(app.bands, text); });
    line.addOption("--alert CONDITION",
                   "rings and tells the desktop when a value crosses a threshold, as in "
                   "\"/Serving Cell Measurements/Measured RSRP < -110\"; may be given again",
                   [&app](const std::string& text) { addAlert(app.alerts, text); });
}

void addOptions(CommandLine& line, ViewerOptions& result)
{
    addServiceOptions(line, result);
    line.addFlag("--save-button", "offers Save also where it is switched off",
                 result.app.saveButton);
    line.addOption("--snapshot-directory DIR",
                   "saves snapshots in DIR, which is made at the first save",
                   result.app.snapshotDirectory, textValue);
    line.addOption("--size WIDTHxHEIGHT", "the window's size (default: that of the main screen)",
                   result.app.windowSize, sizeValue);
    line.addFlag("--no-animation", "every change shows at once",
                 [&app = result.app] { app.animation = false; });
    line.addFlag("--plain", "no animation, values that have changed are not tinted, no time line",
                 [&app = result.app] { app.animation = app.tintsChanges = app.timeLine = false; });
    line.addFlag("--channel-pane",
                 "the root ends with a row for the channel: what came, and what did not; F8 shows "
                 "it, too",
                 result.app.channelPane);
    addTimeLineOptions(line, result.app);
    line.addOption("--records LAYOUTS", recordsNames() + ", or the preference", result.records,
                   recordsValue);
    line.addFlag("--remember-records", "makes that the preference, for later runs",
                 result.remembersRecords);
    addRecordingOptions(line, result.recording);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error", result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "it was ended");
    line.addExitStatus(EXIT_FAILURE,
                       "there is no display, no service of its own, nothing can be recorded there, "
                       "or the capture cannot be read");
}

void refuseWrongTogether(const CommandLine& line)
{
    if (line.has("--demo") + line.has("--serial") + line.has("--replay") + line.has("--open") > 1)
        line.refuse("either --demo, --serial, --replay or --open");
    if (line.has("--open") && line.has("--record"))
        line.refuse("--open has nothing to record");
    if (line.has("--serial") && !line.has("--technology"))
        line.refuse("--serial goes with --technology");
    if (line.has("--technology") && !line.has("--serial") && !line.has("--replay") &&
        !line.has("--open"))
        line.refuse("--technology goes with --serial, --replay or --open");
    if (line.has("--speed") && !line.has("--replay"))
        line.refuse("--speed goes with --replay");
    if (line.has("--remember-records") && !line.has("--records"))
        line.refuse("--remember-records goes with --records");
}

// A capture is to be seen as a whole.
void keepWholeCapture(const CommandLine& line, ChangeStore::Limits& limits)
{
    if (!line.has("--history"))
        limits.bytes = std::size_t{1} << 30;
    if (!line.has("--history-age"))
        limits.age = std::chrono::nanoseconds::max();
}

ViewerOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik",
                     "Shows what the baseband tells, as a tree of tables that is brought "
                     "up to date every 2 s.");
    ViewerOptions result;
    result.app.snapshotDirectory = defaultDiagnosticLogDirectory();
    addOptions(line, result);
    line.parse(argc, argv);
    refuseWrongTogether(line);
    refuseWrongRecording(line);
    if (line.has("--open"))
        keepWholeCapture(line, result.app.historyLimits);
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

// What the user has said now or, once, for later runs.
RecordsMode chooseRecords(const ViewerOptions& options, LinuxPlatform& platform)
{
    constexpr std::string_view key = "Records";
    LinuxPreferences& preferences = platform.preferences();
    if (options.records) {
        if (options.remembersRecords) {
            preferences.setText(preferenceDomain, key, nameOf(*options.records));
            preferences.synchronize(preferenceDomain);
        }
        return *options.records;
    }
    const auto preference = preferences.text(preferenceDomain, key);
    const auto records = preference ? recordsModeNamed(*preference) : std::nullopt;
    if (preference && !records)
        platform.log().error("The preference {} of {} is none of base, newer and extended: {}", key,
                             preferenceDomain, *preference);
    return records.value_or(RecordsMode::Newer);
}

bool openCapture(const ViewerOptions& options, const Platform& platform, VentrikAppOptions& app)
{
    std::string error;
    OpenedCaptureOptions capture{*options.opened, technologyNamed(options.technology), app.records};
    std::shared_ptr<OpenedCapture> opened = OpenedCapture::open(capture, platform, error);
    if (!opened)
        complain(error);
    else if (!opened->remark().empty())
        complain(opened->remark());
    app.opened = opened;
    return opened != nullptr;
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
    VentrikAppOptions appOptions = options.app;
    appOptions.records = chooseRecords(options, platform);
    if (options.opened && !openCapture(options, platform.platform(), appOptions))
        return EXIT_FAILURE;
    appOptions.notices = &platform.notices();
    appOptions.ring = QApplication::beep;
    Recording recording("ventrik", platform.platform(), options.recording);
    if (!recording.isPossible())
        return EXIT_FAILURE;
    VentrikApp app(recording.platform(), appOptions);
    app.applicationDidFinishLaunching();
    running.emplace(Running{app, platform.log()});
    std::atexit(undoSettingAtExit);
    const int status = QApplication::exec();
    running.reset();
    app.applicationWillTerminate();
    return status;
}

// The service that this viewer brings along; none where it goes to the one that is there.
std::optional<OwnServiceOptions> chooseService(const ViewerOptions& options)
{
    QStringList technology;
    if (!options.technology.empty())
        technology = {"--technology", QString::fromStdString(options.technology)};
    if (options.serialDevice)
        return OwnServiceOptions{
            "serial",
            QStringList{"--serial", QString::fromStdString(*options.serialDevice)} + technology};
    if (options.capture)
        return OwnServiceOptions{"replay",
                                 QStringList{"--replay", QString::fromStdString(*options.capture),
                                             "--speed", QString::fromStdString(options.speed)} +
                                     technology};
    if (options.demoTechnology.empty())
        return std::nullopt;
    const std::string records(nameOf(options.records.value_or(RecordsMode::Base)));
    return OwnServiceOptions{"demo",
                             {"--technology", QString::fromStdString(options.demoTechnology),
                              "--records", QString::fromStdString(records)}};
}

int runWithService(const ViewerOptions& options, const OwnServiceOptions& serviceOptions,
                   const OwnDirectory& directory)
{
    if (directory.path().empty()) {
        complain("no directory for a service of its own: " + directory.error());
        return EXIT_FAILURE;
    }
    OwnService service(serviceOptions);
    if (!service.start(directory))
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
    const auto service = chooseService(options);
    std::optional<OwnDirectory> directory;
    if (service)
        directory.emplace();
    int toolkitArgc = 1;
    const auto application = makeApplication(toolkitArgc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });
    return service ? runWithService(options, *service, *directory) : runViewer(options, {});
}
