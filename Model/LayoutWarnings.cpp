#include "Model/LayoutWarnings.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::size_t mostWarnings = 2;

} // namespace

std::vector<std::string> layoutWarnings(std::span<const ReadLayout> layouts)
{
    std::vector<std::string> lines;
    for (const ReadLayout& layout : layouts)
        if (layout.kind == LayoutKind::NotKnown)
            lines.push_back(warningOf(layout));
    if (lines.size() <= mostWarnings)
        return lines;
    const std::size_t rest = lines.size() - mostWarnings;
    lines.resize(mostWarnings);
    lines.push_back(fmt::format("and {} more", rest));
    return lines;
}

} // namespace ventrik
