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
constexpr std::string_view byteOrderMark = "\xef\xbb\xbf";

// A value takes some 20 times the size of a small element; this bounds what a message may cost.
constexpr std::size_t maximumElements = 2'000'000;

bool isEncodingAccepted(std::string_view name)
{
    std::string upper(name);
    for (char& character : upper)
        if (character >= 'a' && character <= 'z')
            character = static_cast<char>(character - 'a' + 'A');
    return upper == "UTF-8" || upper == "US-ASCII" || upper == "ASCII";
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

// Beyond ASCII every character may stand in a name.
constexpr bool isNameStart(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           character == '_' || character == ':' || static_cast<unsigned char>(character) >= 0x80;
}

constexpr std::array<bool, 256> nameParts = [] {
    std::array<bool, 256> parts{};
    for (std::size_t code = 0; code < parts.size(); ++code) {
        const char character = static_cast<char>(code);
        parts[code] = isNameStart(character) || (character >= '0' && character <= '9') ||
                      character == '-' || character == '.';
    }
    return parts;
}();

constexpr bool isNamePart(char character)
{
    return nameParts[static_cast<unsigned char>(character)];
}

} // namespace

XmlMarkupScan::XmlMarkupScan(std::string_view document, std::size_t maximumDepth)
    : _text(document),
      _maximumDepth(maximumDepth),
      _first(document.starts_with(byteOrderMark) ? byteOrderMark.size() : 0),
      _place(_first)
{
}

XmlPiece XmlMarkupScan::next()
{
    if (std::exchange(_isInEmptyElement, false))
        return closeElement();
    for (;;) {
        _start = _place;
        if (_start == _text.size())
            return endDocument();
        if (_text[_start] != '<')
            return takeText();
        switch (_start + 1 < _text.size() ? _text[_start + 1] : ' ') {
        case '/':
            return takeEndTag();
        case '!':
        case '?':
            if (at("<![CDATA["))
                return takeCdata();
            skipMarkup();
            break;
        default:
            return takeStartTag();
        }
    }
}

// Passes over what says nothing to us.
void XmlMarkupScan::skipMarkup()
{
    if (at("<!--"))
        skipPast("-->", 4, "comment");
    else if (at("<?"))
        skipInstruction();
    else if (at("<!DOCTYPE"))
        skipDoctype();
    else
        failTag();
}

void XmlMarkupScan::skipPast(std::string_view end, std::size_t from, std::string_view what)
{
    const std::size_t found = _text.find(end, _start + from);
    if (found == npos)
        failPropertyList("the {} at byte {} has no end", what, _start);
    _place = found + end.size();
}

void XmlMarkupScan::skipInstruction()
{
    skipPast("?>", 2, "processing instruction");
    const std::string_view body = _text.substr(_start + 2, _place - _start - 4);
    if (body.empty() || !isNameStart(body.front()))
        failPropertyList("the processing instruction at byte {} has no name", _start);
    if (body.size() > 3 && body.starts_with("xml") && isXmlSpace(body[3]))
        checkDeclaration(body);
}

void XmlMarkupScan::checkDeclaration(std::string_view body) const
{
    if (!isAllXmlSpace(_text.substr(_first, _start - _first)))
        failPropertyList("the XML declaration at byte {} is not at the start", _start);
    constexpr std::string_view keyword = "encoding";
    const std::size_t found = body.find(keyword);
    if (found == npos)
        return;
    const std::string_view name = declaredEncoding(body, found + keyword.size());
    if (!isEncodingAccepted(name))
        failPropertyList("the encoding \"{}\" declared at byte {} is not UTF-8", printable(name),
                         _start);
}

void XmlMarkupScan::skipDoctype()
{
    if (_elementCount > 0 || std::exchange(_hasDoctype, true))
        failPropertyList("a document type line at byte {}, where none may be", _start);
    _place = endOfDoctype();
}

// Past the ">" that ends the line; those of the declarations between "[" and "]" do not.
std::size_t XmlMarkupScan::endOfDoctype()
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

std::size_t XmlMarkupScan::pastDoctypePart(std::size_t place)
{
    const std::string_view rest = _text.substr(place);
    if (rest.starts_with('"') || rest.starts_with('\''))
        return pastQuoted(place);
    _start = place;
    _place = place + 1;
    if (rest.starts_with("<!--"))
        skipPast("-->", 4, "comment");
    else if (rest.starts_with("<?"))
        skipPast("?>", 2, "processing instruction");
    return _place;
}

XmlPiece XmlMarkupScan::takeText()
{
    _place = std::min(_text.find('<', _start), _text.size());
    return {Kind::Text, _start, _text.substr(_start, _place - _start)};
}

XmlPiece XmlMarkupScan::takeCdata()
{
    constexpr std::size_t markLength = 9;
    skipPast("]]>", markLength, "CDATA section");
    const std::size_t content = _start + markLength;
    return {Kind::Cdata, content, _text.substr(content, _place - 3 - content)};
}

XmlPiece XmlMarkupScan::takeStartTag()
{
    countElement();
    _place = _start + 1;
    const XmlPiece tag{Kind::StartTag, _start, takeName()};
    if (!take('>')) {
        skipAttributes();
        _isInEmptyElement = take('/');
        if (!take('>'))
            failTag();
    }
    _open.push_back(tag);
    return tag;
}

XmlPiece XmlMarkupScan::takeEndTag()
{
    _place = _start + 2;
    if (endsInnermost())
        return closeElement();
    const std::string_view name = takeName();
    skipSpace();
    if (!take('>'))
        failTag();
    if (_open.empty())
        failPropertyList("</{}> at byte {} ends nothing", printable(name), _start);
    if (_open.back().text != name)
        failPropertyList("</{}> at byte {} does not end <{}> at byte {}", printable(name), _start,
                         printable(_open.back().text), _open.back().offset);
    return closeElement();
}

// Whether the tag is the innermost element's name and nothing else; goes past it then. Nearly every
// end tag is.
bool XmlMarkupScan::endsInnermost()
{
    if (_open.empty())
        return false;
    const std::string_view name = _open.back().text;
    const std::string_view rest = _text.substr(_place);
    if (rest.size() <= name.size() || rest[name.size()] != '>' || !rest.starts_with(name))
        return false;
    _place += name.size() + 1;
    return true;
}

XmlPiece XmlMarkupScan::closeElement()
{
    const std::string_view name = _open.back().text;
    _open.pop_back();
    return {Kind::EndTag, _start, name};
}

XmlPiece XmlMarkupScan::endDocument() const
{
    if (!_open.empty())
        failPropertyList("<{}> at byte {} has no end", printable(_open.back().text),
                         _open.back().offset);
    return {Kind::DocumentEnd, _text.size(), {}};
}

void XmlMarkupScan::countElement()
{
    if (++_elementCount > maximumElements)
        failPropertyList("more than {} elements at byte {}", maximumElements, _start);
    if (_open.size() == _maximumDepth)
        failPropertyList("elements nested deeper than {} at byte {}", _maximumDepth, _start);
}

void XmlMarkupScan::skipAttributes()
{
    while (_place < _text.size() && isXmlSpace(_text[_place])) {
        skipSpace();
        if (_place < _text.size() && isNameStart(_text[_place]))
            skipAttribute();
    }
}

// Attributes say nothing to us, but a document with an unknown entity in one is damaged all the
// same.
void XmlMarkupScan::skipAttribute()
{
    takeName();
    skipSpace();
    const bool hasValue = take('=');
    skipSpace();
    if (!hasValue || _place == _text.size() || (_text[_place] != '"' && _text[_place] != '\''))
        failTag();
    const std::size_t value = _place + 1;
    _place = pastQuoted(_place);
    std::string unused;
    appendUnescaped(unused, _text.substr(value, _place - 1 - value), value);
}

std::string_view XmlMarkupScan::takeName()
{
    const std::size_t name = _place;
    if (name == _text.size() || !isNameStart(_text[name]))
        failTag();
    std::size_t end = name;
    while (end < _text.size() && isNamePart(_text[end]))
        ++end;
    _place = end;
    return _text.substr(name, end - name);
}

void XmlMarkupScan::skipSpace()
{
    while (_place < _text.size() && isXmlSpace(_text[_place]))
        ++_place;
}

bool XmlMarkupScan::take(char character)
{
    const bool isThere = _place < _text.size() && _text[_place] == character;
    _place += isThere ? 1 : 0;
    return isThere;
}

std::size_t XmlMarkupScan::pastQuoted(std::size_t quote) const
{
    const std::size_t end = _text.find(_text[quote], quote + 1);
    if (end == npos)
        failPropertyList("the quoted text at byte {} has no end", quote);
    return end + 1;
}

void XmlMarkupScan::failTag() const
{
    failPropertyList("the tag at byte {} {}", _start,
                     _place == _text.size() ? "has no end" : "is malformed");
}

} // namespace ventrik
