#pragma once

#include <QFont>
#include <QSize>
#include <QString>

class QLabel;

namespace ventrik
{

enum class FontWeight { Regular, Bold };

/// The default family at that many points; a point is a device-independent pixel.
QFont systemFont(int points, FontWeight weight);

/// The size of a text on one line.
QSize measured(const QString& text, const QFont& font);

/// A label that takes its text as it stands, whatever it looks like. The caller owns it unless
/// there is a parent.
QLabel* makeLabel(const QFont& font, QWidget* parent);

} // namespace ventrik
