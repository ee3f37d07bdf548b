#pragma once

#include <QString>

namespace ventrik
{

/// A text for one line: line breaks, tabs and other controls become spaces.
QString oneLine(QString text);

/// A text as a tool tip shows it unchanged, whatever it looks like.
QString plainToolTip(const QString& text);

} // namespace ventrik
