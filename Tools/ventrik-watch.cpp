#include "Model/TreePrinter.h"
#include "Model/VentrikModel.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"

#include <QCoreApplication>

#include <cerrno>
#include <cstdlib>

#include <unistd.h>

using namespace ventrik;

namespace
{

struct WatchOptions {
    bool once = false;
    RecordsMode records = RecordsMode::Newer;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

WatchOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-watch", "The viewer for a terminal: prints the display tree each "
                                      "time something new has arrived.");
    WatchOptions result;
    line.addFlag("--once", "ends after the first tree", result.once);
    line.addOption("--records LAYOUTS", recordsNames(), result.records, recordsValue);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error", result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "it was ended");
    line.addExitStatus(EXIT_FAILURE, "the tree could not be written");
    line.parse(argc, argv);
    return result;
}

// On a terminal the new tree takes the place of the old one; elsewhere trees follow each other.
// False, with errno, when it could not be written. A reader that takes nothing is waited for, but
// not against the wish that the program ends.
bool show(const VentrikModelNode& root, const NodeNotes& notes)
{
    static const bool isTerminal = isatty(STDOUT_FILENO);
    const std::string text = (isTerminal ? "\033[H\033[2J" : "") + printTree(root, notes);
    std::string_view rest = text;
    while (!writeText(STDOUT_FILENO, rest, Patience::Brief))
        if (errno != EAGAIN || TerminationSignals::haveCome())
            return errno == EAGAIN;
    return true;
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const WatchOptions options = parseArguments(argc, argv);
    QCoreApplication application(argc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });

    LinuxPlatformOptions platformOptions;
    platformOptions.programName = "ventrik-watch";
    platformOptions.verbose = options.verbose;
    platformOptions.logThreshold = options.logLevel;
    platformOptions.version = VENTRIK_VERSION;
    LinuxPlatform linuxPlatform(platformOptions);
    const Platform platform = linuxPlatform.platform();

    std::unique_ptr<VentrikModel> model;
    const auto showTree = [&] {
        const ModelNodePointer root = model->topLevelNodes();
        if (!root)
            return;
        if (!show(*root, *model))
            QCoreApplication::exit(tellOutputFailure("ventrik-watch", "standard output", errno));
        else if (options.once)
            QCoreApplication::quit();
    };
    model = std::make_unique<VentrikModel>(platform, showTree,
                                           LogGenerator::generatorsReading(options.records));
    platform.mainQueue.async([&] { model->restartMonitor(); });
    return QCoreApplication::exec();
}
