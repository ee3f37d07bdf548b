#include "Capture/RowText.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <iterator>

#include <fmt/compile.h>

namespace ventrik
{

namespace
{

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

} // namespace

bool isPlainAscii(std::string_view text)
{
    return std::ranges::all_of(text,
                               [](char character) { return character >= ' ' && character <= '~'; });
}

void appendDigits(std::string& row, double number)
{
    constexpr double largestWhole = 1e15;
    const bool isWhole = std::abs(number) < largestWhole && std::trunc(number) == number;
    if (isWhole)
        appendDigits(row, static_cast<std::int64_t>(number));
    else if (!appendFewDecimals(row, number))
        fmt::format_to(std::back_inserter(row), FMT_COMPILE("{}"), number);
}

} // namespace ventrik
