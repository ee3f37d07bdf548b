#pragma once

#include "Charts/TextEstimate.h"

#include <string>
#include <utility>
#include <vector>

namespace ventrik
{

struct DrawnText {
    std::string text;
    Point place;
    TextStyle style;
};

/// Remembers what is drawn on it.
class RecordingCanvas : public Canvas
{
  public:
    RecordingCanvas(double width, double height) : _width(width), _height(height) {}

    double width() const override { return _width; }
    double height() const override { return _height; }
    double textWidth(std::string_view text, double size, bool isBold) const override
    {
        return TextEstimate().textWidth(text, size, isBold);
    }
    void line(Point from, Point to, const Stroke&) override { lines.emplace_back(from, to); }
    void polyline(std::span<const Point> points, const Stroke& stroke) override
    {
        polylines.emplace_back(points.begin(), points.end());
        strokes.push_back(stroke);
    }
    void fillRect(const Rect& rect, Color color) override { fills.emplace_back(rect, color); }
    void strokeRect(const Rect&, const Stroke&) override {}
    void text(Point place, std::string_view text, const TextStyle& style) override
    {
        texts.push_back({std::string(text), place, style});
    }
    void pushClip(const Rect&) override { ++openClips; }
    void popClip() override { --openClips; }

    /// Null where that has not been written.
    const DrawnText* find(std::string_view text) const
    {
        for (const DrawnText& drawn : texts)
            if (drawn.text == text)
                return &drawn;
        return nullptr;
    }
    bool has(std::string_view text) const { return find(text) != nullptr; }
    Rect extentOf(const DrawnText& drawn) const
    {
        const double wide = textWidth(drawn.text, drawn.style.size, drawn.style.isBold);
        const double left = drawn.style.anchor == Anchor::Start    ? 0
                            : drawn.style.anchor == Anchor::Middle ? wide / 2
                                                                   : wide;
        return {drawn.place.x - left, drawn.place.y - drawn.style.size * 0.75, wide,
                drawn.style.size * 0.75};
    }

    std::vector<DrawnText> texts;
    std::vector<std::pair<Point, Point>> lines;
    std::vector<std::vector<Point>> polylines;
    std::vector<Stroke> strokes; ///< of the polylines
    std::vector<std::pair<Rect, Color>> fills;
    int openClips = 0;

  private:
    double _width;
    double _height;
};

} // namespace ventrik
