#pragma once

#include "Packets/Record.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <string_view>

namespace ventrik
{

// Devices send records in layouts that we may not know, and then values come out that cannot be.
// Each of these tells in one line what is wrong with a value; empty when nothing is.

/// Of a number that measures this, in the quantity's unit.
std::string_view doubtOf(Quantity quantity, double number);
/// Of a field's raw number. What shows as a text is no number, and right.
std::string_view doubtOf(const Field& field, std::int64_t raw);
/// Of a number as the field shows it, for those who have no raw one; other texts are right.
std::string_view doubtOfText(const Field& field, std::string_view text);
/// Of what shows. More may have come since: then the text tells the number.
std::string_view doubtOfShown(const Field& field, std::int64_t raw, std::string_view text);
std::string_view doubtOf(PlistDate date);

/// What stands behind a doubtful value where only characters can.
inline constexpr std::string_view doubtSign = "⚠";

} // namespace ventrik
