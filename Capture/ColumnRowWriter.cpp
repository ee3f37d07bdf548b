#include "Capture/ColumnRowWriter.h"

#include "Capture/RowText.h"

#include <algorithm>
#include <cmath>

#include <fmt/chrono.h>
#include <fmt/compile.h>

namespace ventrik
{

namespace
{

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

} // namespace

ColumnRowWriter::ColumnRowWriter(Marks marks, std::string capture, std::string_view technology)
    : _marks(std::move(marks)),
      _capture(std::move(capture)),
      _technology(technology),
      _kindParts(kindPartCount)
{
    _record = _capture;
    addName(_record, R"(,"record":)");
    _numberStart = _record.size();
}

void ColumnRowWriter::addName(std::string& row, std::string_view name) const
{
    row += name.substr(0, _marks.nameLength);
}

void ColumnRowWriter::addNothing(std::string& row, std::string_view name) const
{
    addName(row, name);
    row += _marks.nothing;
}

void ColumnRowWriter::addColumn(std::string& row, std::string_view name,
                                std::string_view text) const
{
    addName(row, name);
    addText(row, text);
}

void ColumnRowWriter::addTextOrNothing(std::string& row, std::string_view name,
                                       std::string_view text) const
{
    if (text.empty())
        addNothing(row, name);
    else
        addColumn(row, name, text);
}

template <typename Number>
void ColumnRowWriter::addNumber(std::string& row, std::string_view name, const Number& number) const
{
    if (!number)
        return addNothing(row, name);
    addName(row, name);
    appendDigits(row, *number);
}

RecordPart ColumnRowWriter::recordPart(const RowRecord& record)
{
    using namespace std::chrono_literals;
    const KindPart& kind = kindPart(record);
    const fmt::format_int number(record.number);
    const auto micros = std::chrono::floor<std::chrono::microseconds>(record.time);
    if (_secondPart.empty() || micros < _second || micros >= _second + 1s)
        beginSecond(std::chrono::floor<std::chrono::seconds>(micros));
    // Of seven digits the last six.
    const auto sinceSecond = static_cast<std::uint32_t>((micros - _second).count());
    const fmt::format_int fraction(1000000U + sinceSecond);
    const std::size_t fractionSize = fraction.size() - 1;
    // Else all stands where it stood in the record before.
    if (_kind == 0 || number.size() != _numberSize) {
        _numberSize = number.size();
        _fractionStart = _numberStart + _numberSize + _secondPart.size();
        _record.resize(_numberStart + _numberSize);
        _record += _secondPart;
        _record.resize(_fractionStart + fractionSize);
        _kind = 0;
    }
    if (kind.serial != _kind) {
        _kind = kind.serial;
        _record.resize(_fractionStart + fractionSize);
        _record += kind.text;
    }
    std::copy_n(number.data(), _numberSize, _record.data() + _numberStart);
    std::copy_n(fraction.data() + 1, fractionSize, _record.data() + _fractionStart);
    return {.front = _record};
}

void ColumnRowWriter::beginSecond(std::chrono::sys_seconds second)
{
    _second = second;
    _secondPart.clear();
    addName(_secondPart, R"(,"time":)");
    _secondPart += fmt::format(FMT_COMPILE("{}{:%FT%T}."), _marks.quote, second);
    _kind = 0;
}

const ColumnRowWriter::KindPart& ColumnRowWriter::kindPart(const RowRecord& record)
{
    KindPart& part = _kindParts[(record.kind ? hashOf(*record.kind) : 0) % kindPartCount];
    if (!part.text.empty() && part.subscription == record.subscription &&
        areAlike(part.kind, record.kind))
        return part;
    part = {record.subscription, record.kind, "Z" + _marks.quote, ++_lastKind};
    addNumber(part.text, R"(,"subscription":)", record.subscription);
    addTextOrNothing(part.text, R"(,"technology":)", _technology);
    if (record.kind)
        addColumn(part.text, R"(,"code":)",
                  fmt::format(FMT_COMPILE("0x{:04X}"), record.kind->logCode));
    else
        addNothing(part.text, R"(,"code":)");
    addNumber(part.text, R"(,"version":)", record.kind ? record.kind->version : std::nullopt);
    addTextOrNothing(part.text, R"(,"layout":)",
                     record.kind && record.kind->layout ? nameOf(*record.kind->layout)
                                                        : std::string_view());
    return part;
}

std::string ColumnRowWriter::placePart(const RowPlace& place) const
{
    constexpr std::size_t names = 64;
    std::string row;
    row.reserve(names + place.section.size() + place.path.size() + place.name.size());
    addColumn(row, R"(,"section":)", place.section);
    addColumn(row, R"(,"path":)", place.path);
    addNumber(row, R"(,"index":)", place.index);
    addColumn(row, R"(,"name":)", place.name);
    return row;
}

void ColumnRowWriter::addValue(std::string& row, const RowValue& value) const
{
    constexpr std::size_t most = 96; // as a rule
    row.reserve(most);
    // JSON has no number that is not finite.
    const bool isNumber = value.number && std::isfinite(*value.number);
    addNumber(row, R"(,"number":)", isNumber ? value.number : std::nullopt);
    addTextOrNothing(row, R"(,"unit":)", isNumber ? value.unit : std::string_view());
    if (value.text)
        addColumn(row, R"(,"text":)", *value.text);
    else
        addNothing(row, R"(,"text":)");
    row += _marks.valueEnd;
}

void ColumnRowWriter::appendClosing(std::string& rows, const RowClosing& closing) const
{
    rows += _capture;
    rows += _marks.closingFront;
    addColumn(rows, R"(,"status":)", closing.status);
    addNumber(rows, R"(,"offset":)", closing.offset);
    addTextOrNothing(rows, R"(,"reason":)", closing.reason);
    addNumber(rows, R"(,"records":)", std::optional(closing.records));
    addNumber(rows, R"(,"decoded":)", std::optional(closing.decoded));
    addNumber(rows, R"(,"rows":)", std::optional(closing.rows));
    addNumber(rows, R"(,"bytes":)", std::optional(closing.bytes));
    rows += _marks.closingEnd;
}

} // namespace ventrik
