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

std::string SkippedCount::text() const
{
    return _count == 0 ? "0" : fmt::format("{}, the first at offset {}", _count, _firstOffset);
}

void SkippedCount::addTo(PlistDictionary& report, std::string_view name) const
{
    if (_count > 0)
        report.set(name, text());
}

} // namespace ventrik
