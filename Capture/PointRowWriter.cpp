#include "Capture/PointRowWriter.h"

#include "Capture/RowText.h"
#include "PropertyList/TerminalText.h"

#include <algorithm>
#include <cmath>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

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

} // namespace

PointRowWriter::PointRowWriter(std::string_view capture, std::string_view technology)
{
    appendTag(_tags, "capture", capture);
    appendTag(_tags, "technology", technology);
}

RecordPart PointRowWriter::recordPart(const RowRecord& record)
{
    _time = fmt::format(FMT_COMPILE(" {}\n"), record.time.time_since_epoch().count());
    return {.back = _time};
}

std::string PointRowWriter::placePart(const RowPlace& place) const
{
    std::string tags = "ventrik" + _tags;
    appendTag(tags, "section", place.section);
    appendTag(tags, "path", place.path);
    if (place.index)
        appendTag(tags, "index", fmt::format_int(*place.index).c_str());
    appendTag(tags, "name", place.name);
    return tags;
}

void PointRowWriter::addValue(std::string& row, const RowValue& value) const
{
    if (!value.text) {
        row += " gone=true";
        return;
    }
    row += " text=";
    appendFieldText(row, *value.text);
    if (!value.number || !std::isfinite(*value.number))
        return;
    row += ",number=";
    appendDigits(row, *value.number);
    if (value.unit.empty())
        return;
    row += ",unit=";
    appendFieldText(row, value.unit);
}

void PointRowWriter::appendClosing(std::string& rows, const RowClosing& closing) const
{
    rows += "ventrik_capture" + _tags + " status=";
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

} // namespace ventrik
