#pragma once

#include "Packets/Record.h"

#include <optional>
#include <string_view>

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

/// What a value shows: a field's number, or one that was worked out from several.
struct ShownCell {
    const Field* field; ///< says how it shows
    std::int64_t raw;   ///< the record's, or what tells numbers that were worked out apart
    std::optional<double> workedOut = {};

    /// In `field->shown.unit`; none where a text shows in its place.
    std::optional<double> number() const
    {
        return workedOut ? workedOut : field->shown.number(raw);
    }
};

/// Where a generator keeps what it shows at a place of the display, so that it looks for that but
/// once. It holds as long as the display's containers stand where they are.
struct CellPlace {
    const void* section = nullptr; ///< the generator's own affair, as is the slot
    std::string_view list = {};    ///< of the section's dictionary; empty where the section is one
    std::optional<std::size_t> row = {};
    std::string_view key = {}; ///< lives as long as this
    std::size_t slot = 0;
};

} // namespace ventrik
