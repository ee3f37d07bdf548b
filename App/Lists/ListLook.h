#pragma once

#include <QColor>
#include <QFont>
#include <QPalette>

class QAbstractItemView;
class QPainter;
class QRect;
class QStyleOptionViewItem;

namespace ventrik
{

// What the lists look like beside the panes.

inline constexpr int listRowHeight = 36;
inline constexpr int listMargin = 10; ///< at either side of a text

QFont listFont();
QFont listHeaderFont();

/// Text that says less than what is beside it.
QColor quietTextColor(const QPalette& palette);
/// The color of a list row's text.
QColor textColor(const QStyleOptionViewItem& option);

/// The row's background and the line below it.
void drawListRow(QPainter& painter, const QStyleOptionViewItem& option, int separatorLeft);
/// One line in the middle of an empty list.
void drawPlaceholder(QPainter& painter, const QRect& area, const QPalette& palette,
                     const QString& text);
/// Frameless, touched and scrolled as the panes are.
void makePlain(QAbstractItemView& view);

} // namespace ventrik
