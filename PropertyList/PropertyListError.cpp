#include "PropertyList/PropertyListError.h"

#include "PropertyList/Utf8.h"

namespace ventrik
{

namespace
{

constexpr std::size_t maximumQuotedLength = 64;

} // namespace

std::string printable(std::string_view text)
{
    std::string shown;
    while (!text.empty() && shown.size() < maximumQuotedLength) {
        const Utf8Character character = decodeUtf8(text);
        const std::size_t length = character.length == 0 ? 1 : character.length;
        if (character.length == 0 || character.code < 0x20 || character.code == 0x7f)
            shown += fmt::format("\\x{:02x}", static_cast<unsigned char>(text.front()));
        else
            shown += text.substr(0, length);
        text.remove_prefix(length);
    }
    return text.empty() ? shown : shown + "...";
}

} // namespace ventrik
