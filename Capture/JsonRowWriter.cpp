#include "Capture/JsonRowWriter.h"

#include "PropertyList/Json.h"

namespace ventrik
{

namespace
{

std::string captureColumn(std::string_view capture)
{
    std::string row = "{\"capture\":";
    appendJsonText(row, capture);
    return row;
}

} // namespace

JsonRowWriter::JsonRowWriter(std::string_view capture, std::string_view technology)
    : ColumnRowWriter({.nameLength = std::string_view::npos,
                       .nothing = "null",
                       .quote = "\"",
                       .valueEnd = "}\n",
                       .closingEnd = "}\n"},
                      captureColumn(capture), technology)
{
}

void JsonRowWriter::addText(std::string& row, std::string_view text) const
{
    appendJsonText(row, text);
}

} // namespace ventrik
