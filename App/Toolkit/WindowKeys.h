#pragma once

class QWidget;

namespace ventrik
{

/// A list or a text would take the space bar for itself, and Home before a shortcut: from now on
/// the space bar goes to its window, and so does Home where that has a shortcut for it.
void leaveKeysToWindow(QWidget& widget);

} // namespace ventrik
