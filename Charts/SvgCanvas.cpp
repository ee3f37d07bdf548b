#include "Charts/SvgCanvas.h"

#include "PropertyList/XmlText.h"

#include <fmt/format.h>

#include <cmath>
#include <cstddef>

namespace ventrik
{

namespace
{

// At most two decimals; what is no number would make the picture unreadable.
std::string number(double value)
{
    if (!std::isfinite(value))
        return "0";
    std::string text = fmt::format("{:.2f}", value);
    text.erase(text.find_last_not_of('0') + 1);
    if (text.back() == '.')
        text.pop_back();
    return text == "-0" ? "0" : text;
}

std::string paint(std::string_view attribute, Color color)
{
    std::string text =
        fmt::format(" {}=\"#{:02x}{:02x}{:02x}\"", attribute, color.red, color.green, color.blue);
    if (color.alpha != 255)
        text += fmt::format(" {}-opacity=\"{}\"", attribute, number(color.alpha / 255.0));
    return text;
}

std::string strokeAttributes(const Stroke& stroke)
{
    std::string text = paint("stroke", stroke.color);
    if (stroke.width != 1)
        text += fmt::format(" stroke-width=\"{}\"", number(stroke.width));
    std::string lengths;
    for (const double length : dashLengths(stroke.dash))
        lengths += (lengths.empty() ? "" : " ") + number(length * stroke.width);
    if (!lengths.empty())
        text += fmt::format(" stroke-dasharray=\"{}\"", lengths);
    return text;
}

std::string rectAttributes(const Rect& rect)
{
    return fmt::format(" x=\"{}\" y=\"{}\" width=\"{}\" height=\"{}\"", number(rect.x),
                       number(rect.y), number(rect.width), number(rect.height));
}

void appendText(std::string& written, std::string_view text)
{
    std::size_t replaced = 0;
    appendEscaped(written, replaceUnfit(text, replaced));
}

std::string_view anchorName(Anchor anchor)
{
    return anchor == Anchor::Start ? "start" : anchor == Anchor::Middle ? "middle" : "end";
}

} // namespace

SvgCanvas::SvgCanvas(double width, double height, std::string_view title)
    : _width(width), _height(height)
{
    _head = fmt::format("<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"{0}\" height=\"{1}\""
                        " viewBox=\"0 0 {0} {1}\" font-family=\"sans-serif\" role=\"img\">\n",
                        number(width), number(height));
    if (!title.empty()) {
        _head += "<title>";
        appendText(_head, title);
        _head += "</title>\n";
    }
}

void SvgCanvas::line(Point from, Point to, const Stroke& stroke)
{
    _body += fmt::format("<line x1=\"{}\" y1=\"{}\" x2=\"{}\" y2=\"{}\"{}/>\n", number(from.x),
                         number(from.y), number(to.x), number(to.y), strokeAttributes(stroke));
}

void SvgCanvas::polyline(std::span<const Point> points, const Stroke& stroke)
{
    _body += fmt::format("<polyline fill=\"none\"{} points=\"", strokeAttributes(stroke));
    std::string_view separator;
    for (const Point& point : points) {
        _body += fmt::format("{}{},{}", separator, number(point.x), number(point.y));
        separator = " ";
    }
    _body += "\"/>\n";
}

void SvgCanvas::fillRect(const Rect& rect, Color color)
{
    _body += fmt::format("<rect{}{}/>\n", rectAttributes(rect), paint("fill", color));
}

void SvgCanvas::strokeRect(const Rect& rect, const Stroke& stroke)
{
    _body +=
        fmt::format("<rect fill=\"none\"{}{}/>\n", rectAttributes(rect), strokeAttributes(stroke));
}

void SvgCanvas::text(Point place, std::string_view text, const TextStyle& style)
{
    _body += fmt::format("<text x=\"{}\" y=\"{}\" font-size=\"{}\"{}", number(place.x),
                         number(place.y), number(style.size), paint("fill", style.color));
    if (style.anchor != Anchor::Start)
        _body += fmt::format(" text-anchor=\"{}\"", anchorName(style.anchor));
    if (style.isBold)
        _body += " font-weight=\"bold\"";
    if (style.rotation != 0)
        _body += fmt::format(" transform=\"rotate({} {} {})\"", number(style.rotation),
                             number(place.x), number(place.y));
    _body += '>';
    appendText(_body, text);
    _body += "</text>\n";
}

// The name is made of the place, so that in a page with several pictures equal names mean the same.
void SvgCanvas::pushClip(const Rect& rect)
{
    const std::string name = fmt::format("clip-{}-{}-{}-{}", number(rect.x), number(rect.y),
                                         number(rect.width), number(rect.height));
    _body += fmt::format("<clipPath id=\"{0}\"><rect{1}/></clipPath>\n"
                         "<g clip-path=\"url(#{0})\">\n",
                         name, rectAttributes(rect));
    ++_openClips;
}

void SvgCanvas::popClip()
{
    if (_openClips == 0)
        return;
    _body += "</g>\n";
    --_openClips;
}

std::string SvgCanvas::document() const
{
    std::string text = _head + _body;
    for (int open = 0; open < _openClips; ++open)
        text += "</g>\n";
    return text + "</svg>\n";
}

} // namespace ventrik
