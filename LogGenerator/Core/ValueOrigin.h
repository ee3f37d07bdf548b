#pragma once

#include "Packets/Record.h"

#include <optional>

namespace ventrik
{

/// Where a shown value comes from.
struct ValueOrigin {
    const Record* record;
    std::optional<std::uint8_t> version; ///< of the record that told it last, where it carries one
    const Field* field;
    std::size_t start; ///< of the list's element that the field's place counts from; else 0
    std::int64_t raw;

    /// The first byte of the packet, its type byte being 0, that the value reaches into; so many
    /// more follow as `field->place.bytes()` says.
    std::size_t firstByte() const { return start + field->place.offset; }
    /// The number that shows, in `field->shown.unit`; none where a text shows in its place.
    std::optional<double> number() const { return field->shown.number(raw); }
};

} // namespace ventrik
