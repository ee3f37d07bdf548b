#pragma once

#include <cstddef>
#include <string_view>

namespace ventrik
{

/// What one pass over a document's markup finds.
struct XmlMarkup {
    std::size_t doctypeStart = 0;
    std::size_t doctypeLength = 0; ///< 0 when there is no document type line
};

/// Walks the tags without building anything, so that a hostile document is turned away before it
/// costs memory. Throws PropertyListError for elements nested deeper than `maximumDepth`, a
/// declared encoding other than UTF-8 or ASCII, markup without an end, or a document type line
/// that comes after the root element began.
XmlMarkup scanXmlMarkup(std::string_view text, std::size_t maximumDepth);

} // namespace ventrik
