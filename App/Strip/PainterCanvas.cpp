#include "App/Strip/PainterCanvas.h"

#include "App/Toolkit/Fonts.h"

#include <QFontMetricsF>
#include <QPaintDevice>
#include <QPainter>
#include <QPolygonF>

#include <algorithm>
#include <array>
#include <cmath>

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

// Whether it only goes up, down and sideways; within a column of pixels it may lean.
bool isUpright(std::span<const Point> points)
{
    for (std::size_t place = 1; place < points.size(); ++place)
        if (std::abs(points[place].x - points[place - 1].x) >= 1 &&
            points[place].y != points[place - 1].y)
            return false;
    return true;
}

double lengthOf(std::span<const Point> points)
{
    double length = 0;
    for (std::size_t place = 1; place < points.size(); ++place)
        length += std::hypot(points[place].x - points[place - 1].x,
                             points[place].y - points[place - 1].y);
    return length;
}

// To stroke a line smoothly takes about half a microsecond a pixel; those of a busy one are many.
constexpr double longestSmooth = 6000;

/// Draws steps as rectangles on whole pixels, which is fast and, for straight lines, crisp.
class StepPainter
{
  public:
    StepPainter(QPainter& painter, const Stroke& stroke)
        : _painter(painter),
          _pixels(painter.device()->devicePixelRatioF()),
          _width(std::max(1.0, std::round(stroke.width * _pixels))),
          _color(qtColor(stroke.color)),
          _lengths(dashLengths(stroke.dash)),
          _unit(stroke.width)
    {
    }

    void draw(std::span<const Point> points)
    {
        _isBusy = points.size() > 2;
        for (std::size_t place = 1; place < points.size(); ++place)
            segment(points[place - 1], points[place]);
        const bool isSmooth = _painter.testRenderHint(QPainter::Antialiasing);
        _painter.setRenderHint(QPainter::Antialiasing, false);
        for (const QRectF& rect : _rects)
            _painter.fillRect(rect, _color);
        _painter.setRenderHint(QPainter::Antialiasing, isSmooth);
    }

  private:
    // Long ways up and down, of which a busy line has many, are not worth their dashes.
    static constexpr double longestDashed = 40;

    void segment(Point from, Point to)
    {
        const bool isUp = std::abs(to.x - from.x) < 1 && from.y != to.y;
        const double length = isUp ? std::abs(to.y - from.y) : std::abs(to.x - from.x);
        if (_lengths.empty() || (_isBusy && isUp && length > longestDashed))
            piece(from, to);
        else
            dash(from, to, length);
    }

    void dash(Point from, Point to, double length)
    {
        double done = 0;
        while (done < length) {
            const double left = _lengths[_dash] * _unit - _used;
            const double next = std::min(length, done + left);
            if (_dash % 2 == 0)
                piece(between(from, to, done / length), between(from, to, next / length));
            _used += next - done;
            if (next < length || left <= next - done) {
                _dash = (_dash + 1) % _lengths.size();
                _used = 0;
            }
            done = next;
        }
    }

    static Point between(Point from, Point to, double share)
    {
        return {from.x + (to.x - from.x) * share, from.y + (to.y - from.y) * share};
    }

    void piece(Point from, Point to)
    {
        const double left = snapped(std::min(from.x, to.x));
        const double top = snapped(std::min(from.y, to.y));
        const double right = snapped(std::max(from.x, to.x)) + _width;
        const double bottom = snapped(std::max(from.y, to.y)) + _width;
        _rects.append(QRectF(left / _pixels, top / _pixels, (right - left) / _pixels,
                             (bottom - top) / _pixels));
    }

    // Where a stroke begins whose middle is there, in the device's pixels.
    double snapped(double middle) const { return std::round(middle * _pixels - _width / 2); }

    QPainter& _painter;
    double _pixels;
    double _width; ///< in the device's pixels
    QColor _color;
    std::span<const double> _lengths;
    double _unit;
    bool _isBusy = false;
    std::size_t _dash = 0;
    double _used = 0;
    QList<QRectF> _rects;
};

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
    polyline(std::array{from, to}, stroke);
}

void PainterCanvas::polyline(std::span<const Point> points, const Stroke& stroke)
{
    if (points.size() == 2 || lengthOf(points) > longestSmooth)
        if (isUpright(points)) {
            StepPainter(_painter, stroke).draw(points);
            return;
        }
    QPolygonF corners;
    corners.reserve(static_cast<qsizetype>(points.size()));
    for (const Point& point : points)
        corners.append(qtPoint(point));
    _painter.setPen(penOf(stroke));
    _painter.drawPolyline(corners);
}

// On whole pixels, as lines are.
void PainterCanvas::fillRect(const Rect& rect, Color color)
{
    const double pixels = _painter.device()->devicePixelRatioF();
    const auto snapped = [pixels](double place) { return std::round(place * pixels) / pixels; };
    const QPointF start(snapped(rect.x), snapped(rect.y));
    const QPointF end(snapped(rect.right()), snapped(rect.bottom()));
    _painter.fillRect(QRectF(start, end), qtColor(color));
}

void PainterCanvas::strokeRect(const Rect& rect, const Stroke& stroke)
{
    const Point start{rect.x, rect.y};
    const std::array corners{start, Point{rect.right(), rect.y}, Point{rect.right(), rect.bottom()},
                             Point{rect.x, rect.bottom()}, start};
    polyline(corners, stroke);
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
