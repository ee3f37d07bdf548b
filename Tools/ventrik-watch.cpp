#include "Platform/Linux/StandardStreams.h"
#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"
#include "Tools/Recording.h"
#include "Tools/WatchCommand.h"

#include <QCoreApplication>

#include <cstdlib>

using namespace ventrik;

namespace
{

WatchOptions parseArguments(int argc, char** argv)
{
    CommandLine line("ventrik-watch",
                     "The viewer for a terminal: shows the display tree in panes, to be walked by "
                     "keys. Where standard input or output is no terminal, prints the tree each "
                     "time something new has arrived.");
    WatchOptions result;
    line.addFlag("--once", "prints the first tree and ends", result.once);
    line.addFlag("--plain", "prints trees on a terminal, too, one in the place of the other",
                 result.plain);
    line.addOption("--records LAYOUTS", recordsNames(), result.records, recordsValue);
    addRecordingOptions(line, result.recording);
    line.addLogOptions("go to the system log", result.logLevel,
                       "copies every line of the log to standard error; from a terminal that "
                       "shows panes, the last 1000 lines at the end",
                       result.verbose);
    line.addExitStatus(EXIT_SUCCESS, "it was ended");
    line.addExitStatus(EXIT_FAILURE,
                       "the tree could not be written, the terminal cannot show panes, or nothing "
                       "can be recorded there");
    line.parse(argc, argv);
    refuseWrongRecording(line);
    return result;
}

} // namespace

int main(int argc, char** argv)
{
    prepareStandardStreams();
    const WatchOptions options = parseArguments(argc, argv);
    const QCoreApplication application(argc, argv);
    return WatchCommand(options).run();
}
