#include "App/Toolkit/Transition.h"

#include <QPainter>
#include <QStyle>
#include <QVariantAnimation>

namespace ventrik
{

namespace
{

constexpr int milliseconds = 220;
// The look below moves a part of the way only, as if it lay deeper.
constexpr qreal parallax = 0.3;

} // namespace

bool Transition::isWanted(const QWidget& widget)
{
    return widget.style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, &widget) > 0;
}

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
    const qreal left = 1 - _progress;
    switch (_kind) {
    case Kind::Fade:
        painter.setOpacity(left);
        painter.drawPixmap(0, 0, _before);
        return;
    case Kind::Push:
        drawMoved(painter, _before, -parallax * _progress, 0);
        drawMoved(painter, _after, left, 0);
        return;
    case Kind::Pop:
        drawMoved(painter, _after, -parallax * left, 0);
        drawMoved(painter, _before, _progress, 0);
        return;
    case Kind::Rise:
        drawMoved(painter, _before, 0, 0);
        drawMoved(painter, _after, 0, left);
        return;
    case Kind::Sink:
        drawMoved(painter, _after, 0, 0);
        drawMoved(painter, _before, 0, _progress);
        return;
    }
}

void Transition::drawMoved(QPainter& painter, const QPixmap& look, qreal right, qreal down) const
{
    painter.drawPixmap(QPointF(right * width(), down * height()), look);
}

} // namespace ventrik
