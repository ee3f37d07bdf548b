#pragma once

#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <optional>
#include <string>

namespace ventrik
{

/// The XML text, or one line that says which value could not be written.
struct PropertyListWriting {
    std::optional<std::string> text;
    std::string error;
    /// How many characters and values were replaced by U+FFFD.
    std::size_t replaced = 0;

    explicit operator bool() const { return text.has_value(); }
};

/// Writes the XML form: declaration, `<plist version="1.0">`, no document type line, tabs for
/// levels. Refused: strings that are not UTF-8 or hold a character that XML cannot carry, dates
/// outside the years 1 to 9999, nesting beyond `propertyListMaximumDepth`.
PropertyListWriting writeXmlPropertyList(const PlistValue& value);

/// The same as the bytes of a message; nothing when it is refused, for callers who cannot tell
/// anybody why.
std::optional<Bytes> propertyListBytes(const PlistValue& value);

/// The same, and nothing is refused: in the place of each such character stands U+FFFD, and of each
/// such date and container a string of that character.
PropertyListWriting writeXmlPropertyListReplacing(const PlistValue& value);

} // namespace ventrik
