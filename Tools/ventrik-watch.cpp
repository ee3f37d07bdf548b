#include "Model/TreePrinter.h"
#include "Model/VentrikModel.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StandardStreams.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Tools/CommandLine.h"

#include <QCoreApplication>

#include <cerrno>
#include <cstdlib>

#include <fmt/format.h>
#include <getopt.h>
#include <unistd.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik-watch [--once] [--log-level LEVEL] [--verbose]\n"
    "\n"
    "The viewer for a terminal: prints the display tree each time something new has arrived.\n"
    "\n"
    "  --once             ends after the first tree\n"
    "  --log-level LEVEL  the least urgent lines that go to the system log: debug, info, notice,\n"
    "                     warning, error (default), critical, alert or emergency\n"
    "  --verbose          copies every line of the log to standard error\n"
    "  --help, --version\n"
    "\n"
    "Exit status: 0 ended, 1 the tree could not be written, 2 wrong usage.\n";

struct WatchOptions {
    bool once = false;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

WatchOptions parseArguments(int argc, char** argv)
{
    static const option options[] = {
        {"once", no_argument, nullptr, 'o'},    {"log-level", required_argument, nullptr, 'L'},
        {"verbose", no_argument, nullptr, 'V'}, {"help", no_argument, nullptr, 'h'},
        {"version", no_argument, nullptr, 'v'}, {}};
    CommandLine line("ventrik-watch", argc, argv);
    WatchOptions result;
    for (int letter = 0; (letter = line.next(options)) != -1;) {
        if (letter == 'o')
            result.once = true;
        else if (letter == 'L')
            result.logLevel = line.logLevel();
        else if (letter == 'V')
            result.verbose = true;
        else
            line.tell(letter == 'h' ? usage : "ventrik-watch " VENTRIK_VERSION "\n");
    }
    if (!line.arguments().empty())
        line.refuse(fmt::format("what is '{}'?", line.arguments().front()));
    return result;
}

// On a terminal the new tree takes the place of the old one; elsewhere trees follow each other.
// False, with errno, when it could not be written. A reader that takes nothing is waited for, but
// not against the wish that the program ends.
bool show(const VentrikModelNode& root)
{
    static const bool isTerminal = isatty(STDOUT_FILENO);
    const std::string text = (isTerminal ? "\033[H\033[2J" : "") + printTree(root);
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
    model = std::make_unique<VentrikModel>(platform, [&] {
        const ModelNodePointer root = model->topLevelNodes();
        if (!root)
            return;
        if (!show(*root))
            QCoreApplication::exit(tellOutputFailure("ventrik-watch", "standard output", errno));
        else if (options.once)
            QCoreApplication::quit();
    });
    platform.mainQueue.async([&] { model->restartMonitor(); });
    return QCoreApplication::exec();
}
