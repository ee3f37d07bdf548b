#include "PropertyList/Json.h"

#include "PropertyList/Base64.h"
#include "PropertyList/CharacterRun.h"
#include "PropertyList/IsoDate.h"

#include <cmath>
#include <iterator>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::string_view_literals;

constexpr std::string_view separator = ", ";

constexpr bool standsAsItIs(char character)
{
    return (static_cast<unsigned char>(character) >= 0x20) & (character != '"') &
           (character != '\\');
}

void appendEscape(std::string& text, char character)
{
    switch (character) {
    case '"':
        text += "\\\"";
        return;
    case '\\':
        text += "\\\\";
        return;
    case '\n':
        text += "\\n";
        return;
    case '\t':
        text += "\\t";
        return;
    default:
        fmt::format_to(std::back_inserter(text), "\\u{:04x}", static_cast<int>(character));
    }
}

void appendReal(std::string& text, double real)
{
    if (std::isfinite(real))
        fmt::format_to(std::back_inserter(text), "{}", real);
    else
        text += "null";
}

void appendDate(std::string& text, PlistDate date)
{
    const auto iso = formatIsoDate(date);
    text += iso ? fmt::format("{{\"date\": \"{}\"}}", *iso) : "null";
}

void appendArray(std::string& text, const PlistArray& array)
{
    text += '[';
    for (const PlistValue& element : array) {
        if (&element != array.begin())
            text += separator;
        appendJson(text, element);
    }
    text += ']';
}

void appendDictionary(std::string& text, const PlistDictionary& dictionary)
{
    text += '{';
    for (const auto& entry : dictionary) {
        if (&entry != dictionary.begin())
            text += separator;
        appendJsonText(text, entry.key);
        text += ": "sv;
        appendJson(text, entry.value);
    }
    text += '}';
}

} // namespace

void appendJson(std::string& text, const PlistValue& value)
{
    switch (value.kind()) {
    case PlistValue::Kind::String:
        return appendJsonText(text, *value.string());
    case PlistValue::Kind::Integer:
        text += value.integer()->decimal();
        return;
    case PlistValue::Kind::Real:
        return appendReal(text, *value.real());
    case PlistValue::Kind::Boolean:
        text += *value.boolean() ? "true"sv : "false"sv;
        return;
    case PlistValue::Kind::Date:
        return appendDate(text, *value.date());
    case PlistValue::Kind::Data:
        text += fmt::format("{{\"data\": \"{}\"}}", encodeBase64(*value.data()));
        return;
    case PlistValue::Kind::Array:
        return appendArray(text, *value.array());
    case PlistValue::Kind::Dictionary:
        return appendDictionary(text, *value.dictionary());
    }
}

void appendJsonText(std::string& json, std::string_view text)
{
    json += '"';
    for (;;) {
        const std::size_t plain = endOfRun<standsAsItIs>(text, 0);
        json += text.substr(0, plain);
        if (plain == text.size())
            break;
        appendEscape(json, text[plain]);
        text.remove_prefix(plain + 1);
    }
    json += '"';
}

} // namespace ventrik
