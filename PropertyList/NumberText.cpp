#include "PropertyList/NumberText.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::uint64_t leastMagnitude = std::uint64_t{1} << 63;

// Takes the sign off the text; true for minus.
bool takeSign(std::string_view& text)
{
    if (text.empty() || (text.front() != '-' && text.front() != '+'))
        return false;
    const bool isNegative = text.front() == '-';
    text.remove_prefix(1);
    return isNegative;
}

std::string lowerCase(std::string_view text)
{
    std::string lower(text);
    for (char& character : lower)
        if (character >= 'A' && character <= 'Z')
            character = static_cast<char>(character - 'A' + 'a');
    return lower;
}

std::optional<double> namedReal(std::string_view text)
{
    constexpr std::size_t longestName = 8;
    const std::string name = lowerCase(text.substr(0, longestName + 1));
    if (name == "nan")
        return std::numeric_limits<double>::quiet_NaN();
    if (name == "inf" || name == "infinity")
        return std::numeric_limits<double>::infinity();
    return std::nullopt;
}

template <typename Number, typename... Form>
std::optional<Number> wholeNumberOf(std::string_view text, Form... form)
{
    Number number{};
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number, form...);
    return error == std::errc{} && stop == end ? std::optional(number) : std::nullopt;
}

std::optional<double> unsignedReal(std::string_view text)
{
    // A second sign, or the library's own names for what is no number, end here.
    if (text.empty() || text.find_first_not_of("0123456789.eE+-") != std::string_view::npos ||
        text.front() == '-')
        return std::nullopt;
    return wholeNumberOf<double>(text, std::chars_format::general);
}

} // namespace

std::optional<PlistInteger> parseInteger(std::string_view text)
{
    const bool isNegative = takeSign(text);
    const bool isHexadecimal = text.starts_with("0x") || text.starts_with("0X");
    if (isHexadecimal)
        text.remove_prefix(2);
    const auto magnitude = wholeNumberOf<std::uint64_t>(text, isHexadecimal ? 16 : 10);
    if (!magnitude || (isNegative && *magnitude > leastMagnitude))
        return std::nullopt;
    return isNegative ? PlistInteger(static_cast<std::int64_t>(std::uint64_t{0} - *magnitude))
                      : PlistInteger(*magnitude);
}

std::optional<double> parseReal(std::string_view text)
{
    const bool isNegative = takeSign(text);
    std::optional<double> number = namedReal(text);
    if (!number)
        number = unsignedReal(text);
    return number && isNegative ? std::optional(-*number) : number;
}

std::string formatReal(double value)
{
    return std::isnan(value) ? "nan" : fmt::format("{}", value);
}

} // namespace ventrik
