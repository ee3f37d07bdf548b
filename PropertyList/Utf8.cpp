#include "PropertyList/Utf8.h"

#include <array>
#include <cstdint>

namespace ventrik
{

namespace
{

constexpr bool isContinuation(char32_t byte)
{
    return (byte & 0xc0) == 0x80;
}

// Bytes of the character that the first byte announces; 0 when no character starts with it.
constexpr std::size_t announcedLength(char32_t first)
{
    if (first < 0x80)
        return 1;
    if (first < 0xc2)
        return 0;
    if (first < 0xe0)
        return 2;
    if (first < 0xf0)
        return 3;
    return first < 0xf5 ? 4 : 0;
}

constexpr bool isScalarValue(char32_t code)
{
    return code <= 0x10ffff && (code < 0xd800 || code > 0xdfff);
}

} // namespace

Utf8Character decodeUtf8(std::string_view text)
{
    // The least code that needs this many bytes: anything below is an overlong form.
    static constexpr std::array<char32_t, 5> leastCode{0, 0, 0x80, 0x800, 0x10000};
    if (text.empty())
        return {};
    const char32_t first = static_cast<std::uint8_t>(text.front());
    const std::size_t length = announcedLength(first);
    if (length == 1)
        return {first, 1};
    if (length == 0 || text.size() < length)
        return {};
    char32_t code = first & (0xffU >> (length + 1));
    for (const char byte : text.substr(1, length - 1)) {
        const char32_t next = static_cast<std::uint8_t>(byte);
        if (!isContinuation(next))
            return {};
        code = code << 6 | (next & 0x3f);
    }
    return code >= leastCode.at(length) && isScalarValue(code) ? Utf8Character{code, length}
                                                               : Utf8Character{};
}

void appendUtf8(std::string& text, char32_t code)
{
    const auto add = [&](char32_t byte) { text += static_cast<char>(byte); };
    if (code < 0x80) {
        add(code);
    } else if (code < 0x800) {
        add(0xc0 | code >> 6);
        add(0x80 | (code & 0x3f));
    } else if (code < 0x10000) {
        add(0xe0 | code >> 12);
        add(0x80 | (code >> 6 & 0x3f));
        add(0x80 | (code & 0x3f));
    } else {
        add(0xf0 | code >> 18);
        add(0x80 | (code >> 12 & 0x3f));
        add(0x80 | (code >> 6 & 0x3f));
        add(0x80 | (code & 0x3f));
    }
}

} // namespace ventrik
