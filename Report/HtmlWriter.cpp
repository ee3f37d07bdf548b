#include "Report/HtmlWriter.h"

#include "PropertyList/XmlText.h"

#include <fmt/format.h>

namespace ventrik
{

HtmlWriter::Element HtmlWriter::inside(std::string_view name, std::string_view attributes)
{
    begin(name, attributes);
    return {*this, name};
}

void HtmlWriter::element(std::string_view name, std::string_view text, std::string_view attributes)
{
    begin(name, attributes);
    this->text(text);
    end(name);
}

void HtmlWriter::text(std::string_view text)
{
    std::size_t end = text.size() > longestText ? longestText : text.size();
    while (end > 0 && end < text.size() && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80)
        --end; // not within a character
    std::size_t replaced = 0;
    appendEscaped(_text, replaceUnfit(text.substr(0, end), replaced));
    if (end < text.size())
        _text += fmt::format("… ({} bytes)", text.size());
}

void HtmlWriter::begin(std::string_view name, std::string_view attributes)
{
    fmt::format_to(std::back_inserter(_text), "<{}{}{}>", name, attributes.empty() ? "" : " ",
                   attributes);
}

void HtmlWriter::end(std::string_view name)
{
    fmt::format_to(std::back_inserter(_text), "</{}>\n", name);
}

} // namespace ventrik
