#include "Model/PinnedSeries.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <utility>

namespace ventrik
{

namespace
{

constexpr std::string_view anyElement = "/*/";

struct DefaultPin {
    std::string_view technology;
    std::string_view path;
    std::string_view name;
    bool leavesOutSign = false;
    std::string_view unit = {};
};

// A code's power is told in dB by some records, as the display shows it: one lane has them all.
constexpr std::array defaults = {
    DefaultPin{"lte", "/Serving Cell Measurements/Measured RSRP", "RSRP"},
    DefaultPin{"lte", "/Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRP",
               "Connected RSRP"},
    DefaultPin{"lte", "/Neighbors/Neighbor Cells List/*/Measured RSRP", "Best neighbor RSRP"},
    DefaultPin{"lte", "/Neighbors/Measured Neighbor Cells/*/Filtered RSRP",
               "Best connected neighbor RSRP"},
    DefaultPin{"lte", "/Serving Cell Measurements/Measured RSRQ", "RSRQ"},
    DefaultPin{"lte", "/Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRQ",
               "Connected RSRQ"},
    DefaultPin{"lte", "/Serving Cell Measurements/Measured RSSI", "RSSI"},
    DefaultPin{"gsm", "/Serving Cell/GSM Serving Cell/RSSI", "GSM RSSI", true, "dBm"},
    DefaultPin{"gsm", "/Neighbors/Neighboring Cells/*/RSSI", "Best neighbor GSM RSSI", true, "dBm"},
    DefaultPin{"gsm", "/Serving Cell/Active Set/*/RSCP", "Active set RSCP", false, "dBm"},
    DefaultPin{"gsm", "/Serving Cell/Active Set/*/Energy Per Chip", "Active set Ec/Io"},
    DefaultPin{"gsm", "/Neighbors/UMTS Set/*/RSCP", "Best RSCP", false, "dBm"},
    DefaultPin{"gsm", "/Neighbors/UMTS Set/*/Energy Per Chip", "Best Ec/Io"},
    DefaultPin{"utran", "/Neighbor Cell List/*/Filter RSCP", "Best RSCP"},
    DefaultPin{"utran", "/GSM Neighbor Cell List/*/RSSI", "Best GSM RSSI"},
    DefaultPin{"c2k", "/1x/Radio/Rx 0 AGC", "1x Rx AGC"},
    DefaultPin{"c2k", "/EV-DO/Radio/Rx 0 AGC", "EV-DO Rx AGC"},
    DefaultPin{"c2k", "/1x/Radio/Tx AGC", "1x Tx AGC"},
    DefaultPin{"ifx", "/Serving Cell/RxLev", "RxLev"},
    DefaultPin{"ifx", "/GSM Neighbor Cells/*/RxLev", "Best neighbor RxLev"},
    DefaultPin{"ifx", "/Serving Cell/RSCP", "RSCP"},
    DefaultPin{"ifx", "/UMTS Neighbor Cells/*/RSCP", "Best neighbor RSCP"},
};

bool isPathOf(std::string_view path, std::string_view valuePath)
{
    const auto any = path.find(anyElement);
    if (any == path.npos)
        return valuePath == path;
    const std::string_view before = path.substr(0, any + 1);
    const std::string_view behind = path.substr(any + anyElement.size() - 1);
    if (valuePath.size() <= before.size() + behind.size() || !valuePath.starts_with(before) ||
        !valuePath.ends_with(behind))
        return false;
    const std::string_view part =
        valuePath.substr(before.size(), valuePath.size() - before.size() - behind.size());
    return part.find('/') == part.npos;
}

Pin pinOf(const DefaultPin& pin)
{
    return {std::string(pin.path), std::string(pin.name), pin.leavesOutSign, std::string(pin.unit)};
}

} // namespace

Pin Pin::of(std::string path)
{
    for (const DefaultPin& pin : defaults)
        if (pin.path == path)
            return pinOf(pin);
    const std::string last = path.substr(path.rfind('/') + 1);
    const bool isOfList = path.find(anyElement) != path.npos;
    if (isLevelWithoutSign(path))
        return {std::move(path), "GSM " + last, true, "dBm"};
    return {std::move(path), isOfList ? "Best " + last : last};
}

bool Pin::matches(std::string_view valuePath) const
{
    return isPathOf(path, valuePath);
}

bool isLevelWithoutSign(std::string_view path)
{
    return std::ranges::any_of(defaults, [path](const DefaultPin& pin) {
        return pin.leavesOutSign && isPathOf(pin.path, path);
    });
}

double drawnLevel(double number)
{
    return -std::abs(number);
}

std::vector<Pin> defaultPins(std::string_view technology)
{
    std::vector<Pin> pins;
    for (const DefaultPin& pin : defaults)
        if (pin.technology == technology)
            pins.push_back(pinOf(pin));
    return pins;
}

void PinnedSeries::setPins(std::vector<Pin> pins)
{
    if (pins.size() > mostPins)
        pins.resize(mostPins);
    _series.clear();
    for (Pin& pin : pins)
        _series.push_back({std::move(pin), {}, {}});
    beginAnew();
    update();
}

void PinnedSeries::beginAnew()
{
    for (Series& series : _series)
        series.points.clear();
    _followers.assign(_series.size(), {});
    _places.clear();
    _next = _store.firstMoment();
    _generation = _store.generation();
    takeStanding();
}

void PinnedSeries::takeStanding()
{
    std::vector<StoredChange> standing = _store.standing();
    std::ranges::stable_sort(standing, {}, &StoredChange::time);
    for (const StoredChange& change : standing)
        changed(change);
}

void PinnedSeries::update()
{
    if (_generation != _store.generation() || _next < _store.firstMoment())
        beginAnew();
    _store.visit(_next, *this);
    _next = _store.present();
    for (std::size_t pin = 0; pin < _series.size(); ++pin)
        if (const auto last = _store.lastHeard(_followers[pin].logCode))
            heard(*last, _followers[pin].logCode);
    dropOld();
}

std::uint32_t PinnedSeries::pinsAt(PlaceId place)
{
    if (place >= _places.size())
        _places.resize(_store.places().size());
    PlacePins& known = _places[place];
    if (std::exchange(known.isKnown, true))
        return known.pins;
    const std::string path = _store.places().pathOf(place);
    for (std::size_t pin = 0; pin < _series.size(); ++pin)
        if (_series[pin].pin.matches(path))
            known.pins |= std::uint32_t{1} << pin;
    return known.pins;
}

void PinnedSeries::changed(const StoredChange& change)
{
    // With a group goes what it holds.
    if (change.kind == DisplayChange::Kind::Gone)
        for (const PlaceId below : _store.places()[change.place].below) {
            StoredChange gone = change;
            gone.place = below;
            changed(gone);
        }
    const std::uint32_t pins = pinsAt(change.place);
    for (std::size_t pin = 0; pins >> pin != 0; ++pin)
        if ((pins >> pin & 1U) != 0)
            take(pin, change);
}

void PinnedSeries::take(std::size_t pin, const StoredChange& change)
{
    Follower& follower = _followers[pin];
    Series& series = _series[pin];
    if (const auto number = change.value.number)
        follower.numbers[change.place] = series.pin.leavesOutSign ? drawnLevel(*number) : *number;
    else
        follower.numbers.erase(change.place);
    follower.logCode = change.logCode;
    if (follower.numbers.empty())
        return takeNumber(series.points, change.time, std::nullopt);
    if (!series.pin.unit.empty())
        series.unit = series.pin.unit;
    else if (!change.value.unit.empty())
        series.unit = change.value.unit;
    const double value = std::ranges::max_element(follower.numbers, {}, [](const auto& number) {
                             return number.second;
                         })->second;
    takeNumber(series.points, change.time, value);
}

void PinnedSeries::heard(Clock::TimePoint time, std::uint32_t logCode)
{
    for (std::size_t pin = 0; pin < _series.size(); ++pin)
        if (_followers[pin].logCode == logCode)
            hearAgain(_series[pin].points, time);
}

// What still stands may be told again.
void PinnedSeries::dropOld()
{
    const Clock::TimePoint first = _store.firstTime();
    for (Series& series : _series) {
        auto& points = series.points;
        auto kept = std::ranges::find_if(
            points, [&](const SeriesPoint& point) { return point.until >= first; });
        if (kept == points.end() && !points.empty() && !points.back().isEnd)
            --kept;
        points.erase(points.begin(), kept);
    }
}

} // namespace ventrik
