#include "PropertyList/PropertyListWriter.h"

#include "PropertyList/Base64.h"
#include "PropertyList/IsoDate.h"
#include "PropertyList/NumberText.h"
#include "PropertyList/PropertyListError.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/XmlText.h"

#include <variant>

namespace ventrik
{

namespace
{

constexpr std::size_t dataLineLength = 76;
constexpr std::string_view replacement = "\uFFFD";

enum class Unfit { Refused, Replaced };

// Writes one document, knowing the way to the value at hand for indentation and errors.
class XmlWriter
{
  public:
    explicit XmlWriter(Unfit unfit) : _unfit(unfit) {}

    std::size_t replaced() const { return _replaced; }
    std::string write(const PlistValue& value)
    {
        _text = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\">\n";
        writeValue(value);
        return std::move(_text) + "</plist>\n";
    }

  private:
    using Step = std::variant<std::string_view, std::size_t>;

    void writeValue(const PlistValue& value)
    {
        switch (value.kind()) {
        case PlistValue::Kind::String:
            return writeText("string", *value.string());
        case PlistValue::Kind::Integer:
            return writeElement("integer", value.integer()->decimal());
        case PlistValue::Kind::Real:
            return writeElement("real", formatReal(*value.real()));
        case PlistValue::Kind::Boolean:
            return writeLine(*value.boolean() ? "<true/>" : "<false/>");
        case PlistValue::Kind::Date:
            return writeDate(*value.date());
        case PlistValue::Kind::Data:
            return writeData(*value.data());
        case PlistValue::Kind::Array:
            return writeArray(*value.array());
        case PlistValue::Kind::Dictionary:
            return writeDictionary(*value.dictionary());
        }
    }

    void indent() { _text.append(_path.size(), '\t'); }

    void writeLine(std::string_view line)
    {
        indent();
        _text += line;
        _text += '\n';
    }

    void writeElement(std::string_view name, std::string_view content)
    {
        writeStartTag(name);
        _text += content;
        writeEndTag(name);
    }

    void writeStartTag(std::string_view name)
    {
        indent();
        _text += '<';
        _text += name;
        _text += '>';
    }

    void writeEndTag(std::string_view name)
    {
        _text += "</";
        _text += name;
        _text += ">\n";
    }

    void writeText(std::string_view name, std::string_view text)
    {
        const auto problem = xmlTextProblem(text);
        if (problem && _unfit == Unfit::Refused)
            fail(fmt::format("in the {}, {}", name, *problem));
        writeStartTag(name);
        if (problem)
            appendEscaped(_text, replaceUnfit(text, _replaced));
        else
            appendEscaped(_text, text);
        writeEndTag(name);
    }

    // Writes U+FFFD for a value that cannot be written, where that is wanted.
    void replaceOrFail(std::string_view problem)
    {
        if (_unfit == Unfit::Refused)
            fail(problem);
        ++_replaced;
        writeElement("string", replacement);
    }

    void writeDate(PlistDate date)
    {
        const auto text = formatIsoDate(date);
        if (text)
            writeElement("date", *text);
        else
            replaceOrFail("the date is outside the years 1 to 9999");
    }

    void writeData(const Bytes& data)
    {
        writeLine("<data>");
        const std::string text = encodeBase64(data);
        for (std::size_t start = 0; start < text.size(); start += dataLineLength)
            writeLine(std::string_view(text).substr(start, dataLineLength));
        writeLine("</data>");
    }

    void writeArray(const PlistArray& array)
    {
        if (isTooDeep())
            return replaceOrFail(tooDeep());
        if (array.empty())
            return writeLine("<array/>");
        writeLine("<array>");
        for (std::size_t i = 0; i < array.size(); ++i) {
            enter(i);
            writeValue(array[i]);
            _path.pop_back();
        }
        writeLine("</array>");
    }

    void writeDictionary(const PlistDictionary& dictionary)
    {
        if (isTooDeep())
            return replaceOrFail(tooDeep());
        if (dictionary.empty())
            return writeLine("<dict/>");
        writeLine("<dict>");
        for (const PlistDictionary::Entry& entry : dictionary) {
            enter(std::string_view(entry.key));
            writeText("key", entry.key);
            writeValue(entry.value);
            _path.pop_back();
        }
        writeLine("</dict>");
    }

    void enter(Step step) { _path.push_back(step); }

    // A container at the path needs a level of its own.
    bool isTooDeep() const { return _path.size() == propertyListMaximumDepth; }
    static std::string tooDeep()
    {
        return fmt::format("nesting deeper than {}", propertyListMaximumDepth);
    }

    [[noreturn]] void fail(std::string_view problem) const
    {
        failPropertyList("{}: {}", path(), problem);
    }

    // "/Key/0/Key", the way from the top to the value at hand; "/" is the top itself.
    std::string path() const
    {
        std::string path;
        for (const Step& step : _path) {
            if (const auto* key = std::get_if<std::string_view>(&step))
                path += "/" + printable(*key);
            else
                path += fmt::format("/{}", std::get<std::size_t>(step));
        }
        return path.empty() ? "/" : path;
    }

    Unfit _unfit;
    std::size_t _replaced = 0;
    std::string _text;
    std::vector<Step> _path;
};

PropertyListWriting writeXml(const PlistValue& value, Unfit unfit)
{
    try {
        XmlWriter writer(unfit);
        std::string text = writer.write(value);
        return {std::move(text), {}, writer.replaced()};
    } catch (const PropertyListError& error) {
        return {std::nullopt, fmt::format("property list not written: {}", error.what())};
    }
}

} // namespace

PropertyListWriting writeXmlPropertyList(const PlistValue& value)
{
    return writeXml(value, Unfit::Refused);
}

std::optional<Bytes> propertyListBytes(const PlistValue& value)
{
    const PropertyListWriting writing = writeXmlPropertyList(value);
    return writing ? std::optional<Bytes>(std::in_place, writing.text->begin(), writing.text->end())
                   : std::nullopt;
}

PropertyListWriting writeXmlPropertyListReplacing(const PlistValue& value)
{
    return writeXml(value, Unfit::Replaced);
}

} // namespace ventrik
