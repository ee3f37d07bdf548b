#include "Packets/Layouts.h"

#include <fmt/format.h>

namespace ventrik
{

std::string_view nameOf(LayoutKind kind)
{
    switch (kind) {
    case LayoutKind::Base:
        return "base";
    case LayoutKind::Newer:
        return "newer";
    case LayoutKind::NotKnown:
        break;
    }
    return "not known";
}

std::string warningOf(const ReadLayout& layout)
{
    const std::string version = layout.version ? fmt::format("version {}", *layout.version)
                                               : fmt::format("of {} bytes", layout.size);
    return fmt::format("0x{:04X} {}: layout not known, values may be wrong", layout.logCode,
                       version);
}

} // namespace ventrik
