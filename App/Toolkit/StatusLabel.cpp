#include "App/Toolkit/StatusLabel.h"

#include "App/Toolkit/Fonts.h"

#include <QEvent>
#include <QMouseEvent>
#include <QPainter>

#include <algorithm>

namespace ventrik
{

namespace
{

QFont noteFont()
{
    return systemFont(11, FontWeight::Regular);
}

} // namespace

void StatusLabel::setNote(const QString& note, NoteKind kind)
{
    if (note == _note && kind == _kind)
        return;
    _note = note;
    _kind = kind;
    setAccessibleDescription(note);
    layOutAgain();
}

void StatusLabel::setAction(std::function<void()> action)
{
    _action = std::move(action);
    setCursor(_action ? Qt::PointingHandCursor : Qt::ArrowCursor);
}

// What is done may replace the label.
void StatusLabel::mouseReleaseEvent(QMouseEvent* event)
{
    if (!_action || event->button() != Qt::LeftButton || !rect().contains(event->pos()))
        return ElidingLabel::mouseReleaseEvent(event);
    const auto action = _action;
    action();
}

void StatusLabel::layOutAgain()
{
    updateGeometry();
    updateTip();
    update();
}

bool StatusLabel::showsNoteBelow() const
{
    return !_note.isEmpty() && parentWidget() && parentWidget()->width() >= widthForTwoLines;
}

bool StatusLabel::showsNoteInstead() const
{
    return !_note.isEmpty() && _kind == NoteKind::Passing && !showsNoteBelow();
}

QSize StatusLabel::sizeHint() const
{
    const QSize status = ElidingLabel::sizeHint();
    if (showsNoteInstead())
        return {measured(_note, font()).width(), status.height()};
    if (!showsNoteBelow())
        return status;
    const QSize below = measured(_note, noteFont());
    return {std::max(status.width(), below.width()), status.height() + below.height()};
}

QString StatusLabel::tip() const
{
    const QString status = ElidingLabel::tip();
    return status.isEmpty() || _note.isEmpty() ? status + _note : status + u'\n' + _note;
}

// What is left of a status in a very narrow bar is to be its end, the time of day.
Qt::TextElideMode StatusLabel::elideMode() const
{
    const bool isCramped = 3 * width() < 2 * measured(text(), font()).width();
    return isCramped && !showsNoteInstead() ? Qt::ElideLeft : Qt::ElideMiddle;
}

bool StatusLabel::event(QEvent* event)
{
    if (event->type() == QEvent::ParentAboutToChange && parentWidget())
        parentWidget()->removeEventFilter(this);
    if (event->type() == QEvent::ParentChange && parentWidget())
        parentWidget()->installEventFilter(this);
    return ElidingLabel::event(event);
}

// The bar's width tells whether there is a second line.
bool StatusLabel::eventFilter(QObject* receiver, QEvent* event)
{
    if (event->type() == QEvent::Resize && receiver == parentWidget())
        layOutAgain();
    return ElidingLabel::eventFilter(receiver, event);
}

void StatusLabel::paintEvent(QPaintEvent* event)
{
    if (!showsNoteBelow() && !showsNoteInstead()) {
        ElidingLabel::paintEvent(event);
        return;
    }
    QPainter painter(this);
    QColor color = palette().color(foregroundRole());
    painter.setPen(color);
    if (showsNoteInstead()) {
        drawLine(painter, rect(), _note);
        return;
    }
    const int statusHeight = ElidingLabel::sizeHint().height();
    drawLine(painter, {0, 0, width(), statusHeight}, text());
    color.setAlphaF(0.7F);
    painter.setPen(color);
    painter.setFont(noteFont());
    drawLine(painter, rect().adjusted(0, statusHeight, 0, 0), _note);
}

} // namespace ventrik
