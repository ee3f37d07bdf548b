#include "Tools/WatchCommand.h"

#include "Model/TreePrinter.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"

#include <QCoreApplication>

#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <stdexcept>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr const char* programName = "ventrik-watch";
// Of what was kept from the screen: what was asked for, or what tells how it ended.
constexpr int linesWhenVerbose = 1000;
constexpr int linesOtherwise = 20;
constexpr auto metricsInterval = std::chrono::seconds(2); // as often as the screens
constexpr std::string_view clearScreen = "\033[H\033[2J";

LinuxPlatformOptions platformOptions(const WatchOptions& options)
{
    LinuxPlatformOptions result;
    result.programName = programName;
    result.verbose = options.verbose;
    result.logThreshold = options.logLevel;
    result.version = VENTRIK_VERSION;
    return result;
}

} // namespace

int WatchCommand::run()
{
    const TerminationSignals termination([] { QCoreApplication::quit(); });
    if (_options.rows)
        _output = takeStandardOutput(_options.verbose ? OthersOutput::ToStandardError
                                                      : OthersOutput::Nowhere);
    LinuxPlatform linuxPlatform(platformOptions(_options));
    Recording recording(programName, linuxPlatform.platform(), _options.recording);
    if (!recording.isPossible())
        return EXIT_FAILURE;
    const Platform platform = recording.platform();
    _model = makeModel(platform);
    if (_options.rows)
        _model->addObserver(_rows.emplace(*_options.rows, _options.records));
    _model->addObserver(_channelCounts);
    if (_options.metricsFile)
        _model->addObserver(_metrics.emplace(*_options.metricsFile));
    std::unique_ptr<RepeatingTimer> metricsTimer;
    if (_metrics)
        metricsTimer = platform.mainQueue.repeatEvery(metricsInterval, [this] { writeMetrics(); });
    _tree = std::make_unique<ChannelPane>(*_model, _channelCounts, platform.clock);
    if (_options.channelPane)
        _tree->keep();
    const int mostErrorLines = _options.verbose ? linesWhenVerbose : linesOtherwise;
    try {
        if (showsPanes())
            _viewer = std::make_unique<WatchViewer>(platform, *_model, *_tree, mostErrorLines,
                                                    [] { QCoreApplication::quit(); });
    } catch (const std::runtime_error& error) {
        complain(programName, fmt::format("{}; --plain prints the tree instead", error.what()));
        _tree.reset();
        _model.reset(); // before its platform
        return EXIT_FAILURE;
    }
    platform.mainQueue.async([this] { _model->restartMonitor(); });
    const int status = QCoreApplication::exec();
    if (_viewer)
        linuxPlatform.log().flush(); // while that is still kept from the screen
    _viewer.reset();
    _tree.reset();
    _model.reset();
    if (_rows && status == EXIT_SUCCESS) {
        _rows->close();
        if (!print(_rows->takeText()))
            return tellOutputFailure(programName, "standard output", errno);
    }
    return status;
}

bool WatchCommand::showsPanes() const
{
    return !_options.once && !_options.plain && !_options.rows && isatty(STDIN_FILENO) &&
           isatty(STDOUT_FILENO);
}

std::unique_ptr<VentrikModel> WatchCommand::makeModel(const Platform& platform)
{
    return std::make_unique<VentrikModel>(
        platform, [this] { refresh(); }, LogGenerator::generatorsReading(_options.records));
}

void WatchCommand::refresh()
{
    writeMetrics();
    if (_viewer)
        _viewer->refresh();
    else if (_rows)
        printRows();
    else
        printTree();
}

// A failure is told once, until it is over.
void WatchCommand::writeMetrics()
{
    std::string error;
    if (!_metrics || _metrics->write(*_model, error)) {
        _metricsFault.clear();
        return;
    }
    if (error != std::exchange(_metricsFault, error))
        complain(programName, error);
}

void WatchCommand::printRows()
{
    _model->topLevelNodes(); // ends the period, whose raw packets are kept until then
    if (!print(_rows->takeText()))
        QCoreApplication::exit(tellOutputFailure(programName, "standard output", errno));
    else if (_options.once)
        QCoreApplication::quit();
}

void WatchCommand::printTree()
{
    _tree->takeDisplay();
    _tree->update();
    const ModelNodePointer root = _tree->topLevelNodes();
    if (!root)
        return;
    if (!print(*root))
        QCoreApplication::exit(tellOutputFailure(programName, "standard output", errno));
    else if (_options.once)
        QCoreApplication::quit();
}

// On a terminal the new tree takes the place of the old one; elsewhere, and where it is the only
// one, nothing is cleared.
bool WatchCommand::print(const VentrikModelNode& root) const
{
    std::string text;
    if (isatty(STDOUT_FILENO) && (_options.plain || !_options.once))
        text += clearScreen;
    text += ventrik::printTree(root, *_tree);
    return print(text);
}

// False, with errno, when it could not be written. A reader that takes nothing is waited for, but
// not against the wish that the program ends.
bool WatchCommand::print(std::string_view text) const
{
    std::string_view rest = text;
    while (!writeText(_output, rest, Patience::Brief))
        if (errno != EAGAIN || TerminationSignals::haveCome())
            return errno == EAGAIN;
    return true;
}

} // namespace ventrik
