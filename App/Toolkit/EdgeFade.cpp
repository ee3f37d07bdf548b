#include "App/Toolkit/EdgeFade.h"

#include <QLinearGradient>
#include <QPainter>

namespace ventrik
{

namespace
{

// Above and below, a row draws its separator and its frame.
constexpr int frameWidth = 3;

} // namespace

EdgeFade::EdgeFade(QWidget* parent) : QWidget(parent)
{
    setAttribute(Qt::WA_TransparentForMouseEvents);
    hide();
}

void EdgeFade::layout()
{
    const QRect room = parentWidget()->rect();
    setGeometry(room.right() + 1 - fadeWidth, frameWidth, fadeWidth,
                room.height() - 2 * frameWidth);
    raise();
}

void EdgeFade::setDots(bool visible)
{
    _hasDots = visible;
    update();
}

void EdgeFade::paintEvent(QPaintEvent*)
{
    QColor clear = palette().color(backgroundRole());
    const QColor solid = clear;
    clear.setAlpha(0);
    QLinearGradient gradient(0, 0, width(), 0);
    gradient.setColorAt(0, clear);
    gradient.setColorAt(1, solid);
    QPainter painter(this);
    painter.fillRect(rect(), gradient);
    if (!_hasDots)
        return;
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(palette().color(foregroundRole()));
    painter.setOpacity(0.5);
    for (const int fromRight : {3, 9, 15})
        painter.drawEllipse(QPointF(width() - fromRight, height() / 2.0 + 3), 1.5, 1.5);
}

} // namespace ventrik
