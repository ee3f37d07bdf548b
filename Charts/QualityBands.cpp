#include "Charts/QualityBands.h"

#include "PropertyList/NumberText.h"
#include "PropertyList/PropertyListError.h"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>
#include <span>

namespace ventrik
{

namespace
{

constexpr std::array<BandLimits, 5> usualLimits{{
    {"RSRP", {-84, -102, -111}},
    {"RSRQ", {-10, -15, -20}},
    {"RSCP", {-70, -85, -100}},
    {"RxLev", {-70, -85, -100}},
    {"Ec/Io", {-6, -10, -15}},
}};

/// A word in a value's name, and the unit with it, that tell the quantity.
struct Sign {
    std::string_view word;
    std::string_view unit;
    std::string_view quantity;
    std::string_view otherWord = {}; ///< that the name must have too
};

// Some displays give the level of a code's power in dB.
constexpr std::array<Sign, 10> signs{{
    {"RSRP", "dBm", "RSRP"},
    {"RSRQ", "dB", "RSRQ"},
    {"RSCP", "dBm", "RSCP"},
    {"RSCP", "dB", "RSCP"},
    {"RxLev", "dBm", "RxLev"},
    {"Rx Level", "dBm", "RxLev"},
    {"RSSI", "dBm", "RxLev", "GSM"},
    {"Ec/Io", "dB", "Ec/Io"},
    {"Ec/No", "dB", "Ec/Io"},
    {"Energy Per Chip", "dB", "Ec/Io"},
}};

constexpr char lower(char letter)
{
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

constexpr bool isWordCharacter(char character)
{
    const char letter = lower(character);
    return (letter >= 'a' && letter <= 'z') || (letter >= '0' && letter <= '9');
}

bool isSame(std::string_view one, std::string_view other)
{
    return std::ranges::equal(one, other, {}, lower, lower);
}

bool hasWord(std::string_view name, std::string_view word)
{
    const auto endsAt = [name](std::size_t place) {
        return place == name.size() || !isWordCharacter(name[place]);
    };
    for (std::size_t place = 0; place + word.size() <= name.size(); ++place)
        if (isSame(name.substr(place, word.size()), word) && endsAt(place + word.size()) &&
            (place == 0 || !isWordCharacter(name[place - 1])))
            return true;
    return false;
}

std::string_view quantityOf(std::string_view name, std::string_view unit)
{
    for (const Sign& sign : signs)
        if (sign.unit == unit && hasWord(name, sign.word) &&
            (sign.otherWord.empty() || hasWord(name, sign.otherWord)))
            return sign.quantity;
    return {};
}

std::string known()
{
    std::string names;
    for (const BandLimits& limits : usualLimits)
        names += fmt::format("{}{}", names.empty() ? "" : ", ", limits.name);
    return names;
}

std::string wrong(std::string_view text, std::string_view what)
{
    return fmt::format("\"{}\": {}", printable(text), what);
}

// The three numbers of "a,b,c"; none where there are not just three finite ones.
std::optional<std::array<double, 3>> threeNumbers(std::string_view text)
{
    std::array<double, 3> numbers{};
    for (std::size_t place = 0; place < numbers.size(); ++place) {
        const bool isLast = place + 1 == numbers.size();
        const std::size_t comma = isLast ? text.size() : text.find(',');
        const auto number = parseReal(text.substr(0, comma));
        if (comma == std::string_view::npos || !number || !std::isfinite(*number))
            return std::nullopt;
        numbers[place] = *number;
        text.remove_prefix(std::min(comma + 1, text.size()));
    }
    return numbers;
}

} // namespace

Quality BandLimits::qualityOf(double value) const
{
    const auto reached =
        std::ranges::find_if(from, [value](double limit) { return value >= limit; });
    return static_cast<Quality>(reached - from.begin());
}

QualityBands::QualityBands() : _limits(usualLimits) {}

std::optional<BandLimits> QualityBands::find(std::string_view name, std::string_view unit) const
{
    const auto found = std::ranges::find(_limits, quantityOf(name, unit), &BandLimits::name);
    return found == _limits.end() ? std::nullopt : std::optional(*found);
}

std::optional<std::string> QualityBands::change(std::string_view text)
{
    const std::size_t equals = text.find('=');
    if (equals == std::string_view::npos)
        return wrong(text, "limits look like RSRP=-80,-100,-110");
    const std::string_view asked = text.substr(0, equals);
    const std::string_view name = isSame(asked, "Ec/No") ? "Ec/Io" : asked;
    const auto isAsked = [name](const BandLimits& limits) { return isSame(limits.name, name); };
    const auto found = std::ranges::find_if(_limits, isAsked);
    if (found == _limits.end())
        return wrong(text, "there are limits for " + known());
    const auto numbers = threeNumbers(text.substr(equals + 1));
    if (!numbers)
        return wrong(text, "three numbers are needed, as in RSRP=-80,-100,-110");
    if ((*numbers)[0] <= (*numbers)[1] || (*numbers)[1] <= (*numbers)[2])
        return wrong(text, "each limit must be below the one before");
    found->from = *numbers;
    return std::nullopt;
}

} // namespace ventrik
