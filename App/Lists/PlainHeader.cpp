#include "App/Lists/PlainHeader.h"

#include "App/Lists/ListLook.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/Separator.h"

#include <QPainter>

namespace ventrik
{

namespace
{

constexpr int arrowWidth = 7;
constexpr int arrowHeight = 4;
constexpr int arrowGap = 3;

void drawArrow(QPainter& painter, const QPointF& middle, bool pointsUp)
{
    const double half = arrowWidth / 2.0;
    const double tip = (pointsUp ? -1 : 1) * arrowHeight / 2.0;
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setBrush(painter.pen().color());
    painter.drawPolygon(QPolygonF{middle + QPointF(-half, -tip), middle + QPointF(half, -tip),
                                  middle + QPointF(0, tip)});
}

} // namespace

PlainHeader::PlainHeader(QWidget* parent) : QHeaderView(Qt::Horizontal, parent)
{
    setFont(listHeaderFont());
    setSectionsClickable(true);
    setSortIndicatorShown(true);
    setSortIndicatorClearable(true);
    setSortIndicator(-1, Qt::AscendingOrder);
    setMinimumSectionSize(1);
    viewport()->setBackgroundRole(QPalette::Base);
}

QSize PlainHeader::sizeHint() const
{
    return {QHeaderView::sizeHint().width(), height};
}

int PlainHeader::neededWidth(const QString& name)
{
    return measured(name, listHeaderFont()).width() + 2 * (arrowWidth + arrowGap);
}

void PlainHeader::paintEvent(QPaintEvent* event)
{
    {
        QPainter painter(viewport());
        painter.fillRect(viewport()->rect(), palette().color(QPalette::Base));
        painter.fillRect(0, viewport()->height() - 1, viewport()->width(), 1,
                         separatorColor(palette()));
    }
    QHeaderView::paintEvent(event);
}

// The arrow stands on the side where numbers do not end.
void PlainHeader::paintSection(QPainter* painter, const QRect& rect, int section) const
{
    const auto alignment =
        Qt::Alignment(model()->headerData(section, Qt::Horizontal, Qt::TextAlignmentRole).toInt());
    const QString name = model()->headerData(section, Qt::Horizontal, Qt::DisplayRole).toString();
    const bool isLeft = alignment.testFlag(Qt::AlignLeft);
    const QRect area = rect.adjusted(isLeft ? listMargin : 0, 0, isLeft ? 0 : -listMargin, 0);
    const bool isSorted = sortIndicatorSection() == section;
    painter->fillRect(rect.adjusted(0, 0, 0, -1), palette().color(QPalette::Base));
    painter->setPen(isSorted ? palette().color(QPalette::Text) : quietTextColor(palette()));
    painter->setFont(listHeaderFont());
    painter->drawText(area, static_cast<int>(alignment), name);
    if (!isSorted)
        return;
    const int width = measured(name, listHeaderFont()).width();
    const double beside = width + arrowGap + arrowWidth / 2.0;
    drawArrow(*painter,
              {isLeft ? area.left() + beside : area.right() - beside, area.center().y() + 0.5},
              sortIndicatorOrder() == Qt::AscendingOrder);
}

} // namespace ventrik
