#include "PropertyList/PropertyListReader.h"

#include "PropertyList/Base64.h"
#include "PropertyList/IsoDate.h"
#include "PropertyList/NumberText.h"
#include "PropertyList/PropertyListError.h"
#include "PropertyList/XmlMarkupScan.h"
#include "PropertyList/XmlText.h"

#include <algorithm>
#include <array>

#include <pugixml.hpp>

namespace ventrik
{

namespace
{

using pugi::xml_node;

// References and line ends are left as they stand: only then does every text keep its place in the
// document for errors, and an unknown entity does not slip through.
constexpr unsigned parseOptions = pugi::parse_fragment | pugi::parse_cdata | pugi::parse_ws_pcdata;

std::size_t offsetOf(const xml_node& node)
{
    const auto offset = static_cast<std::size_t>(std::max<std::ptrdiff_t>(node.offset_debug(), 0));
    return node.type() == pugi::node_element && offset > 0 ? offset - 1 : offset;
}

// "<name> at byte N"
std::string place(const xml_node& element)
{
    return fmt::format("<{}> at byte {}", printable(element.name()), offsetOf(element));
}

bool isElement(const xml_node& node)
{
    return node.type() == pugi::node_element;
}

void requireOnlySpace(const xml_node& node)
{
    if (node.type() != pugi::node_pcdata || !isAllXmlSpace(node.value()))
        failPropertyList("text between elements at byte {}", offsetOf(node));
}

// The elements inside a node that holds nothing else but white space.
std::vector<xml_node> childElements(const xml_node& parent)
{
    std::vector<xml_node> elements;
    for (const xml_node& child : parent) {
        if (isElement(child))
            elements.push_back(child);
        else
            requireOnlySpace(child);
    }
    return elements;
}

// The text inside an element that holds no other element.
std::string textOf(const xml_node& element)
{
    std::string text;
    for (const xml_node& child : element) {
        if (isElement(child))
            failPropertyList("{} inside {}, which holds only text", place(child), place(element));
        if (child.type() == pugi::node_cdata)
            appendWithLineEnds(text, child.value());
        else
            appendUnescaped(text, child.value(), offsetOf(child));
    }
    return text;
}

// Attributes say nothing to us, but a document with an unknown entity in one is damaged all the
// same.
void checkAttributes(const xml_node& element)
{
    std::string unused;
    for (const pugi::xml_attribute& attribute : element.attributes())
        appendUnescaped(unused, attribute.value(), offsetOf(element));
}

PlistValue readValue(const xml_node& element, std::size_t depth);

PlistValue readDictionary(const xml_node& element, std::size_t depth)
{
    PlistDictionary dictionary;
    const std::vector<xml_node> children = childElements(element);
    for (std::size_t i = 0; i < children.size(); i += 2) {
        const xml_node& key = children[i];
        if (std::string_view(key.name()) != "key")
            failPropertyList("{} stands without a key", place(key));
        if (i + 1 == children.size() || std::string_view(children[i + 1].name()) == "key")
            failPropertyList("{} has no value", place(key));
        checkAttributes(key);
        dictionary.set(textOf(key), readValue(children[i + 1], depth));
    }
    return dictionary;
}

PlistValue readArray(const xml_node& element, std::size_t depth)
{
    PlistArray array;
    for (const xml_node& child : childElements(element))
        array.append(readValue(child, depth));
    return array;
}

PlistValue readString(const xml_node& element, std::size_t)
{
    return textOf(element);
}

// Text that must be of a certain form, through the parser of that form.
template <auto parse>
PlistValue readParsed(const xml_node& element, std::size_t)
{
    const std::string text = textOf(element);
    auto value = parse(trimXmlSpace(text));
    if (!value)
        failPropertyList("{} holds \"{}\"", place(element), printable(text));
    return std::move(*value);
}

template <bool value>
PlistValue readBoolean(const xml_node& element, std::size_t)
{
    if (!isAllXmlSpace(textOf(element)))
        failPropertyList("{} holds text", place(element));
    return value;
}

struct ElementReader {
    std::string_view name;
    PlistValue (*read)(const xml_node& element, std::size_t depth);
    bool isContainer = false;
};
constexpr std::array<ElementReader, 9> elementReaders{{
    {"dict", readDictionary, true},
    {"array", readArray, true},
    {"string", readString},
    {"integer", readParsed<parseInteger>},
    {"real", readParsed<parseReal>},
    {"true", readBoolean<true>},
    {"false", readBoolean<false>},
    {"date", readParsed<parseIsoDate>},
    {"data", readParsed<decodeBase64>},
}};

// `depth` containers are around the element.
PlistValue readValue(const xml_node& element, std::size_t depth)
{
    const std::string_view name = element.name();
    const auto reader = std::find_if(elementReaders.begin(), elementReaders.end(),
                                     [&](const auto& each) { return each.name == name; });
    if (reader == elementReaders.end())
        failPropertyList("{} is no property-list value", place(element));
    if (reader->isContainer && depth == propertyListMaximumDepth)
        failPropertyList("nesting deeper than {} at byte {}", depth, offsetOf(element));
    checkAttributes(element);
    return reader->read(element, depth + 1);
}

xml_node onlyElement(const xml_node& parent, std::string_view where)
{
    const std::vector<xml_node> elements = childElements(parent);
    if (elements.empty())
        failPropertyList("no value in the {}", where);
    if (elements.size() > 1)
        failPropertyList("{} is a second value in the {}", place(elements[1]), where);
    return elements.front();
}

PlistValue readDocument(const pugi::xml_document& document)
{
    const xml_node root = onlyElement(document, "document");
    if (std::string_view(root.name()) != "plist")
        return readValue(root, 0);
    checkAttributes(root);
    return readValue(onlyElement(root, "<plist> element"), 0);
}

void checkSize(std::size_t size)
{
    if (size > propertyListMaximumSize)
        failPropertyList("{} bytes are more than the {} allowed", size, propertyListMaximumSize);
}

void blank(std::string& text, std::size_t start, std::size_t length)
{
    std::fill_n(text.begin() + static_cast<std::ptrdiff_t>(start), length, ' ');
}

// Turns away what must not reach the parser. What it need not see becomes spaces, so that the rest
// keeps its place.
void prepare(std::string& text)
{
    constexpr std::string_view byteOrderMark = "\xef\xbb\xbf";
    // Around the containers stands <plist>, and a value may stand in the innermost.
    constexpr std::size_t maximumElementDepth = propertyListMaximumDepth + 2;
    if (text.starts_with(byteOrderMark))
        blank(text, 0, byteOrderMark.size());
    if (const auto problem = xmlTextProblem(text))
        throw PropertyListError(*problem);
    const XmlMarkup markup = scanXmlMarkup(text, maximumElementDepth);
    blank(text, markup.doctypeStart, markup.doctypeLength);
    // The parser drops the last character where that is text, so let it drop this one.
    text += '\n';
}

PlistValue readText(ByteView data)
{
    checkSize(data.size());
    std::string text(data.begin(), data.end());
    prepare(text);
    pugi::xml_document document;
    const pugi::xml_parse_result result =
        document.load_buffer_inplace(text.data(), text.size(), parseOptions, pugi::encoding_utf8);
    if (!result)
        failPropertyList("{} at byte {}", result.description(), result.offset);
    return readDocument(document);
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
