#pragma once

#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// "YYYY-MM-DDTHH:MM:SSZ", the second that has begun. Nothing outside the years 1 to 9999.
std::optional<std::string> formatIsoDate(PlistDate date);

/// Reads the same form. Nothing for any other, or a day or a time that does not exist.
std::optional<PlistDate> parseIsoDate(std::string_view text);

} // namespace ventrik
