#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace ventrik
{

struct Color {
    std::uint8_t red = 0;
    std::uint8_t green = 0;
    std::uint8_t blue = 0;
    std::uint8_t alpha = 255;
    bool operator==(const Color&) const = default;
};

/// The color of "0xRRGGBB".
constexpr Color rgb(std::uint32_t code)
{
    return {static_cast<std::uint8_t>(code >> 16), static_cast<std::uint8_t>(code >> 8),
            static_cast<std::uint8_t>(code)};
}

/// A place in device-independent pixels; y counts downward.
struct Point {
    double x = 0;
    double y = 0;
    bool operator==(const Point&) const = default;
};

struct Rect {
    double x = 0;
    double y = 0;
    double width = 0;
    double height = 0;
    constexpr double right() const { return x + width; }
    constexpr double bottom() const { return y + height; }
    bool operator==(const Rect&) const = default;
};

enum class Dash { Solid, Dashed, Dotted, DashDotted };

struct Stroke {
    Color color = {};
    double width = 1;
    Dash dash = Dash::Solid;
};

/// The lengths of a dash pattern in widths of the stroke, drawn and left out in turn. None for a
/// solid one.
std::span<const double> dashLengths(Dash dash);

/// Which part of a text stands at its place.
enum class Anchor { Start, Middle, End };

struct TextStyle {
    Color color = {};
    double size = 11; ///< pixels
    Anchor anchor = Anchor::Start;
    bool isBold = false;
    double rotation = 0; ///< degrees clockwise around the place
};

/// Tells how wide texts are, so that labels find their places before anything is drawn.
class TextMeasure
{
  public:
    virtual ~TextMeasure() = default;
    virtual double textWidth(std::string_view text, double size, bool isBold = false) const = 0;
};

/// What charts are drawn on: a window, a picture or a file.
class Canvas : public TextMeasure
{
  public:
    virtual double width() const = 0;
    virtual double height() const = 0;

    virtual void line(Point from, Point to, const Stroke& stroke) = 0;
    virtual void polyline(std::span<const Point> points, const Stroke& stroke) = 0;
    virtual void fillRect(const Rect& rect, Color color) = 0;
    virtual void strokeRect(const Rect& rect, const Stroke& stroke) = 0;
    /// The place is on the text's base line.
    virtual void text(Point place, std::string_view text, const TextStyle& style) = 0;

    /// Nothing is drawn outside until the matching popClip.
    virtual void pushClip(const Rect& rect) = 0;
    virtual void popClip() = 0;
};

/// Clips for as long as it lives.
class ClipScope
{
  public:
    ClipScope(Canvas& canvas, const Rect& rect) : _canvas(canvas) { _canvas.pushClip(rect); }
    ~ClipScope() { _canvas.popClip(); }
    ClipScope(const ClipScope&) = delete;
    ClipScope& operator=(const ClipScope&) = delete;

  private:
    Canvas& _canvas;
};

} // namespace ventrik
