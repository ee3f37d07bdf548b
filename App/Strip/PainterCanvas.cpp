#include "App/Strip/PainterCanvas.h"

#include "App/Toolkit/Fonts.h"

#include <QFontMetricsF>
#include <QPainter>
#include <QPolygonF>

namespace ventrik
{

namespace
{

QString qtText(std::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

QColor qtColor(Color color)
{
    return {color.red, color.green, color.blue, color.alpha};
}

QPointF qtPoint(Point point)
{
    return {point.x, point.y};
}

QRectF qtRect(const Rect& rect)
{
    return {rect.x, rect.y, rect.width, rect.height};
}

QFont fontOf(double size, bool isBold)
{
    return systemFont(qRound(size), isBold ? FontWeight::Bold : FontWeight::Regular);
}

QPen penOf(const Stroke& stroke)
{
    QPen pen(qtColor(stroke.color), stroke.width);
    pen.setCapStyle(Qt::FlatCap);
    pen.setJoinStyle(Qt::BevelJoin);
    const auto lengths = dashLengths(stroke.dash);
    if (!lengths.empty())
        pen.setDashPattern(QList<qreal>(lengths.begin(), lengths.end()));
    return pen;
}

double startOf(double width, Anchor anchor)
{
    return anchor == Anchor::Start ? 0 : anchor == Anchor::Middle ? -width / 2 : -width;
}

} // namespace

double FontMeasure::textWidth(std::string_view text, double size, bool isBold) const
{
    return QFontMetricsF(fontOf(size, isBold)).horizontalAdvance(qtText(text));
}

PainterCanvas::PainterCanvas(QPainter& painter, const QSizeF& size) : _painter(painter), _size(size)
{
    _painter.setRenderHint(QPainter::Antialiasing);
}

void PainterCanvas::line(Point from, Point to, const Stroke& stroke)
{
    _painter.setPen(penOf(stroke));
    _painter.drawLine(qtPoint(from), qtPoint(to));
}

void PainterCanvas::polyline(std::span<const Point> points, const Stroke& stroke)
{
    QPolygonF corners;
    corners.reserve(static_cast<qsizetype>(points.size()));
    for (const Point& point : points)
        corners.append(qtPoint(point));
    _painter.setPen(penOf(stroke));
    _painter.drawPolyline(corners);
}

void PainterCanvas::fillRect(const Rect& rect, Color color)
{
    _painter.fillRect(qtRect(rect), qtColor(color));
}

void PainterCanvas::strokeRect(const Rect& rect, const Stroke& stroke)
{
    _painter.setPen(penOf(stroke));
    _painter.setBrush(Qt::NoBrush);
    _painter.drawRect(qtRect(rect));
}

void PainterCanvas::text(Point place, std::string_view text, const TextStyle& style)
{
    const QString shown = qtText(text);
    const QFont font = fontOf(style.size, style.isBold);
    const double start = startOf(QFontMetricsF(font).horizontalAdvance(shown), style.anchor);
    _painter.setFont(font);
    _painter.setPen(qtColor(style.color));
    if (style.rotation == 0) {
        _painter.drawText(QPointF(place.x + start, place.y), shown);
        return;
    }
    _painter.save();
    _painter.translate(qtPoint(place));
    _painter.rotate(style.rotation);
    _painter.drawText(QPointF(start, 0), shown);
    _painter.restore();
}

void PainterCanvas::pushClip(const Rect& rect)
{
    _painter.save();
    _painter.setClipRect(qtRect(rect), Qt::IntersectClip);
}

void PainterCanvas::popClip()
{
    _painter.restore();
}

} // namespace ventrik
