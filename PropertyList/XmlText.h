#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

constexpr bool isXmlSpace(char character)
{
    return character == ' ' || character == '\t' || character == '\r' || character == '\n';
}

bool isAllXmlSpace(std::string_view text);
std::string_view trimXmlSpace(std::string_view text);

/// What keeps the text out of an XML document: "byte N is not UTF-8", or the character that XML
/// cannot carry and where it is. Nothing when all is well.
std::optional<std::string> xmlTextProblem(std::string_view text);

/// The text with U+FFFD in the place of each byte that is not UTF-8 and of each character that XML
/// cannot carry; they are added to the count.
std::string replaceUnfit(std::string_view text, std::size_t& count);

/// Adds the text so that a reader gets it back exactly, carriage returns included.
void appendEscaped(std::string& written, std::string_view text);

/// Adds what raw text of a document stands for: character references resolved, line ends as "\n".
/// `offset` is the text's place in the document. Throws PropertyListError for any other reference.
void appendUnescaped(std::string& text, std::string_view raw, std::size_t offset);

/// Adds the text of a CDATA section: only the line ends change.
void appendWithLineEnds(std::string& text, std::string_view raw);

} // namespace ventrik
