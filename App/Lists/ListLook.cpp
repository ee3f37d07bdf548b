#include "App/Lists/ListLook.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/Separator.h"
#include "App/Toolkit/ThinScrollBar.h"
#include "App/Toolkit/WindowKeys.h"

#include <QAbstractItemView>
#include <QPainter>
#include <QScroller>
#include <QStyleOptionViewItem>

namespace ventrik
{

namespace
{

constexpr int textPoints = 15;
constexpr int headerPoints = 12;

} // namespace

QFont listFont()
{
    return systemFont(textPoints, FontWeight::Regular);
}

QFont listHeaderFont()
{
    return systemFont(headerPoints, FontWeight::Regular);
}

QColor quietTextColor(const QPalette& palette)
{
    QColor color = palette.color(QPalette::Text);
    color.setAlphaF(0.65F);
    return color;
}

QColor textColor(const QStyleOptionViewItem& option)
{
    const bool isSelected = option.state.testFlag(QStyle::State_Selected);
    return option.palette.color(isSelected ? QPalette::HighlightedText : QPalette::Text);
}

void drawListRow(QPainter& painter, const QStyleOptionViewItem& option, int separatorLeft)
{
    const bool isSelected = option.state.testFlag(QStyle::State_Selected);
    painter.fillRect(option.rect,
                     option.palette.color(isSelected ? QPalette::Highlight : QPalette::Base));
    painter.fillRect(QRect(option.rect.left() + separatorLeft, option.rect.bottom(),
                           option.rect.width() - separatorLeft, 1),
                     separatorColor(option.palette));
}

void drawPlaceholder(QPainter& painter, const QRect& area, const QPalette& palette,
                     const QString& text)
{
    painter.setPen(quietTextColor(palette));
    painter.setFont(listFont());
    painter.drawText(area.adjusted(listMargin, 0, -listMargin, 0),
                     static_cast<int>(Qt::AlignCenter) | Qt::TextWordWrap, text);
}

void makePlain(QAbstractItemView& view)
{
    view.setFrameShape(QFrame::NoFrame);
    view.setVerticalScrollBar(new ThinScrollBar(&view));
    view.setVerticalScrollMode(QAbstractItemView::ScrollPerPixel);
    view.setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
    view.setSelectionBehavior(QAbstractItemView::SelectRows);
    view.setSelectionMode(QAbstractItemView::SingleSelection);
    view.setEditTriggers(QAbstractItemView::NoEditTriggers);
    view.setTabKeyNavigation(false);
    view.setFont(listFont());
    leaveKeysToWindow(view);
    QScroller::grabGesture(view.viewport(), QScroller::TouchGesture);
}

} // namespace ventrik
