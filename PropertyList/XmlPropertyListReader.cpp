#include "PropertyList/PropertyListReader.h"

#include "PropertyList/Base64.h"
#include "PropertyList/IsoDate.h"
#include "PropertyList/NumberText.h"
#include "PropertyList/PropertyListError.h"
#include "PropertyList/XmlMarkupScan.h"
#include "PropertyList/XmlText.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

using Kind = XmlPiece::Kind;

// Around the containers stands <plist>, and a value may stand in the innermost.
constexpr std::size_t maximumElementDepth = propertyListMaximumDepth + 2;

// "<name> at byte N"
std::string place(const XmlPiece& tag)
{
    return fmt::format("<{}> at byte {}", printable(tag.text), tag.offset);
}

// Builds values while it walks the document.
class XmlReader
{
  public:
    explicit XmlReader(std::string_view document) : _markup(document, maximumElementDepth) {}

    PlistValue read() { return readOnlyValue("document", true); }

  private:
    PlistValue readOnlyValue(std::string_view where, bool mayBePlist)
    {
        const XmlPiece element = nextTag();
        if (element.kind != Kind::StartTag)
            fail("no value in the {}", where);
        PlistValue value = mayBePlist && element.text == "plist"
                               ? readOnlyValue("<plist> element", false)
                               : readValue(element, 0);
        const XmlPiece second = nextTag();
        if (second.kind == Kind::StartTag)
            fail("{} is a second value in the {}", place(second), where);
        return value;
    }

    // `depth` containers are around the element.
    PlistValue readValue(const XmlPiece& element, std::size_t depth)
    {
        const auto reader = std::find_if(readers.begin(), readers.end(), [&](const auto& each) {
            return each.name == element.text;
        });
        if (reader == readers.end())
            fail("{} is no property-list value", place(element));
        if (reader->isContainer && depth == propertyListMaximumDepth)
            fail("nesting deeper than {} at byte {}", depth, element.offset);
        return (this->*reader->read)(element, depth + 1);
    }

    PlistValue readDictionary(const XmlPiece&, std::size_t depth)
    {
        PlistDictionary dictionary;
        std::string name;
        for (XmlPiece key = nextTag(); key.kind == Kind::StartTag; key = nextTag()) {
            if (key.text != "key")
                fail("{} stands without a key", place(key));
            readText(key, name);
            const XmlPiece value = nextTag();
            if (value.kind == Kind::EndTag || value.text == "key")
                fail("{} has no value", place(key));
            dictionary.set(name, readValue(value, depth));
        }
        return dictionary;
    }

    PlistValue readArray(const XmlPiece&, std::size_t depth)
    {
        PlistArray array;
        for (XmlPiece tag = nextTag(); tag.kind == Kind::StartTag; tag = nextTag())
            array.append(readValue(tag, depth));
        return array;
    }

    PlistValue readString(const XmlPiece& element, std::size_t)
    {
        std::string text;
        readText(element, text);
        return text;
    }

    // Text that must be of a certain form, through the parser of that form.
    template <auto parse>
    PlistValue readParsed(const XmlPiece& element, std::size_t)
    {
        std::string text;
        readText(element, text);
        auto value = parse(trimXmlSpace(text));
        if (!value)
            fail("{} holds \"{}\"", place(element), printable(text));
        return std::move(*value);
    }

    template <bool value>
    PlistValue readBoolean(const XmlPiece& element, std::size_t)
    {
        std::string text;
        readText(element, text);
        if (!isAllXmlSpace(text))
            fail("{} holds text", place(element));
        return value;
    }

    // The next tag, past white space.
    XmlPiece nextTag()
    {
        for (;;) {
            const XmlPiece piece = _markup.next();
            if (piece.kind != Kind::Text && piece.kind != Kind::Cdata)
                return piece;
            if (piece.kind == Kind::Cdata || !isAllXmlSpace(piece.text))
                fail("text between elements at byte {}", piece.offset);
        }
    }

    // Makes `text` that of an element which holds no other element, and goes past its end.
    void readText(const XmlPiece& element, std::string& text)
    {
        text.clear();
        for (XmlPiece piece = _markup.next(); piece.kind != Kind::EndTag; piece = _markup.next()) {
            if (piece.kind == Kind::StartTag)
                fail("{} inside {}, which holds only text", place(piece), place(element));
            if (piece.kind == Kind::Cdata)
                appendWithLineEnds(text, piece.text);
            else
                appendUnescaped(text, piece.text, piece.offset);
        }
    }

    // A document with malformed markup is told as such, whatever else is wrong before it.
    template <typename... Arguments>
    [[noreturn]] void fail(fmt::format_string<Arguments...> format, Arguments&&... arguments)
    {
        while (_markup.next().kind != Kind::DocumentEnd) {
        }
        failPropertyList(format, std::forward<Arguments>(arguments)...);
    }

    struct ElementReader {
        std::string_view name;
        PlistValue (XmlReader::*read)(const XmlPiece& element, std::size_t depth);
        bool isContainer = false;
    };
    static const std::array<ElementReader, 9> readers;

    XmlMarkupScan _markup;
};

constexpr std::array<XmlReader::ElementReader, 9> XmlReader::readers{{
    {"dict", &XmlReader::readDictionary, true},
    {"array", &XmlReader::readArray, true},
    {"string", &XmlReader::readString},
    {"integer", &XmlReader::readParsed<parseInteger>},
    {"real", &XmlReader::readParsed<parseReal>},
    {"true", &XmlReader::readBoolean<true>},
    {"false", &XmlReader::readBoolean<false>},
    {"date", &XmlReader::readParsed<parseIsoDate>},
    {"data", &XmlReader::readParsed<decodeBase64>},
}};

PlistValue readText(ByteView data)
{
    if (data.size() > propertyListMaximumSize)
        failPropertyList("{} bytes are more than the {} allowed", data.size(),
                         propertyListMaximumSize);
    const std::string_view text(reinterpret_cast<const char*>(data.data()), data.size());
    if (const auto problem = xmlTextProblem(text))
        throw PropertyListError(*problem);
    return XmlReader(text).read();
}

} // namespace

PropertyListReading readXmlPropertyList(ByteView data)
{
    try {
        return {readText(data), {}};
    } catch (const PropertyListError& error) {
        return {std::nullopt, fmt::format("XML property list: {}", error.what())};
    }
}

} // namespace ventrik
