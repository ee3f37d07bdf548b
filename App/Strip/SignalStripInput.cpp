// How the strip is moved: by mouse and wheel, by fingers, by a touch pad's gestures and by keys.
#include "App/Strip/SignalStrip.h"

#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QNativeGestureEvent>
#include <QStyleHints>
#include <QTouchEvent>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr double mouseReach = 6; // how near to a cursor a drag takes it
constexpr double fingerReach = 16;
constexpr double keyZoom = 1.5;

double distance(const QPointF& one, const QPointF& other)
{
    return std::hypot(one.x() - other.x(), one.y() - other.y());
}

} // namespace

double SignalStrip::lengthOfPixel() const
{
    return static_cast<double>(_range.length().count()) / chart().plot().width;
}

// A time that there is.
Clock::TimePoint SignalStrip::timeAt(double x) const
{
    const Rect& plot = chart().plot();
    const auto time = chart().times().time(std::clamp(x, plot.x, plot.right()));
    return std::clamp(time, _data.first, std::max(_data.first, _data.last));
}

SignalStrip::Grip SignalStrip::gripAt(double x, double reach) const
{
    const auto isNear = [&](const std::optional<Clock::TimePoint>& cursor) {
        return cursor && std::abs(xOf(*cursor) - x) <= reach;
    };
    if (isNear(_cursor))
        return Grip::Cursor;
    return isNear(_secondCursor) ? Grip::SecondCursor : Grip::View;
}

void SignalStrip::press(const QPointF& position, double reach)
{
    _isDragging = false;
    _pressPosition = position;
    _pressFirst = _range.first();
    _grip = hasData() ? gripAt(position.x(), reach) : Grip::None;
}

void SignalStrip::moveTo(const QPointF& position)
{
    if (_grip == Grip::None)
        return;
    const double moved = position.x() - _pressPosition.x();
    // A cursor goes along at once; the view must not move with a click.
    const int least = _grip == Grip::View ? QApplication::startDragDistance() : 2;
    if (!_isDragging && std::abs(moved) < least)
        return;
    _isDragging = true;
    if (_grip == Grip::Cursor)
        choose(Which::First, timeAt(position.x()));
    else if (_grip == Grip::SecondCursor)
        choose(Which::Second, timeAt(position.x()));
    else {
        const auto way = static_cast<StripRange::Duration::rep>(moved * lengthOfPixel());
        _range.moveTo(_pressFirst - StripRange::Duration(way));
        showAnew();
    }
}

void SignalStrip::release(const QPointF& position, bool isSecond)
{
    const bool isClick = _grip != Grip::None && !_isDragging;
    _grip = Grip::None;
    _isDragging = false;
    if (!isClick)
        return;
    _cursorBeforeClick = _cursor;
    choose(isSecond ? Which::Second : Which::First, timeAt(position.x()));
}

// The first of the two clicks was not meant to choose a moment.
void SignalStrip::clickedTwice()
{
    _grip = Grip::None;
    if (_cursor && !_cursorBeforeClick)
        goLive();
    else if (_cursorBeforeClick && _cursor != _cursorBeforeClick)
        choose(Which::First, *_cursorBeforeClick);
    fit();
}

void SignalStrip::zoomAt(double factor, double x)
{
    if (!hasData() || !(factor > 0))
        return;
    _range.zoom(factor, timeAt(x));
    showAnew();
}

void SignalStrip::choose(Which which, Clock::TimePoint time)
{
    auto& cursor = which == Which::First ? _cursor : _secondCursor;
    if (cursor == time)
        return;
    cursor = time;
    _range.reveal(time);
    showAnew();
    if (which == Which::First && _listener.onMoment)
        _listener.onMoment(time);
}

void SignalStrip::goLive()
{
    _cursor.reset();
    _range.follow();
    showAnew();
    if (_listener.onLive)
        _listener.onLive();
}

void SignalStrip::mousePressEvent(QMouseEvent* event)
{
    if (event->button() == Qt::LeftButton)
        press(event->position(), mouseReach);
}

void SignalStrip::mouseMoveEvent(QMouseEvent* event)
{
    if (event->buttons().testFlag(Qt::LeftButton))
        moveTo(event->position());
}

void SignalStrip::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() == Qt::LeftButton)
        release(event->position(), event->modifiers().testFlag(Qt::ShiftModifier));
}

void SignalStrip::mouseDoubleClickEvent(QMouseEvent* event)
{
    if (event->button() == Qt::LeftButton && hasData())
        clickedTwice();
}

// A notch is a factor of about 1.4; sideways moves.
void SignalStrip::wheelEvent(QWheelEvent* event)
{
    const QPoint delta = event->angleDelta();
    event->accept();
    if (std::abs(delta.x()) <= std::abs(delta.y())) {
        zoomAt(std::exp2(-delta.y() / 240.0), event->position().x());
        return;
    }
    const QPoint pixels = event->pixelDelta();
    const double way = pixels.isNull() ? delta.x() / 2.0 : pixels.x();
    _range.pan(
        StripRange::Duration(static_cast<StripRange::Duration::rep>(-way * lengthOfPixel())));
    showAnew();
}

bool SignalStrip::event(QEvent* event)
{
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
        return useTouch(static_cast<QTouchEvent&>(*event));
    case QEvent::NativeGesture:
        return useGesture(static_cast<QNativeGestureEvent&>(*event)) || QWidget::event(event);
    default:
        return QWidget::event(event);
    }
}

bool SignalStrip::useGesture(const QNativeGestureEvent& event)
{
    if (event.gestureType() != Qt::ZoomNativeGesture)
        return false;
    zoomAt(1 / std::max(0.1, 1 + event.value()), event.position().x());
    return true;
}

// One finger does what a mouse does, two pinch.
bool SignalStrip::useTouch(QTouchEvent& event)
{
    event.accept();
    const bool isEnd = event.type() == QEvent::TouchEnd || event.type() == QEvent::TouchCancel;
    if (event.points().isEmpty())
        return true;
    const QPointF position = event.points().first().position();
    if (event.type() == QEvent::TouchBegin) {
        setFocus(Qt::MouseFocusReason);
        _wasPinched = false;
        _pinchWidth = 0;
        press(position, fingerReach);
    }
    if (event.points().size() > 1 && !isEnd)
        usePinch(event);
    else if (event.type() == QEvent::TouchUpdate && !_wasPinched)
        moveTo(position);
    else if (event.type() == QEvent::TouchEnd && !_wasPinched)
        tap(event);
    if (isEnd)
        _grip = Grip::None;
    return true;
}

void SignalStrip::usePinch(const QTouchEvent& event)
{
    _wasPinched = true;
    const QPointF one = event.points().at(0).position();
    const QPointF other = event.points().at(1).position();
    const double width = std::max(8.0, distance(one, other));
    // A finger that comes, or comes back, begins anew.
    const bool isMove = !event.touchPointStates().testAnyFlags(
        {QEventPoint::State::Pressed, QEventPoint::State::Released});
    if (_pinchWidth > 0 && isMove)
        zoomAt(_pinchWidth / width, (one.x() + other.x()) / 2);
    _pinchWidth = width;
}

void SignalStrip::tap(const QTouchEvent& event)
{
    const QPointF position = event.points().first().position();
    const auto interval =
        static_cast<std::uint64_t>(QGuiApplication::styleHints()->mouseDoubleClickInterval());
    const bool isTap = !_isDragging && _grip != Grip::None;
    if (isTap && _lastTap && event.timestamp() - *_lastTap <= interval &&
        distance(position, _lastTapPosition) <= 2 * fingerReach) {
        _lastTap.reset();
        clickedTwice();
        return;
    }
    release(position, false);
    _lastTap = isTap ? std::optional(event.timestamp()) : std::nullopt;
    _lastTapPosition = position;
}

void SignalStrip::keyPressEvent(QKeyEvent* event)
{
    if (useKey(*event)) {
        _showsKeyboardFrame = true;
        update();
    } else {
        QWidget::keyPressEvent(event);
    }
}

bool SignalStrip::useKey(const QKeyEvent& event)
{
    if (!hasData())
        return false;
    if (event.modifiers().testFlag(Qt::AltModifier) || event.modifiers().testFlag(Qt::MetaModifier))
        return false;
    switch (event.key()) {
    case Qt::Key_Left:
    case Qt::Key_Right:
        return useSidewaysKey(event);
    case Qt::Key_Escape:
        return dropSecondCursor();
    case Qt::Key_Home:
        goLive();
        return true;
    default:
        break;
    }
    if (event.text() == u"+" || event.text() == u"=")
        zoomByKey(1 / keyZoom);
    else if (event.text() == u"-")
        zoomByKey(keyZoom);
    else if (event.text().toLower() == u"f")
        fit();
    else if (event.text().toLower() == u"x")
        choose(Which::Second, _cursor.value_or(_data.last));
    else
        return false;
    return true;
}

bool SignalStrip::useSidewaysKey(const QKeyEvent& event)
{
    const bool isForward = event.key() == Qt::Key_Right;
    if (event.modifiers().testFlag(Qt::ControlModifier)) {
        _range.pan(isForward ? _range.length() / 4 : -_range.length() / 4);
        showAnew();
        return true;
    }
    const bool isSecond = event.modifiers().testFlag(Qt::ShiftModifier);
    step(isSecond ? Which::Second : Which::First, isForward);
    return true;
}

bool SignalStrip::dropSecondCursor()
{
    if (!_secondCursor)
        return false;
    _secondCursor.reset();
    showAnew();
    return true;
}

// Around the cursor where it shows, else around the newest while it is followed.
void SignalStrip::zoomByKey(double factor)
{
    const bool isCursorShown = _cursor && *_cursor >= _range.first() && *_cursor <= _range.last();
    const auto middle = _range.first() + _range.length() / 2;
    const auto usual = _range.isFollowing() ? _range.last() : middle;
    _range.zoom(factor, isCursorShown ? *_cursor : usual);
    showAnew();
}

// The second cursor begins where the first one stands.
void SignalStrip::step(Which which, bool isForward)
{
    const auto& own = which == Which::First ? _cursor : _secondCursor;
    const auto from = own ? *own : _cursor.value_or(_data.last);
    if (const auto next = neighbor(from, isForward))
        choose(which, *next);
}

// The nearest time before or after at which a point of any line begins.
std::optional<Clock::TimePoint> SignalStrip::neighbor(Clock::TimePoint time, bool isForward) const
{
    std::optional<Clock::TimePoint> nearest;
    for (const ChartLine& line : _data.lines) {
        const auto found =
            isForward ? std::ranges::upper_bound(line.points, time, {}, &SeriesPoint::from)
                      : std::ranges::lower_bound(line.points, time, {}, &SeriesPoint::from);
        if (found == (isForward ? line.points.end() : line.points.begin()))
            continue;
        const auto begin = isForward ? found->from : std::prev(found)->from;
        if (!nearest || (isForward ? begin < *nearest : begin > *nearest))
            nearest = begin;
    }
    return nearest;
}

} // namespace ventrik
