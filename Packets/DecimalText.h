#pragma once

#include <string>

namespace ventrik
{

/// Appends a number with two decimals, rounded as the C library rounds: "-63.75", with a sign in
/// front of positive ones as well where that is asked for. It takes a twentieth of the time of a
/// general conversion, and levels are what changes most.
void appendTwoDecimals(std::string& text, double number, bool hasSignAlways = false);

} // namespace ventrik
