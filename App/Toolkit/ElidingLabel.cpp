#include "App/Toolkit/ElidingLabel.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/PlainText.h"

#include <QEvent>
#include <QPainter>

#include <algorithm>

namespace ventrik
{

namespace
{

// Some letters and the dots.
constexpr int leastWidth = 24;

} // namespace

ElidingLabel::ElidingLabel(QWidget* parent) : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
    setSizePolicy(QSizePolicy::Maximum, QSizePolicy::Fixed);
}

bool ElidingLabel::isElided() const
{
    return measured(text(), font()).width() > width();
}

QSize ElidingLabel::sizeHint() const
{
    return measured(text(), font());
}

QSize ElidingLabel::minimumSizeHint() const
{
    const QSize wanted = sizeHint();
    return {std::min(wanted.width(), leastWidth), wanted.height()};
}

QString ElidingLabel::tip() const
{
    return isElided() ? text() : QString();
}

void ElidingLabel::updateTip()
{
    setToolTip(plainToolTip(tip()));
}

void ElidingLabel::changeEvent(QEvent* event)
{
    QLabel::changeEvent(event);
    if (event->type() == QEvent::FontChange)
        updateTip();
}

void ElidingLabel::resizeEvent(QResizeEvent* event)
{
    QLabel::resizeEvent(event);
    updateTip();
}

void ElidingLabel::drawLine(QPainter& painter, const QRect& line, const QString& text) const
{
    const Qt::Alignment sideways = alignment() & Qt::AlignHorizontal_Mask;
    painter.drawText(line, static_cast<int>(sideways | Qt::AlignVCenter) | Qt::TextSingleLine,
                     painter.fontMetrics().elidedText(text, elideMode(), line.width()));
}

void ElidingLabel::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.setPen(palette().color(foregroundRole()));
    drawLine(painter, rect(), text());
}

} // namespace ventrik
