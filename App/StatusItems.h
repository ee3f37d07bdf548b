#pragma once

#include "App/Toolkit/ToolBar.h"

#include <string>
#include <vector>

namespace ventrik
{

struct StatusNote;
class VentrikPaneHost;

/// The items that every screen of the stack has in its tool bar: whether something is awaited, and
/// the status with the host's note beside it. While the past is shown a click leads back.
std::vector<ToolBarItem> statusItems(const std::string& status, bool isLoading,
                                     VentrikPaneHost& host);
/// Renews the note.
void updateStatusNote(const ToolBar& toolbar, const StatusNote& note);

} // namespace ventrik
