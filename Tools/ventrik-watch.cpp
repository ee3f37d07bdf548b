#include "Model/TreePrinter.h"
#include "Model/VentrikModel.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/TerminationSignals.h"
#include "Tools/CommandLine.h"

#include <QCoreApplication>

#include <cstdlib>

#include <fmt/format.h>
#include <getopt.h>
#include <unistd.h>

using namespace ventrik;

namespace
{

constexpr const char* usage =
    "usage: ventrik-watch [--once] [--verbose]\n"
    "\n"
    "The viewer for a terminal: prints the display tree each time something new has arrived.\n"
    "\n"
    "  --once     ends after the first tree\n"
    "  --verbose  copies the system log to standard error\n"
    "  --help, --version\n";

struct WatchOptions {
    bool once = false;
    bool verbose = false;
};

WatchOptions parseArguments(int argc, char** argv)
{
    static const option options[] = {{"once", no_argument, nullptr, 'o'},
                                     {"verbose", no_argument, nullptr, 'V'},
                                     {"help", no_argument, nullptr, 'h'},
                                     {"version", no_argument, nullptr, 'v'},
                                     {}};
    CommandLine line("ventrik-watch", argc, argv);
    WatchOptions result;
    for (int letter = 0; (letter = line.next(options)) != -1;) {
        if (letter == 'o')
            result.once = true;
        else if (letter == 'V')
            result.verbose = true;
        else
            tell(letter == 'h' ? usage : "ventrik-watch " VENTRIK_VERSION "\n");
    }
    if (!line.arguments().empty())
        line.refuse(fmt::format("what is '{}'?", line.arguments().front()));
    return result;
}

// On a terminal the new tree takes the place of the old one; elsewhere trees follow each other.
void show(const VentrikModelNode& root)
{
    static const bool isTerminal = isatty(STDOUT_FILENO);
    fmt::print("{}{}", isTerminal ? "\033[H\033[2J" : "", printTree(root));
    std::fflush(stdout);
}

} // namespace

int main(int argc, char** argv)
{
    const WatchOptions options = parseArguments(argc, argv);
    QCoreApplication application(argc, argv);
    const TerminationSignals termination([] { QCoreApplication::quit(); });

    LinuxPlatformOptions platformOptions;
    platformOptions.programName = "ventrik-watch";
    platformOptions.verbose = options.verbose;
    platformOptions.version = VENTRIK_VERSION;
    LinuxPlatform linuxPlatform(platformOptions);
    const Platform platform = linuxPlatform.platform();

    std::unique_ptr<VentrikModel> model;
    model = std::make_unique<VentrikModel>(platform, [&] {
        const ModelNodePointer root = model->topLevelNodes();
        if (!root)
            return;
        show(*root);
        if (options.once || std::ferror(stdout))
            QCoreApplication::quit();
    });
    platform.mainQueue.async([&] { model->restartMonitor(); });
    return QCoreApplication::exec();
}
