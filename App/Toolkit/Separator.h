#pragma once

#include <QColor>
#include <QPalette>

namespace ventrik
{

/// The colour of thin lines between things, on light and on dark palettes.
inline QColor separatorColor(const QPalette& palette)
{
    QColor color = palette.color(QPalette::WindowText);
    color.setAlphaF(0.16F);
    return color;
}

} // namespace ventrik
