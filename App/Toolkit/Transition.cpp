#include "App/Toolkit/Transition.h"

#include <QPainter>
#include <QStyle>
#include <QVariantAnimation>

#include <algorithm>
#include <optional>
#include <utility>

namespace ventrik
{

namespace
{

constexpr int milliseconds = 220;
// The look below moves a part of the way only, as if it lay deeper.
constexpr qreal parallax = 0.3;

// The least and the greatest place at which two lines differ; none where they are equal.
std::optional<std::pair<int, int>> differenceOf(const QRgb* one, const QRgb* other, int width)
{
    const auto [from, unused] = std::mismatch(one, one + width, other);
    if (from == one + width)
        return std::nullopt;
    int last = width - 1;
    while (one[last] == other[last])
        --last;
    return std::pair(static_cast<int>(from - one), last);
}

// The part, in points, in which two pictures of one size differ.
QRect differenceOf(const QPixmap& before, const QPixmap& after)
{
    const QImage one = before.toImage().convertToFormat(QImage::Format_ARGB32);
    const QImage other = after.toImage().convertToFormat(QImage::Format_ARGB32);
    if (one.size() != other.size())
        return QRect(QPoint(), after.deviceIndependentSize().toSize());
    QRect result;
    for (int y = 0; y < one.height(); ++y)
        if (const auto part =
                differenceOf(reinterpret_cast<const QRgb*>(one.constScanLine(y)),
                             reinterpret_cast<const QRgb*>(other.constScanLine(y)), one.width()))
            result |= QRect(QPoint(part->first, y), QPoint(part->second, y));
    const qreal scale = 1 / after.devicePixelRatio();
    return QRectF(QPointF(result.topLeft()) * scale, QSizeF(result.size()) * scale).toAlignedRect();
}

} // namespace

bool Transition::isWanted(const QWidget& widget)
{
    return widget.style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, &widget) > 0;
}

Transition::Transition(Kind kind, QWidget& covered, QPixmap before, QPixmap after)
    : QWidget(&covered), _kind(kind), _before(std::move(before)), _after(std::move(after))
{
    setGeometry(kind == Kind::Fade ? differenceOf(_before, _after) : covered.rect());
    // Nothing below a sliding screen can be meant by a click; what fades is there already.
    setAttribute(Qt::WA_TransparentForMouseEvents, kind == Kind::Fade);
    if (size().isEmpty())
        deleteLater();
    else
        start();
}

void Transition::start()
{
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
        drawFade(painter);
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

// First the old look over the background, then the background over the new one: two texts never
// stand on each other.
void Transition::drawFade(QPainter& painter) const
{
    const bool isFirstHalf = _progress < 0.5;
    painter.setOpacity(isFirstHalf ? 1 : 2 - 2 * _progress);
    painter.fillRect(rect(), palette().color(QPalette::Window));
    if (!isFirstHalf)
        return;
    painter.setOpacity(1 - 2 * _progress);
    painter.drawPixmap(-pos(), _before);
}

void Transition::drawMoved(QPainter& painter, const QPixmap& look, qreal right, qreal down) const
{
    painter.drawPixmap(QPointF(right * width(), down * height()), look);
}

} // namespace ventrik
