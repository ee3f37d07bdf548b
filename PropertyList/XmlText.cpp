#include "PropertyList/XmlText.h"

#include "PropertyList/CharacterRun.h"
#include "PropertyList/PropertyListError.h"
#include "PropertyList/Utf8.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>

namespace ventrik
{

namespace
{

constexpr bool isXmlCharacter(char32_t code)
{
    if (code < 0x20)
        return code == '\t' || code == '\n' || code == '\r';
    return code < 0xd800 || (code > 0xdfff && code < 0xfffe) ||
           (code >= 0x10000 && code <= 0x10ffff);
}

// Whether the character is ASCII that XML can carry. Nearly every text is, and its characters need
// not be decoded.
constexpr bool isPlain(char character)
{
    const auto code = static_cast<unsigned char>(character);
    return (code < 0x80) & ((code >= 0x20) | (code == '\t') | (code == '\n') | (code == '\r'));
}

constexpr bool standsAsItIs(char character)
{
    return (character != '&') & (character != '<') & (character != '>') & (character != '\r');
}

struct NamedCharacter {
    std::string_view name;
    char character;
};
constexpr std::array<NamedCharacter, 5> predefinedEntities{
    {{"amp", '&'}, {"lt", '<'}, {"gt", '>'}, {"quot", '"'}, {"apos", '\''}}};

// The character of "#38" or "#x26"; nothing when it is malformed or XML cannot carry it.
std::optional<char32_t> referencedCharacter(std::string_view name)
{
    name.remove_prefix(1);
    const bool isHexadecimal = name.starts_with('x');
    if (isHexadecimal)
        name.remove_prefix(1);
    std::uint32_t code = 0;
    const char* end = name.data() + name.size();
    const auto [stop, error] = std::from_chars(name.data(), end, code, isHexadecimal ? 16 : 10);
    const bool isWhole = error == std::errc{} && stop == end;
    return isWhole && isXmlCharacter(code) ? std::optional<char32_t>(code) : std::nullopt;
}

void appendReferenced(std::string& text, std::string_view name, std::size_t offset)
{
    if (name.starts_with('#')) {
        const auto code = referencedCharacter(name);
        if (!code)
            failPropertyList("\"&{};\" at byte {} refers to no character that XML can carry",
                             printable(name), offset);
        appendUtf8(text, *code);
        return;
    }
    const auto found = std::find_if(predefinedEntities.begin(), predefinedEntities.end(),
                                    [&](const auto& entity) { return entity.name == name; });
    if (found == predefinedEntities.end())
        failPropertyList("unknown entity \"{}\" at byte {}", printable(name), offset);
    text += found->character;
}

std::string_view escapeOf(char character)
{
    switch (character) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    default:
        return "&#13;";
    }
}

} // namespace

bool isAllXmlSpace(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), isXmlSpace);
}

std::string_view trimXmlSpace(std::string_view text)
{
    while (!text.empty() && isXmlSpace(text.front()))
        text.remove_prefix(1);
    while (!text.empty() && isXmlSpace(text.back()))
        text.remove_suffix(1);
    return text;
}

std::optional<std::string> xmlTextProblem(std::string_view text)
{
    for (std::size_t place = endOfRun<isPlain>(text, 0); place < text.size();
         place = endOfRun<isPlain>(text, place)) {
        const Utf8Character character = decodeUtf8(text.substr(place));
        if (character.length == 0)
            return fmt::format("byte {} is not UTF-8", place);
        if (!isXmlCharacter(character.code))
            return fmt::format("XML cannot carry the character U+{:04X} at byte {}",
                               static_cast<std::uint32_t>(character.code), place);
        place += character.length;
    }
    return std::nullopt;
}

std::string replaceUnfit(std::string_view text, std::size_t& count)
{
    constexpr char32_t replacement = 0xfffd;
    std::string result;
    for (std::size_t place = 0; place < text.size();) {
        const Utf8Character character = decodeUtf8(text.substr(place));
        const bool isFit = character.length != 0 && isXmlCharacter(character.code);
        appendUtf8(result, isFit ? character.code : replacement);
        count += isFit ? 0 : 1;
        place += std::max<std::size_t>(character.length, 1);
    }
    return result;
}

void appendEscaped(std::string& written, std::string_view text)
{
    for (;;) {
        const std::size_t plain = endOfRun<standsAsItIs>(text, 0);
        written += text.substr(0, plain);
        if (plain == text.size())
            return;
        written += escapeOf(text[plain]);
        text.remove_prefix(plain + 1);
    }
}

void appendUnescaped(std::string& text, std::string_view raw, std::size_t offset)
{
    std::size_t place = 0;
    for (;;) {
        const std::size_t reference = raw.find('&', place);
        appendWithLineEnds(text, raw.substr(place, std::min(reference, raw.size()) - place));
        if (reference == std::string_view::npos)
            return;
        const std::size_t end = raw.find_first_of("; \t\r\n&<", reference + 1);
        if (end == std::string_view::npos || raw[end] != ';' || end == reference + 1)
            failPropertyList("\"&\" at byte {} starts no reference", offset + reference);
        appendReferenced(text, raw.substr(reference + 1, end - reference - 1), offset + reference);
        place = end + 1;
    }
}

void appendWithLineEnds(std::string& text, std::string_view raw)
{
    for (;;) {
        const std::size_t carriageReturn = raw.find('\r');
        text += raw.substr(0, carriageReturn);
        if (carriageReturn == std::string_view::npos)
            return;
        text += '\n';
        raw.remove_prefix(carriageReturn + 1);
        if (raw.starts_with('\n'))
            raw.remove_prefix(1);
    }
}

} // namespace ventrik
