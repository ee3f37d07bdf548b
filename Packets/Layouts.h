#pragma once

#include "Packets/Record.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// Which layouts records are read by.
enum class RecordsMode : std::uint8_t {
    Base,     ///< each record by its base layout, whatever its version
    Newer,    ///< by the newer layout that its version and its size fit, where there is one
    Extended, ///< likewise, and records that have no base layout as well
};

/// What is known of the layout that a record was read by.
enum class LayoutKind : std::uint8_t {
    Base,
    Newer,
    NotKnown, ///< read by the base layout for want of a better one
};

/// "base", "newer" or "not known".
std::string_view nameOf(LayoutKind kind);

/// How a record was read.
struct ReadLayout {
    std::uint32_t logCode; ///< effective
    std::optional<std::uint8_t> version;
    std::size_t size; ///< of the packet, its header included
    LayoutKind kind;

    bool operator==(const ReadLayout&) const = default;
};

/// What a screen says of a record whose layout is not known, in one line.
std::string warningOf(const ReadLayout& layout);

} // namespace ventrik
