#pragma once

#include <concepts>
#include <string>
#include <string_view>

#include <fmt/format.h>

namespace ventrik
{

/// Whether nothing in the text is for terminals to obey, nor of another alphabet.
bool isPlainAscii(std::string_view text);

/// A whole number.
template <std::integral Number>
void appendDigits(std::string& row, Number number)
{
    const fmt::format_int digits(number);
    row.append(digits.data(), digits.size());
}

/// So many digits as tell the number from all others. It must be finite.
void appendDigits(std::string& row, double number);

} // namespace ventrik
