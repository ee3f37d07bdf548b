#include "Tools/Watch/TextCells.h"

#include "PropertyList/TerminalText.h"
#include "PropertyList/Utf8.h"

#include <algorithm>

#include <wchar.h>

namespace ventrik
{

namespace
{

constexpr std::string_view ellipsis = "…";
constexpr std::string_view replacementCharacter = "\xef\xbf\xbd";
constexpr std::size_t mostMarks = 4;
// More bytes than a cell can have: what follows is out of sight.
constexpr std::size_t mostBytesOfACell = 32;

// Joiners, variation selectors, tags and other invisible characters: terminals do not agree about
// the width of what they make of their neighbors.
constexpr bool joinsOrRestyles(char32_t code)
{
    return code == 0xad || code == 0x180e || (code >= 0x200b && code <= 0x200d) ||
           (code >= 0x2060 && code <= 0x206f) || (code >= 0xfe00 && code <= 0xfe0f) ||
           code == 0xfeff || (code >= 0xfff9 && code <= 0xfffb) ||
           (code >= 0xe0000 && code <= 0xe0fff);
}

void addCharacter(std::vector<TextCell>& cells, std::size_t& marks, std::string_view bytes,
                  char32_t code)
{
    const int width = wcwidth(static_cast<wchar_t>(code));
    if (width > 0)
        cells.push_back({std::string(bytes), width});
    else if (width < 0)
        cells.push_back(
            {std::string(code == 0x2028 || code == 0x2029 ? " " : replacementCharacter), 1});
    else if (cells.empty())
        cells.push_back({" " + std::string(bytes), 1}); // a mark on nothing
    else if (++marks <= mostMarks)
        cells.back().text += bytes;
    if (width != 0)
        marks = 0;
}

std::vector<TextCell> allCellsOf(std::string_view text)
{
    std::string harmless;
    appendTerminalText(harmless, text);
    std::vector<TextCell> cells;
    std::size_t marks = 0;
    for (std::string_view rest = harmless; !rest.empty();) {
        const Utf8Character character = decodeUtf8(rest);
        const std::size_t length = std::max<std::size_t>(character.length, 1);
        if (!joinsOrRestyles(character.code))
            addCharacter(cells, marks, rest.substr(0, length), character.code);
        rest.remove_prefix(length);
    }
    return cells;
}

std::string_view startOf(std::string_view text, int columns)
{
    return text.substr(0, (static_cast<std::size_t>(std::max(columns, 0)) + 2) * mostBytesOfACell);
}

std::string textOf(const std::vector<TextCell>& cells)
{
    std::string text;
    for (const TextCell& cell : cells)
        text += cell.text;
    return text;
}

int widthOf(const std::vector<TextCell>& cells)
{
    int width = 0;
    for (const TextCell& cell : cells)
        width += cell.width;
    return width;
}

void wrapParagraph(std::string_view paragraph, int columns, std::vector<std::string>& lines)
{
    std::vector<TextCell> line;
    int width = 0;
    for (TextCell& cell : allCellsOf(paragraph)) {
        if (width + cell.width > columns) {
            const auto blank = std::find_if(line.rbegin(), line.rend(),
                                            [](const TextCell& it) { return it.text == " "; });
            // Without a blank the line is full and breaks here.
            std::vector<TextCell> next(blank == line.rend() ? line.end() : blank.base(),
                                       line.end());
            line.resize(line.size() - next.size());
            lines.push_back(textOf(line));
            line = std::move(next);
            width = widthOf(line);
        }
        width += cell.width;
        line.push_back(std::move(cell));
    }
    lines.push_back(textOf(line));
}

} // namespace

std::vector<TextCell> cellsOf(std::string_view text, int columns)
{
    std::vector<TextCell> cells = allCellsOf(startOf(text, columns));
    for (int width = widthOf(cells); width > columns; cells.pop_back())
        width -= cells.back().width;
    return cells;
}

int widthOf(std::string_view text, int most)
{
    const std::string_view start = startOf(text, most);
    const int width = widthOf(allCellsOf(start));
    return start.size() < text.size() ? most + 1 : std::min(width, most + 1);
}

std::string cutToWidth(std::string_view text, int columns)
{
    if (columns <= 0)
        return {};
    if (widthOf(text, columns) <= columns)
        return textOf(allCellsOf(text));
    return textOf(cellsOf(text, columns - 1)) += ellipsis;
}

std::string cutFrontToWidth(std::string_view text, int columns)
{
    if (columns <= 0)
        return {};
    const std::size_t size = startOf(text, columns).size();
    std::vector<TextCell> cells = allCellsOf(text.substr(text.size() - size));
    if (size == text.size() && widthOf(cells) <= columns)
        return textOf(cells);
    auto first = cells.begin();
    for (int width = widthOf(cells); width > columns - 1; ++first)
        width -= first->width;
    cells.erase(cells.begin(), first);
    return std::string(ellipsis) + textOf(cells);
}

std::vector<std::string> wrapToWidth(std::string_view text, int columns)
{
    std::vector<std::string> lines;
    for (;;) {
        const std::size_t lineBreak = text.find('\n');
        wrapParagraph(text.substr(0, lineBreak), std::max(columns, 2), lines);
        if (lineBreak == std::string_view::npos)
            return lines;
        text.remove_prefix(lineBreak + 1);
    }
}

} // namespace ventrik
