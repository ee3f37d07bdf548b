#include "PropertyList/TerminalText.h"

#include "PropertyList/Utf8.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr std::string_view replacementCharacter = "\xef\xbf\xbd";

constexpr bool isControl(char32_t code)
{
    return code < 0x20 || (code >= 0x7f && code <= 0x9f);
}

// Marks, embeddings, overrides and isolates: with them a text shows in another order than it has.
constexpr bool turnsDirection(char32_t code)
{
    return code == 0x61c || code == 0x200e || code == 0x200f ||
           (code >= 0x202a && code <= 0x202e) || (code >= 0x2066 && code <= 0x2069);
}

} // namespace

void appendTerminalText(std::string& text, std::string_view part)
{
    while (!part.empty()) {
        const Utf8Character character = decodeUtf8(part);
        const std::size_t length = std::max<std::size_t>(character.length, 1);
        if (character.length == 0)
            text += replacementCharacter;
        else if (isControl(character.code) || turnsDirection(character.code))
            text += ' ';
        else
            text += part.substr(0, length);
        part.remove_prefix(length);
    }
}

std::string terminalLine(std::string_view text)
{
    text = text.substr(0, text.find_last_not_of("\r\n") + 1);
    std::string line;
    for (;;) {
        const std::size_t lineBreak = text.find('\n');
        appendTerminalText(line, text.substr(0, lineBreak));
        if (lineBreak == std::string_view::npos)
            return line;
        line += "\\n";
        text.remove_prefix(lineBreak + 1);
    }
}

} // namespace ventrik
