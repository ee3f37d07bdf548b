#pragma once

#include <array>
#include <string_view>

namespace ventrik
{

/// The columns of rows, in their order. Whoever changes them gives the schema another number.
namespace RowColumns
{

constexpr int schemaNumber = 1;

struct Column {
    std::string_view name;
    std::string_view type;
    std::string_view meaning;
};

constexpr std::array<Column, 15> ofValues{{
    {"capture", "text", "the capture, as it was named"},
    {"record", "whole number", "its number in the capture, from 0"},
    {"time", "text", "of the record: ISO 8601, UTC, with microseconds"},
    {"subscription", "whole number or null", "of the phone's two, where the capture tells"},
    {"technology", "text", "ifx, gsm, c2k, lte or utran"},
    {"code", "text or null", "the record's log code, as 0xB17F; null where no record tells"},
    {"version", "whole number or null", "of the record, where it has one"},
    {"layout", "text or null", "by which the record was read: base, newer or not known"},
    {"section", "text", "the part of the display that shows the value"},
    {"path", "text", "of the value among the panes; with a / at its end that of an empty group"},
    {"index", "whole number or null", "the place in the innermost list on the path, from 0"},
    {"name", "text", "the value's name, the last part of the path"},
    {"number", "number or null", "the value, where it is one; null in a row of what went away"},
    {"unit", "text or null", "the number's"},
    {"text", "text or null",
     "the value as it shows; null where what is at the path went away, with all below it"},
}};

/// Of the row that ends a capture, beside the first one of the others.
constexpr std::array<Column, 7> ofClosing{{
    {"status", "text", "ok, damaged (in part or at its end) or empty"},
    {"offset", "whole number or null", "of the damage in the capture, where that is known"},
    {"reason", "text or null", "what is wrong with it"},
    {"records", "whole number", "in the capture"},
    {"decoded", "whole number", "of them those that the technology's decoders ask for"},
    {"rows", "whole number", "those of values"},
    {"bytes", "whole number", "of the records"},
}};

} // namespace RowColumns

} // namespace ventrik
