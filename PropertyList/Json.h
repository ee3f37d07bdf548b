#pragma once

#include "PropertyList/PlistValue.h"

#include <string>
#include <string_view>

namespace ventrik
{

/// Appends a property-list value as JSON on one line: order kept, data as {"data": BASE64}, dates
/// as
/// {"date": "2026-11-16T06:10:28Z"}. A real that is not finite, which JSON does not have, and a
/// date outside the years 1 to 9999 become null.
void appendJson(std::string& text, const PlistValue& value);

/// Appends a text as a JSON string, in its quotes.
void appendJsonText(std::string& json, std::string_view text);

} // namespace ventrik
