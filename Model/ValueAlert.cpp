#include "Model/ValueAlert.h"

#include "Model/PinnedSeries.h"
#include "Model/StoredNumber.h"

#include <charconv>
#include <cmath>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

std::string_view trimmed(std::string_view text)
{
    const auto first = std::min(text.find_first_not_of(' '), text.size());
    text.remove_prefix(first);
    return text.substr(0, text.find_last_not_of(' ') + 1);
}

std::optional<double> finiteNumber(std::string_view text)
{
    double number = 0;
    const char* const end = text.data() + text.size();
    const auto [behind, error] = std::from_chars(text.data(), end, number);
    const bool isNumber = error == std::errc() && behind == end && std::isfinite(number);
    return isNumber ? std::optional(number) : std::nullopt;
}

ValueAlert::Comparison comparisonOf(char sign, bool isWithEqual)
{
    if (sign == '<')
        return isWithEqual ? ValueAlert::Comparison::AtMost : ValueAlert::Comparison::Below;
    return isWithEqual ? ValueAlert::Comparison::AtLeast : ValueAlert::Comparison::Above;
}

AlertReading failed(std::string_view text, std::string_view what)
{
    return {{}, fmt::format("Alert \"{}\": {}", text, what)};
}

} // namespace

bool ValueAlert::isBeyond(double number) const
{
    switch (comparison) {
    case Comparison::Below:
        return number < threshold;
    case Comparison::AtMost:
        return number <= threshold;
    case Comparison::Above:
        return number > threshold;
    case Comparison::AtLeast:
        return number >= threshold;
    }
    return false;
}

AlertReading parseAlert(std::string_view text)
{
    const std::size_t sign = text.find_last_of("<>");
    if (sign == text.npos)
        return failed(text, "there is no <, <=, > or >= in it");
    const std::string_view path = trimmed(text.substr(0, sign));
    if (!path.starts_with('/'))
        return failed(text, "it does not begin with a path, such as /Cell/Level");
    std::string_view rest = text.substr(sign + 1);
    const bool isWithEqual = rest.starts_with('=');
    rest = trimmed(rest.substr(isWithEqual ? 1 : 0));
    const auto threshold = finiteNumber(rest);
    if (!threshold)
        return failed(text, fmt::format("\"{}\" is no number", rest));
    return {ValueAlert{PathSelection({std::string(path)}), comparisonOf(text[sign], isWithEqual),
                       *threshold,
                       fmt::format("{}{} {}", text[sign], isWithEqual ? "=" : "", rest)},
            {}};
}

bool AlertWatch::take(PlaceId place, const PlaceTable& places, const StoredValue& shown)
{
    State& state = stateOf(place, places);
    const auto number = state == State::NotWatched ? std::nullopt : storedNumber(shown);
    if (!number)
        return false;
    const double level = _areWithoutSign[place] ? drawnLevel(number->number) : number->number;
    const State now = _alert.isBeyond(level) ? State::Beyond : State::Within;
    return std::exchange(state, now) == State::Within && now == State::Beyond;
}

AlertWatch::State& AlertWatch::stateOf(PlaceId place, const PlaceTable& places)
{
    if (place < _states.size())
        return _states[place];
    for (auto id = static_cast<PlaceId>(_states.size()); id < places.size(); ++id) {
        const std::string path = places.pathOf(id);
        const bool isWatched = _alert.paths.selects(path);
        _states.push_back(isWatched ? State::Unknown : State::NotWatched);
        _areWithoutSign.push_back(isWatched && isLevelWithoutSign(path));
    }
    return _states[place];
}

void AlertWatch::forgetPlaces()
{
    _states.clear();
    _areWithoutSign.clear();
}

} // namespace ventrik
