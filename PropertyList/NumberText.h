#pragma once

#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

// Numbers as the XML form writes them, the same under every locale.

/// Decimal or, after "0x", hexadecimal digits with an optional sign. Nothing for other text or a
/// number outside -2^63 to 2^64 - 1.
std::optional<PlistInteger> parseInteger(std::string_view text);

/// A decimal real with an optional sign and exponent, or "nan", "inf", "infinity" in any case.
/// Nothing for other text or a number beyond the range of a double.
std::optional<double> parseReal(std::string_view text);

/// The shortest text that reads back as the same double.
std::string formatReal(double value);

} // namespace ventrik
