#include "Packets/DecimalText.h"

#include <cmath>
#include <cstdint>
#include <iterator>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

void appendTwoDecimals(std::string& text, double number, bool hasSignAlways)
{
    constexpr double largest = 1e6;
    const double hundredths = std::abs(number) * 100;
    const double whole = std::floor(hundredths);
    const double rest = hundredths - whole;
    // Where a half is near, only all digits of the number tell how it is rounded.
    if (!(hundredths < largest) || std::abs(rest - 0.5) < 1e-6) {
        const auto out = std::back_inserter(text);
        if (hasSignAlways)
            fmt::format_to(out, FMT_COMPILE("{:+.2f}"), number);
        else
            fmt::format_to(out, FMT_COMPILE("{:>4.2f}"), number);
        return;
    }
    const auto rounded = static_cast<std::uint32_t>(whole) + (rest > 0.5 ? 1U : 0U);
    if (std::signbit(number))
        text += '-';
    else if (hasSignAlways)
        text += '+';
    const fmt::format_int integer(rounded / 100);
    text.append(integer.data(), integer.size());
    const std::uint32_t decimals = rounded % 100;
    text += '.';
    text += static_cast<char>('0' + decimals / 10);
    text += static_cast<char>('0' + decimals % 10);
}

} // namespace ventrik
