#include "Capture/RowWriter.h"

#include "Capture/CsvRowWriter.h"
#include "Capture/JsonRowWriter.h"
#include "Capture/PointRowWriter.h"
#include "Capture/RowColumns.h"

#include <fmt/format.h>

namespace ventrik
{

std::string rowSchema()
{
    std::string text = fmt::format("schema\t{}\n", RowColumns::schemaNumber);
    for (const auto& column : RowColumns::ofValues)
        text += fmt::format("{}\t{}\t{}\n", column.name, column.type, column.meaning);
    text += "\nThe row that ends a capture has \"capture\" and\n";
    for (const auto& column : RowColumns::ofClosing)
        text += fmt::format("{}\t{}\t{}\n", column.name, column.type, column.meaning);
    return text;
}

std::string rowHeading(RowFormat format)
{
    return format == RowFormat::Csv ? CsvRowWriter::heading() : std::string();
}

std::unique_ptr<RowWriter> RowWriter::create(RowFormat format, std::string_view capture,
                                             std::string_view technology)
{
    switch (format) {
    case RowFormat::Csv:
        return std::make_unique<CsvRowWriter>(capture, technology);
    case RowFormat::Influx:
        return std::make_unique<PointRowWriter>(capture, technology);
    case RowFormat::JsonLines:
        break;
    }
    return std::make_unique<JsonRowWriter>(capture, technology);
}

} // namespace ventrik
