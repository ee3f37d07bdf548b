#include "Capture/SkippedCount.h"

#include <fmt/format.h>

namespace ventrik
{

void SkippedCount::tell(std::vector<std::string>& notes, std::string_view name,
                        std::string_view noun, std::string_view rest) const
{
    if (_count > 0)
        notes.push_back(fmt::format("{}: {} {}{} {}, the first at offset {}", name, _count, noun,
                                    _count == 1 ? "" : "s", rest, _firstOffset));
}

} // namespace ventrik
