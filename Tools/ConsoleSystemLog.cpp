#include "Tools/ConsoleSystemLog.h"

#include "Platform/Linux/LinuxSystemLog.h"
#include "Platform/Linux/StandardStreams.h"
#include "PropertyList/TerminalText.h"

#include <utility>

#include <unistd.h>

namespace ventrik
{

namespace
{

void show(const std::string& line)
{
    writeText(STDERR_FILENO, std::string_view(line + '\n'), Patience::Endless);
}

} // namespace

ConsoleSystemLog::ConsoleSystemLog(std::string programName, int shownLevel, SystemLog* other)
    : SystemLog(other ? LogPriority::debug : shownLevel),
      _programName(std::move(programName)),
      _shownLevel(shownLevel),
      _other(other)
{
}

void ConsoleSystemLog::showOnConsole(std::string_view line)
{
    if (_shownLevel != showNothing)
        show(terminalLine(line));
}

bool ConsoleSystemLog::flush()
{
    return !_other || _other->flush();
}

void ConsoleSystemLog::write(int priority, std::string_view text)
{
    if (_other)
        _other->log(priority, "{}", text);
    if ((priority & 7) <= _shownLevel)
        show(LinuxSystemLog::line(_programName, getpid(), priority, text));
}

} // namespace ventrik
