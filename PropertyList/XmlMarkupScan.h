#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A tag of an XML document, or a piece of the text around the tags, as it stands there.
struct XmlPiece {
    enum class Kind { StartTag, EndTag, Text, Cdata, DocumentEnd };

    Kind kind;
    std::size_t offset;    ///< byte of the document where the tag or the text itself starts
    std::string_view text; ///< the tag's name, or the text with its references and line ends
};

/// Walks a document piece by piece without building anything, so that a hostile one is turned away
/// before it costs memory. Comments, processing instructions and the document type line are passed
/// over. Every start tag is followed by its end tag, an empty element's too.
class XmlMarkupScan
{
  public:
    /// The document must be UTF-8 that XML can carry, and outlive the pieces.
    XmlMarkupScan(std::string_view document, std::size_t maximumDepth);

    /// The next piece; the document's end again and again. Throws PropertyListError for markup
    /// that is malformed or out of place, elements nested deeper than the maximum or more than two
    /// million, and a declared encoding other than UTF-8 or ASCII.
    XmlPiece next();

  private:
    using Kind = XmlPiece::Kind;

    bool at(std::string_view markup) const { return _text.substr(_start).starts_with(markup); }
    void skipPast(std::string_view end, std::size_t from, std::string_view what);
    void skipMarkup();
    void skipInstruction();
    void checkDeclaration(std::string_view body) const;
    void skipDoctype();
    std::size_t endOfDoctype();
    std::size_t pastDoctypePart(std::size_t place);

    XmlPiece takeText();
    XmlPiece takeCdata();
    XmlPiece takeStartTag();
    XmlPiece takeEndTag();
    bool endsInnermost();
    XmlPiece closeElement();
    XmlPiece endDocument() const;
    void countElement();
    void skipAttributes();
    void skipAttribute();
    std::string_view takeName();
    void skipSpace();
    bool take(char character);
    std::size_t pastQuoted(std::size_t quote) const;
    [[noreturn]] void failTag() const;

    std::string_view _text;
    std::size_t _maximumDepth;
    std::size_t _first;     // byte of the document, past a byte order mark
    std::size_t _start = 0; // of the piece at hand
    std::size_t _place;     // where the next goes on
    std::size_t _elementCount = 0;
    bool _isInEmptyElement = false;
    bool _hasDoctype = false;
    std::vector<XmlPiece> _open; // start tags of the elements around the place
};

} // namespace ventrik
