#include "Charts/TextEstimate.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr bool isContinuation(char byte)
{
    return (static_cast<unsigned char>(byte) & 0xc0U) == 0x80U;
}

// In ems, of the widest of the usual fonts.
double widthOf(char byte)
{
    if (static_cast<unsigned char>(byte) >= 0x80)
        return isContinuation(byte) ? 0 : 0.9;
    if (std::string_view("iljftI.,:;'|!()[] ").find(byte) != std::string_view::npos)
        return 0.38;
    if (byte == 'm' || byte == 'w' || byte == 'M' || byte == 'W')
        return 0.98;
    return byte >= 'A' && byte <= 'Z' ? 0.72 : 0.64;
}

} // namespace

double TextEstimate::textWidth(std::string_view text, double size, bool isBold) const
{
    double width = 0;
    for (const char byte : text)
        width += widthOf(byte);
    return width * size * (isBold ? 1.1 : 1);
}

std::string elided(std::string_view text, double width, double size, bool isBold,
                   const TextMeasure& measure)
{
    // Names come from outside; no label needs more than this.
    constexpr std::size_t longest = 200;
    if (text.size() <= longest && measure.textWidth(text, size, isBold) <= width)
        return std::string(text);
    std::string_view start = text.substr(0, longest);
    while (!start.empty()) {
        while (!start.empty() && isContinuation(start.back()))
            start.remove_suffix(1);
        start.remove_suffix(std::min<std::size_t>(1, start.size()));
        const std::string shortened = std::string(start) + "…";
        if (!start.empty() && measure.textWidth(shortened, size, isBold) <= width)
            return shortened;
    }
    return {};
}

} // namespace ventrik
