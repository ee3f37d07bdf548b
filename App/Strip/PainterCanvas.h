#pragma once

#include "Charts/Canvas.h"

#include <QSizeF>

class QFont;
class QPainter;

namespace ventrik
{

/// Measures texts in the system's font, also where nothing is painted.
class FontMeasure : public TextMeasure
{
  public:
    double textWidth(std::string_view text, double size, bool isBold) const override;
};

/// Draws with a painter, which outlives it, on something of that size.
class PainterCanvas : public Canvas
{
  public:
    PainterCanvas(QPainter& painter, const QSizeF& size);

    double width() const override { return _size.width(); }
    double height() const override { return _size.height(); }
    double textWidth(std::string_view text, double size, bool isBold) const override
    {
        return _measure.textWidth(text, size, isBold);
    }

    void line(Point from, Point to, const Stroke& stroke) override;
    void polyline(std::span<const Point> points, const Stroke& stroke) override;
    void fillRect(const Rect& rect, Color color) override;
    void strokeRect(const Rect& rect, const Stroke& stroke) override;
    void text(Point place, std::string_view text, const TextStyle& style) override;
    void pushClip(const Rect& rect) override;
    void popClip() override;

  private:
    QPainter& _painter;
    QSizeF _size;
    FontMeasure _measure;
};

} // namespace ventrik
