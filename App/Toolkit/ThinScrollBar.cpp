#include "App/Toolkit/ThinScrollBar.h"

#include <QEvent>

namespace ventrik
{

namespace
{

QString withOpacity(QColor color, int percent)
{
    return QStringLiteral("rgba(%1, %2, %3, %4%)")
        .arg(color.red())
        .arg(color.green())
        .arg(color.blue())
        .arg(percent);
}

} // namespace

ThinScrollBar::ThinScrollBar(QWidget* parent) : QScrollBar(Qt::Vertical, parent)
{
    takeColors();
}

void ThinScrollBar::takeColors()
{
    const QString looks =
        QStringLiteral("QScrollBar:vertical { width: %1px; background: %2; }"
                       "QScrollBar::handle:vertical { background: %3; min-height: 40px;"
                       " margin: 1px; border-radius: 3px; }"
                       "QScrollBar::add-line:vertical, QScrollBar::sub-line:vertical { height: 0; }"
                       "QScrollBar::add-page:vertical, QScrollBar::sub-page:vertical"
                       " { background: none; }")
            .arg(width)
            .arg(palette().color(QPalette::Base).name(),
                 withOpacity(palette().color(QPalette::Text), 40));
    if (looks != styleSheet())
        setStyleSheet(looks);
}

void ThinScrollBar::changeEvent(QEvent* event)
{
    QScrollBar::changeEvent(event);
    if (event->type() == QEvent::PaletteChange)
        takeColors();
}

} // namespace ventrik
