#pragma once

#include <string>

namespace ventrik
{

/// Where diagnostic logs are kept by default: $XDG_STATE_HOME/ventrik/DiagnosticLogs, below
/// ~/.local/state where that is not set or not absolute. It may not exist yet.
std::string defaultDiagnosticLogDirectory();

} // namespace ventrik
