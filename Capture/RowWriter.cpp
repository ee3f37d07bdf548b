#include "Capture/RowWriter.h"

#include "PropertyList/Json.h"
#include "PropertyList/TerminalText.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cmath>
#include <concepts>

#include <fmt/chrono.h>
#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr int schemaNumber = 1;

struct Column {
    std::string_view name;
    std::string_view type;
    std::string_view meaning;
};

constexpr std::array<Column, 15> valueColumns{{
    {"capture", "text", "the capture, as it was named"},
    {"record", "whole number", "its number in the capture, from 0"},
    {"time", "text", "of the record: ISO 8601, UTC, with microseconds"},
    {"subscription", "whole number or null", "of the phone's two, where the capture tells"},
    {"technology", "text", "ifx, gsm, c2k, lte or utran"},
    {"code", "text or null", "the record's log code, as 0xB17F; null where no record tells"},
    {"version", "whole number or null", "of the record, where it has one"},
    {"layout", "text or null", "by which the record was read: base, newer or not known"},
    {"section", "text", "the part of the display that shows the value"},
    {"path", "text", "of the value among the panes; with a / at its end that of an empty group"},
    {"index", "whole number or null", "the place in the innermost list on the path, from 0"},
    {"name", "text", "the value's name, the last part of the path"},
    {"number", "number or null", "the value, where it is one; null in a row of what went away"},
    {"unit", "text or null", "the number's"},
    {"text", "text or null",
     "the value as it shows; null where what is at the path went away, with all below it"},
}};

// Of the row that ends a capture, beside the first one of the others.
constexpr std::array<Column, 7> closingColumns{{
    {"status", "text", "ok, damaged (in part or at its end) or empty"},
    {"offset", "whole number or null", "of the damage in the capture, where that is known"},
    {"reason", "text or null", "what is wrong with it"},
    {"records", "whole number", "in the capture"},
    {"decoded", "whole number", "of them those that the technology's decoders ask for"},
    {"rows", "whole number", "those of values"},
    {"bytes", "whole number", "of the records"},
}};

void appendQuotedWhereNeeded(std::string& row, std::string_view text)
{
    const bool isPlain = !text.empty() && text.find_first_of(",\"\r\n") == text.npos;
    if (isPlain) {
        row += text;
        return;
    }
    row += '"';
    for (const char character : text) {
        if (character == '"')
            row += '"';
        row += character;
    }
    row += '"';
}

bool isPlainAscii(std::string_view text)
{
    return std::ranges::all_of(text,
                               [](char character) { return character >= ' ' && character <= '~'; });
}

// What a terminal would obey, and programs stumble over; lines and columns stay.
std::string withoutControls(std::string_view text)
{
    constexpr std::string_view kept = "\t\r\n";
    std::string harmless;
    for (;;) {
        const std::size_t end = std::min(text.find_first_of(kept), text.size());
        appendTerminalText(harmless, text.substr(0, end));
        if (end == text.size())
            return harmless;
        harmless += text[end];
        text.remove_prefix(end + 1);
    }
}

// JSON has escapes, a table has none.
void appendCsvText(std::string& row, std::string_view text)
{
    if (!isPlainAscii(text)) {
        const std::string harmless = withoutControls(text);
        return appendQuotedWhereNeeded(row, harmless);
    }
    appendQuotedWhereNeeded(row, text);
}

template <std::integral Number>
void appendDigits(std::string& row, Number number)
{
    const fmt::format_int digits(number);
    row.append(digits.data(), digits.size());
}

// A number of four decimals at most, as most are; false for others. A decimal of 15 digits at most
// that is read as the number is also the shortest one that is.
bool appendFewDecimals(std::string& row, double number)
{
    constexpr double most = 1e10;
    constexpr double scale = 10000;
    constexpr std::size_t decimals = 4;
    if (std::abs(number) >= most)
        return false;
    const double scaled = std::nearbyint(number * scale);
    if (scaled / scale != number)
        return false;
    if (scaled < 0)
        row += '-';
    const auto whole = static_cast<std::uint64_t>(std::abs(scaled));
    const auto ofScale = static_cast<std::uint64_t>(scale);
    appendDigits(row, whole / ofScale);
    // Of five digits the last four, without the zeros at their end.
    const fmt::format_int digits(ofScale + whole % ofScale);
    std::string_view fraction(digits.data() + 1, decimals);
    fraction = fraction.substr(0, fraction.find_last_not_of('0') + 1);
    if (!fraction.empty())
        (row += '.') += fraction;
    return true;
}

// So many digits as tell the number from all others.
void appendDigits(std::string& row, double number)
{
    constexpr double largestWhole = 1e15;
    const bool isWhole = std::abs(number) < largestWhole && std::trunc(number) == number;
    if (isWhole)
        appendDigits(row, static_cast<std::int64_t>(number));
    else if (!appendFewDecimals(row, number))
        fmt::format_to(std::back_inserter(row), FMT_COMPILE("{}"), number);
}

// So many kinds of records are kept, which few captures have.
constexpr std::size_t kindPartCount = 256;

std::size_t hashOf(const RecordKind& kind)
{
    return kind.logCode * 31U + kind.version.value_or(0) * 7U +
           (kind.layout ? static_cast<std::size_t>(*kind.layout) : 3);
}

// Rows tell nothing of a record's size.
bool areAlike(const std::optional<RecordKind>& a, const std::optional<RecordKind>& b)
{
    return a.has_value() == b.has_value() &&
           (!a || (a->logCode == b->logCode && a->version == b->version && a->layout == b->layout));
}

// With a backslash before each of the special characters.
void appendEscaped(std::string& point, std::string_view text, std::string_view special)
{
    for (const char character : text) {
        if (special.find(character) != special.npos)
            point += '\\';
        point += character;
    }
}

// A point is one line.
std::string onOneLine(std::string_view text)
{
    std::string line;
    appendTerminalText(line, text);
    return line;
}

// No tag is empty, and a backslash in one would be taken for an escape.
void appendTag(std::string& point, std::string_view name, std::string_view value)
{
    if (value.empty())
        return;
    std::string line = onOneLine(value);
    std::ranges::replace(line, '\\', '/');
    ((point += ',') += name) += '=';
    appendEscaped(point, line, ",= ");
}

void appendFieldText(std::string& point, std::string_view text)
{
    point += '"';
    appendEscaped(point, isPlainAscii(text) ? text : std::string_view(onOneLine(text)), "\"\\");
    point += '"';
}

// Beyond that many fields of nothing a row of values, or before them the closing one, begins.
template <std::size_t size>
std::string nothings(const std::array<Column, size>&)
{
    return std::string(size, ',');
}

} // namespace

std::string rowSchema()
{
    std::string text = fmt::format("schema\t{}\n", schemaNumber);
    for (const Column& column : valueColumns)
        text += fmt::format("{}\t{}\t{}\n", column.name, column.type, column.meaning);
    text += "\nThe row that ends a capture has \"capture\" and\n";
    for (const Column& column : closingColumns)
        text += fmt::format("{}\t{}\t{}\n", column.name, column.type, column.meaning);
    return text;
}

std::string rowHeading(RowFormat format)
{
    if (format != RowFormat::Csv)
        return {};
    std::string heading;
    for (const Column& column : valueColumns)
        heading += fmt::format("{}{}", heading.empty() ? "" : ",", column.name);
    for (const Column& column : closingColumns)
        heading += fmt::format(",{}", column.name);
    return heading + "\n";
}

RowWriter::RowWriter(RowFormat format, std::string_view capture, std::string_view technology)
    : _format(format),
      _technology(technology),
      _csvEnd(nothings(closingColumns) + "\n"),
      _kindParts(kindPartCount)
{
    if (isPoint()) {
        appendTag(_capture, "capture", capture);
    } else if (isJson()) {
        _capture = "{\"capture\":";
        appendJsonText(_capture, capture);
    } else {
        appendCsvText(_capture, capture);
    }
}

// The name comes with all that stands before a JSON value; CSV needs the comma.
void RowWriter::addName(std::string& row, std::string_view column) const
{
    row += isJson() ? column : column.substr(0, 1);
}

void RowWriter::addText(std::string& row, std::string_view column, std::string_view text) const
{
    addName(row, column);
    if (isJson())
        appendJsonText(row, text);
    else
        appendCsvText(row, text);
}

void RowWriter::addNull(std::string& row, std::string_view column) const
{
    addName(row, column);
    if (isJson())
        row += "null";
}

void RowWriter::addTextOrNull(std::string& row, std::string_view column,
                              std::string_view text) const
{
    if (text.empty())
        addNull(row, column);
    else
        addText(row, column, text);
}

template <typename Number>
void RowWriter::addNumber(std::string& row, std::string_view column, const Number& number) const
{
    if (!number)
        return addNull(row, column);
    addName(row, column);
    appendDigits(row, *number);
}

std::string_view RowWriter::recordPart(const RowRecord& record)
{
    if (isPoint())
        return timePart(record.time);
    const auto micros = std::chrono::floor<std::chrono::microseconds>(record.time);
    const auto second = std::chrono::floor<std::chrono::seconds>(micros);
    const KindPart& kind = kindPart(record);
    const fmt::format_int number(record.number);
    // Of seven digits the last six.
    const fmt::format_int fraction(1000000U +
                                   static_cast<std::uint32_t>((micros - second).count()));
    if (_secondPart.empty() || second != _second) {
        _second = second;
        _secondPart.clear();
        addName(_secondPart, R"(,"time":)");
        _secondPart += fmt::format(FMT_COMPILE("{}{:%FT%T}."), isJson() ? "\"" : "", second);
        _kind = 0;
    }
    if (_recordPart.empty()) {
        _recordPart = _capture + (isJson() ? ",\"record\":" : ",");
        _numberStart = _recordPart.size();
    }
    // Else all stands where it stood in the record before.
    if (kind.serial != _kind || number.size() != _numberSize) {
        _kind = kind.serial;
        _numberSize = number.size();
        _fractionStart = _numberStart + _numberSize + _secondPart.size();
        _recordPart.resize(_numberStart + _numberSize);
        _recordPart += _secondPart;
        _recordPart.resize(_fractionStart + fraction.size() - 1);
        _recordPart += kind.text;
    }
    std::copy_n(number.data(), number.size(), _recordPart.data() + _numberStart);
    std::copy_n(fraction.data() + 1, fraction.size() - 1, _recordPart.data() + _fractionStart);
    return _recordPart;
}

const RowWriter::KindPart& RowWriter::kindPart(const RowRecord& record)
{
    KindPart& part = _kindParts[(record.kind ? hashOf(*record.kind) : 0) % kindPartCount];
    if (!part.text.empty() && part.subscription == record.subscription &&
        areAlike(part.kind, record.kind))
        return part;
    part = {record.subscription, record.kind, isJson() ? "Z\"" : "Z", ++_lastKind};
    addNumber(part.text, R"(,"subscription":)", record.subscription);
    addTextOrNull(part.text, R"(,"technology":)", _technology);
    if (record.kind)
        addText(part.text, R"(,"code":)",
                fmt::format(FMT_COMPILE("0x{:04X}"), record.kind->logCode));
    else
        addNull(part.text, R"(,"code":)");
    addNumber(part.text, R"(,"version":)", record.kind ? record.kind->version : std::nullopt);
    addTextOrNull(part.text, R"(,"layout":)",
                  record.kind && record.kind->layout ? nameOf(*record.kind->layout)
                                                     : std::string_view());
    return part;
}

std::string_view RowWriter::timePart(Clock::TimePoint time)
{
    _recordPart = fmt::format(FMT_COMPILE(" {}\n"), time.time_since_epoch().count());
    return _recordPart;
}

// Points of a path are a series. What tells records apart would make series without end.
std::string RowWriter::tagsOf(const RowPlace& place) const
{
    std::string tags = "ventrik" + _capture;
    appendTag(tags, "technology", _technology);
    appendTag(tags, "section", place.section);
    appendTag(tags, "path", place.path);
    if (place.index)
        appendTag(tags, "index", fmt::format_int(*place.index).c_str());
    appendTag(tags, "name", place.name);
    return tags;
}

void RowWriter::addFields(std::string& point, const RowValue& value) const
{
    if (!value.text) {
        point += " gone=true";
        return;
    }
    point += " text=";
    appendFieldText(point, *value.text);
    if (!value.number || !std::isfinite(*value.number))
        return;
    point += ",number=";
    appendDigits(point, *value.number);
    if (value.unit.empty())
        return;
    point += ",unit=";
    appendFieldText(point, value.unit);
}

// Without a time: that is when it comes to the engine.
void RowWriter::appendClosingPoint(std::string& rows, const RowClosing& closing) const
{
    rows += "ventrik_capture" + _capture;
    appendTag(rows, "technology", _technology);
    rows += " status=";
    appendFieldText(rows, closing.status);
    if (!closing.reason.empty()) {
        rows += ",reason=";
        appendFieldText(rows, closing.reason);
    }
    if (closing.offset)
        rows += fmt::format(",offset={}i", *closing.offset);
    rows += fmt::format(",records={}i,decoded={}i,rows={}i,bytes={}i\n", closing.records,
                        closing.decoded, closing.rows, closing.bytes);
}

std::string RowWriter::placePart(const RowPlace& place) const
{
    if (isPoint())
        return tagsOf(place);
    std::string row;
    addText(row, R"(,"section":)", place.section);
    addText(row, R"(,"path":)", place.path);
    addNumber(row, R"(,"index":)", place.index);
    addText(row, R"(,"name":)", place.name);
    return row;
}

void RowWriter::addValue(std::string& row, const RowValue& value) const
{
    if (isPoint())
        return addFields(row, value);
    constexpr std::size_t most = 96; // as a rule
    row.reserve(most);
    // JSON has no number that is not finite.
    const bool isNumber = value.number && std::isfinite(*value.number);
    addNumber(row, R"(,"number":)", isNumber ? value.number : std::nullopt);
    addTextOrNull(row, R"(,"unit":)", isNumber ? value.unit : std::string_view());
    if (value.text)
        addText(row, R"(,"text":)", *value.text);
    else
        addNull(row, R"(,"text":)");
    row += isJson() ? std::string_view("}\n") : _csvEnd;
}

void RowWriter::appendClosing(std::string& rows, const RowClosing& closing) const
{
    if (isPoint())
        return appendClosingPoint(rows, closing);
    rows += _capture;
    if (!isJson())
        rows += nothings(valueColumns).substr(1);
    addText(rows, R"(,"status":)", closing.status);
    addNumber(rows, R"(,"offset":)", closing.offset);
    addTextOrNull(rows, R"(,"reason":)", closing.reason);
    addNumber(rows, R"(,"records":)", std::optional(closing.records));
    addNumber(rows, R"(,"decoded":)", std::optional(closing.decoded));
    addNumber(rows, R"(,"rows":)", std::optional(closing.rows));
    addNumber(rows, R"(,"bytes":)", std::optional(closing.bytes));
    rows += isJson() ? "}\n" : "\n";
}

} // namespace ventrik
