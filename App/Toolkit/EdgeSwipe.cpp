#include "App/Toolkit/EdgeSwipe.h"

#include "App/Toolkit/HorizontalScrollView.h"

#include <QApplication>
#include <QMouseEvent>
#include <QTouchEvent>
#include <QWidget>

#include <cmath>

namespace ventrik
{

namespace
{

// The place of the one finger or of the mouse, in global coordinates.
QPointF positionOf(QEvent& event)
{
    return static_cast<QPointerEvent&>(event).point(0).globalPosition();
}

} // namespace

EdgeSwipe::EdgeSwipe(QWidget& widget, std::function<void()> swiped)
    : QObject(&widget), _widget(widget), _swiped(std::move(swiped))
{
    // The events go to the children, and those that use them do not pass them on.
    qApp->installEventFilter(this);
}

bool EdgeSwipe::isMine(QObject* receiver) const
{
    const auto* widget = receiver->isWidgetType() ? static_cast<QWidget*>(receiver) : nullptr;
    return widget && (widget == &_widget || _widget.isAncestorOf(widget));
}

bool EdgeSwipe::eventFilter(QObject* receiver, QEvent* event)
{
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::MouseButtonPress:
        if (isMine(receiver))
            begin(positionOf(*event));
        break;
    case QEvent::TouchUpdate:
    case QEvent::MouseMove:
        if (_isWatching && isMine(receiver))
            moveTo(positionOf(*event));
        break;
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
    case QEvent::MouseButtonRelease:
        end();
        break;
    default:
        break;
    }
    return false;
}

// Is the place on something that has been moved sideways and takes the drag for itself?
bool EdgeSwipe::movesSomethingBack(const QPointF& position) const
{
    const QWidget* widget = _widget.childAt(_widget.mapFromGlobal(position).toPoint());
    for (; widget && widget != &_widget; widget = widget->parentWidget())
        if (const auto* view = dynamic_cast<const HorizontalScrollView*>(widget))
            return view->contentOffset() > 0;
    return false;
}

void EdgeSwipe::begin(const QPointF& position)
{
    const qreal fromEdge = _widget.mapFromGlobal(position).x();
    _start = position;
    _isWatching = fromEdge >= 0 && fromEdge < edgeWidth && !movesSomethingBack(position);
}

void EdgeSwipe::moveTo(const QPointF& position)
{
    const QPointF way = position - _start;
    if (way.x() < shortestSwipe)
        return;
    end();
    if (way.x() > 2 * std::abs(way.y()))
        _swiped();
}

} // namespace ventrik
