#include "PropertyList/XmlMarkupScan.h"

#include "PropertyList/PropertyListError.h"
#include "PropertyList/XmlText.h"

#include <algorithm>
#include <array>
#include <utility>

namespace ventrik
{

namespace
{

constexpr std::size_t npos = std::string_view::npos;

// The parser takes some 20 times the size of a small element; this bounds what a message may cost.
constexpr std::size_t maximumElements = 2'000'000;

bool equalIgnoringCase(std::string_view text, std::string_view upper)
{
    return std::equal(text.begin(), text.end(), upper.begin(), upper.end(),
                      [](char character, char expected) {
                          const bool isLower = character >= 'a' && character <= 'z';
                          return (isLower ? character - 'a' + 'A' : character) == expected;
                      });
}

bool isEncodingAccepted(std::string_view name)
{
    static constexpr std::array<std::string_view, 3> accepted{"UTF-8", "US-ASCII", "ASCII"};
    return std::any_of(accepted.begin(), accepted.end(),
                       [&](std::string_view each) { return equalIgnoringCase(name, each); });
}

// The quoted value after "encoding =" in a declaration; the whole rest when it is malformed.
std::string_view declaredEncoding(std::string_view declaration, std::size_t place)
{
    std::string_view rest = trimXmlSpace(declaration.substr(place));
    if (!rest.starts_with('='))
        return rest;
    rest = trimXmlSpace(rest.substr(1));
    if (!rest.starts_with('"') && !rest.starts_with('\''))
        return rest;
    const std::size_t end = rest.find(rest.front(), 1);
    return end == npos ? rest : rest.substr(1, end - 1);
}

// A cursor over the markup: each step takes one tag, comment, section or instruction.
class MarkupScan
{
  public:
    MarkupScan(std::string_view text, std::size_t maximumDepth)
        : _text(text), _maximumDepth(maximumDepth)
    {
    }

    XmlMarkup run()
    {
        while ((_start = _text.find('<', _place)) != npos)
            skipMarkup();
        return _markup;
    }

  private:
    bool at(std::string_view markup) const { return _text.substr(_start).starts_with(markup); }

    void skipMarkup()
    {
        if (at("<!--"))
            skipPast("-->", 4, "comment");
        else if (at("<![CDATA["))
            skipPast("]]>", 9, "CDATA section");
        else if (at("<?"))
            skipInstruction();
        else if (at("<!DOCTYPE"))
            skipDoctype();
        else if (at("</"))
            skipEndTag();
        else
            skipStartTag();
    }

    void skipPast(std::string_view end, std::size_t from, std::string_view what)
    {
        const std::size_t found = _text.find(end, _start + from);
        if (found == npos)
            failPropertyList("the {} at byte {} has no end", what, _start);
        _place = found + end.size();
    }

    void skipInstruction()
    {
        skipPast("?>", 2, "processing instruction");
        const std::string_view body = _text.substr(_start + 2, _place - _start - 4);
        if (body.size() > 3 && body.starts_with("xml") && isXmlSpace(body[3]))
            checkDeclaration(body);
    }

    void checkDeclaration(std::string_view body) const
    {
        if (!isAllXmlSpace(_text.substr(0, _start)))
            failPropertyList("the XML declaration at byte {} is not at the start", _start);
        constexpr std::string_view keyword = "encoding";
        const std::size_t found = body.find(keyword);
        if (found == npos)
            return;
        const std::string_view name = declaredEncoding(body, found + keyword.size());
        if (!isEncodingAccepted(name))
            failPropertyList("the encoding \"{}\" declared at byte {} is not UTF-8",
                             printable(name), _start);
    }

    void skipEndTag()
    {
        skipPast(">", 2, "end tag");
        if (_depth > 0)
            --_depth;
    }

    void skipStartTag()
    {
        _place = endOfTag();
        if (++_elementCount > maximumElements)
            failPropertyList("more than {} elements at byte {}", maximumElements, _start);
        const bool isEmptyElement = _text[_place - 2] == '/';
        if (_depth == _maximumDepth)
            failPropertyList("elements nested deeper than {} at byte {}", _maximumDepth, _start);
        if (!isEmptyElement)
            ++_depth;
    }

    // Past the ">" that ends the tag; one inside a quoted attribute value does not.
    std::size_t endOfTag() const
    {
        std::size_t place = _start + 1;
        while ((place = _text.find_first_of("\"'>", place)) != npos) {
            if (_text[place] == '>')
                return place + 1;
            place = pastQuoted(place);
        }
        failPropertyList("the tag at byte {} has no end", _start);
    }

    std::size_t pastQuoted(std::size_t quote) const
    {
        const std::size_t end = _text.find(_text[quote], quote + 1);
        if (end == npos)
            failPropertyList("the quoted text at byte {} has no end", quote);
        return end + 1;
    }

    void skipDoctype()
    {
        if (_elementCount > 0 || _markup.doctypeLength > 0)
            failPropertyList("a document type line at byte {}, where none may be", _start);
        const std::size_t end = endOfDoctype();
        _markup = {_start, end - _start};
        _place = end;
    }

    // Past the ">" that ends the line; those of the declarations between "[" and "]" do not.
    std::size_t endOfDoctype()
    {
        const std::size_t doctype = _start;
        bool isInSubset = false;
        std::size_t place = _start + 1;
        while ((place = _text.find_first_of("\"'[]<>", place)) != npos) {
            const char character = _text[place];
            if (character == '>' && !isInSubset)
                return place + 1;
            if (character == '[' || character == ']')
                isInSubset = character == '[';
            place = pastDoctypePart(place);
        }
        failPropertyList("the document type line at byte {} has no end", doctype);
    }

    std::size_t pastDoctypePart(std::size_t place)
    {
        const std::string_view rest = _text.substr(place);
        if (rest.starts_with('"') || rest.starts_with('\''))
            return pastQuoted(place);
        const std::size_t doctype = std::exchange(_start, place);
        _place = place + 1;
        if (rest.starts_with("<!--"))
            skipPast("-->", 4, "comment");
        else if (rest.starts_with("<?"))
            skipPast("?>", 2, "processing instruction");
        _start = doctype;
        return _place;
    }

    std::string_view _text;
    std::size_t _maximumDepth;
    std::size_t _start = 0; // of the markup at hand
    std::size_t _place = 0; // where the search for the next goes on
    std::size_t _depth = 0;
    std::size_t _elementCount = 0;
    XmlMarkup _markup;
};

} // namespace

XmlMarkup scanXmlMarkup(std::string_view text, std::size_t maximumDepth)
{
    return MarkupScan(text, maximumDepth).run();
}

} // namespace ventrik
