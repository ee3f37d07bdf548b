#include "Platform/Linux/DiagnosticLogs.h"

#include <QDir>

namespace ventrik
{

std::string defaultDiagnosticLogDirectory()
{
    QString state = qEnvironmentVariable("XDG_STATE_HOME");
    if (!QDir::isAbsolutePath(state))
        state = QDir::homePath() + "/.local/state";
    return (state + "/ventrik/DiagnosticLogs").toStdString();
}

} // namespace ventrik
