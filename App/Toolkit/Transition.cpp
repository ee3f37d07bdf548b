#include "App/Toolkit/Transition.h"

#include <QPainter>
#include <QVariantAnimation>

namespace ventrik
{

namespace
{

constexpr int milliseconds = 220;
// The look below moves a part of the way only, as if it lay deeper.
constexpr qreal parallax = 0.3;

} // namespace

Transition::Transition(Kind kind, QWidget& covered, QPixmap before, QPixmap after)
    : QWidget(&covered), _kind(kind), _before(std::move(before)), _after(std::move(after))
{
    setGeometry(covered.rect());
    // Nothing below a sliding screen can be meant by a click; what fades is there already.
    setAttribute(Qt::WA_TransparentForMouseEvents, kind == Kind::Fade);
    auto* animation = new QVariantAnimation(this);
    animation->setDuration(milliseconds);
    animation->setStartValue(0.0);
    animation->setEndValue(1.0);
    animation->setEasingCurve(QEasingCurve::OutCubic);
    connect(animation, &QVariantAnimation::valueChanged, this, [this](const QVariant& value) {
        _progress = value.toReal();
        update();
    });
    connect(animation, &QVariantAnimation::finished, this, &QObject::deleteLater);
    show();
    raise();
    animation->start();
}

void Transition::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    draw(painter);
}

void Transition::draw(QPainter& painter) const
{
    const qreal wide = width();
    switch (_kind) {
    case Kind::Fade:
        painter.setOpacity(1 - _progress);
        painter.drawPixmap(0, 0, _before);
        return;
    case Kind::Push:
        painter.drawPixmap(QPointF(-parallax * _progress * wide, 0), _before);
        painter.drawPixmap(QPointF((1 - _progress) * wide, 0), _after);
        return;
    case Kind::Pop:
        painter.drawPixmap(QPointF(-parallax * (1 - _progress) * wide, 0), _after);
        painter.drawPixmap(QPointF(_progress * wide, 0), _before);
        return;
    }
}

} // namespace ventrik
