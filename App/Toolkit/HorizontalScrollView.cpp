#include "App/Toolkit/HorizontalScrollView.h"

#include <QApplication>
#include <QMouseEvent>
#include <QScrollEvent>
#include <QScrollPrepareEvent>
#include <QScroller>
#include <QWheelEvent>

#include <algorithm>
#include <cstdlib>

namespace ventrik
{

HorizontalScrollView::HorizontalScrollView(QWidget* parent)
    : QWidget(parent), _content(new QWidget(this))
{
    QScroller::grabGesture(this, QScroller::TouchGesture);
}

void HorizontalScrollView::setContentSize(const QSize& size)
{
    _content->resize(size);
    setContentOffset(contentOffset());
}

int HorizontalScrollView::largestOffset() const
{
    return std::max(0, _content->width() - width());
}

void HorizontalScrollView::setContentOffset(int offset)
{
    const int kept = std::clamp(offset, 0, largestOffset());
    if (kept == contentOffset())
        return;
    _content->move(-kept, 0);
    if (_scrolled)
        _scrolled();
}

void HorizontalScrollView::resizeEvent(QResizeEvent*)
{
    setContentOffset(contentOffset());
}

bool HorizontalScrollView::event(QEvent* event)
{
    if (event->type() == QEvent::ScrollPrepare && largestOffset() > 0) {
        auto& prepare = static_cast<QScrollPrepareEvent&>(*event);
        prepare.setViewportSize(size());
        prepare.setContentPosRange({0, 0, static_cast<qreal>(largestOffset()), 0});
        prepare.setContentPos({static_cast<qreal>(contentOffset()), 0});
        prepare.accept();
        return true;
    }
    if (event->type() == QEvent::Scroll) {
        setContentOffset(qRound(static_cast<QScrollEvent&>(*event).contentPos().x()));
        return true;
    }
    return QWidget::event(event);
}

void HorizontalScrollView::wheelEvent(QWheelEvent* event)
{
    const QPoint delta = event->angleDelta();
    const bool isTurned = event->modifiers().testFlag(Qt::ShiftModifier) && delta.x() == 0;
    const int sideways = isTurned ? delta.y() : delta.x();
    if (largestOffset() == 0 || std::abs(sideways) <= (isTurned ? 0 : std::abs(delta.y()))) {
        event->ignore();
        return;
    }
    setContentOffset(contentOffset() - sideways / 2);
    event->accept();
}

void HorizontalScrollView::mousePressEvent(QMouseEvent* event)
{
    _pressPosition = event->pos();
    _pressOffset = contentOffset();
    event->ignore(); // the press may as well become a click on the row
}

void HorizontalScrollView::mouseMoveEvent(QMouseEvent* event)
{
    const int dragged = _pressPosition.x() - event->pos().x();
    const bool isDrag =
        std::abs(dragged) >= QApplication::startDragDistance() || contentOffset() != _pressOffset;
    if (event->buttons().testFlag(Qt::LeftButton) && isDrag)
        setContentOffset(_pressOffset + dragged);
    event->ignore();
}

} // namespace ventrik
