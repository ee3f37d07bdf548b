#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What a terminal shows in one place: a character and the marks that combine with it.
struct TextCell {
    std::string text; ///< UTF-8
    int width = 1;    ///< columns: 1 or 2
};

/// The first cells of a text, as many as fit into so many columns. A terminal obeys nothing in
/// them, and shows each as wide as it says: what has no width of its own and joins or restyles its
/// neighbors is left out, and of many marks on one character the first four stay. The widths are
/// those of the locale's characters.
std::vector<TextCell> cellsOf(std::string_view text, int columns);

/// The columns that a text takes, counted no further than to `most` + 1.
int widthOf(std::string_view text, int most);

/// The text in so many columns at most; an ellipsis stands for what is cut off.
std::string cutToWidth(std::string_view text, int columns);
/// The same with the end kept, of a text that holds no control characters.
std::string cutFrontToWidth(std::string_view text, int columns);

/// The text in lines of so many columns at most, broken at blanks where there are any, and at its
/// own line breaks. An empty text is one empty line.
std::vector<std::string> wrapToWidth(std::string_view text, int columns);

} // namespace ventrik
