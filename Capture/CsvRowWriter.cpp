#include "Capture/CsvRowWriter.h"

#include "Capture/RowColumns.h"
#include "Capture/RowText.h"
#include "PropertyList/TerminalText.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

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

std::string captureColumn(std::string_view capture)
{
    std::string row;
    appendCsvText(row, capture);
    return row;
}

} // namespace

CsvRowWriter::CsvRowWriter(std::string_view capture, std::string_view technology)
    : ColumnRowWriter({.nameLength = 1,
                       .valueEnd = std::string(RowColumns::ofClosing.size(), ',') + "\n",
                       .closingFront = std::string(RowColumns::ofValues.size() - 1, ','),
                       .closingEnd = "\n"},
                      captureColumn(capture), technology)
{
}

std::string CsvRowWriter::heading()
{
    std::string heading;
    for (const auto& column : RowColumns::ofValues)
        heading += fmt::format("{}{}", heading.empty() ? "" : ",", column.name);
    for (const auto& column : RowColumns::ofClosing)
        heading += fmt::format(",{}", column.name);
    return heading + "\n";
}

void CsvRowWriter::addText(std::string& row, std::string_view text) const
{
    appendCsvText(row, text);
}

} // namespace ventrik
