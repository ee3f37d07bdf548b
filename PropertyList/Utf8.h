#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace ventrik
{

struct Utf8Character {
    char32_t code = 0;
    std::size_t length = 0; ///< bytes; 0 when the text does not start with a UTF-8 character
};

/// The character at the start of the text. Overlong forms, surrogates and codes above U+10FFFF are
/// not UTF-8.
Utf8Character decodeUtf8(std::string_view text);

/// Adds the character, which must be a Unicode scalar value.
void appendUtf8(std::string& text, char32_t code);

} // namespace ventrik
