#pragma once

#include "Charts/TextEstimate.h"

#include <string>

namespace ventrik
{

/// Writes what is drawn as a picture in SVG that stands by itself: no scripts, no links to others.
/// Several fit into one page.
class SvgCanvas : public Canvas
{
  public:
    /// `title` is what assistive technology says of the picture.
    SvgCanvas(double width, double height, std::string_view title = {});

    double width() const override { return _width; }
    double height() const override { return _height; }
    double textWidth(std::string_view text, double size, bool isBold) const override
    {
        return _estimate.textWidth(text, size, isBold);
    }

    void line(Point from, Point to, const Stroke& stroke) override;
    void polyline(std::span<const Point> points, const Stroke& stroke) override;
    void fillRect(const Rect& rect, Color color) override;
    void strokeRect(const Rect& rect, const Stroke& stroke) override;
    void text(Point place, std::string_view text, const TextStyle& style) override;
    void pushClip(const Rect& rect) override;
    void popClip() override;

    /// The whole document as it stands.
    std::string document() const;

  private:
    double _width;
    double _height;
    std::string _head;
    std::string _body;
    int _openClips = 0;
    TextEstimate _estimate;
};

} // namespace ventrik
