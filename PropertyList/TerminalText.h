#pragma once

#include <string>
#include <string_view>

namespace ventrik
{

/// Adds a text from outside so that a terminal obeys nothing in it: control characters of either
/// set and marks that turn the direction of writing become a blank each, and a byte that is not
/// UTF-8 becomes U+FFFD.
void appendTerminalText(std::string& text, std::string_view part);

/// The text as one line for a terminal, without its end: line breaks that end it are dropped,
/// others show as "\n".
std::string terminalLine(std::string_view text);

} // namespace ventrik
