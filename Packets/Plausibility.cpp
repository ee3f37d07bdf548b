#include "Packets/Plausibility.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>
#include <span>

namespace ventrik
{

namespace
{

struct Range {
    double first;
    double last;
};

/// A number in none of the ranges cannot be.
struct Limits {
    Quantity quantity;
    std::span<const Range> ranges;
    std::string_view doubt;
};

constexpr std::array<Range, 1> rsrpRange{{{-144, -44}}};
constexpr std::array<Range, 1> rsrqRange{{{-30, 3}}};
constexpr std::array<Range, 1> identityRange{{{0, 503}}};

// Bands whose numbers follow on each other stand in one range (3GPP TS 36.101, table 5.7.3-1).
constexpr std::array<Range, 6> downlinkRanges{{
    {0, 4949},
    {5010, 5379},
    {5730, 7399},
    {7500, 10359},
    {36000, 60304},
    {65536, 73335},
}};
constexpr std::array<Range, 6> uplinkRanges{{
    {18000, 22949},
    {23010, 23379},
    {23730, 25399},
    {25500, 27809},
    {36000, 60304},
    {131072, 134341},
}};

constexpr std::array<Limits, 5> limits{{
    {Quantity::RSRP, rsrpRange, "RSRP is outside -144 to -44 dBm"},
    {Quantity::RSRQ, rsrqRange, "RSRQ is outside -30 to 3 dB"},
    {Quantity::PhysicalCellIdentity, identityRange, "Physical cell identity is above 503"},
    {Quantity::DownlinkEARFCN, downlinkRanges, "Downlink EARFCN is in no band"},
    {Quantity::UplinkEARFCN, uplinkRanges, "Uplink EARFCN is in no band"},
}};

constexpr double startOf1980 = 315532800; // seconds since 1970

std::optional<double> numberIn(std::string_view text, std::string_view unit)
{
    double number = 0;
    const char* const end = text.data() + text.size();
    const auto [behind, error] = std::from_chars(text.data(), end, number);
    const std::string_view rest(behind, static_cast<std::size_t>(end - behind));
    const bool isWhole =
        unit.empty() ? rest.empty() : rest.starts_with(' ') && rest.substr(1) == unit;
    return error == std::errc() && isWhole ? std::optional(number) : std::nullopt;
}

} // namespace

std::string_view doubtOf(Quantity quantity, double number)
{
    const auto known = std::ranges::find(limits, quantity, &Limits::quantity);
    const auto holdsNumber = [number](const Range& range) {
        return range.first <= number && number <= range.last;
    };
    return known == limits.end() || std::ranges::any_of(known->ranges, holdsNumber)
               ? std::string_view()
               : known->doubt;
}

std::string_view doubtOf(const Field& field, std::int64_t raw)
{
    const auto number = field.shown.number(raw);
    return number ? doubtOf(field.shown.quantity, *number) : std::string_view();
}

std::string_view doubtOfText(const Field& field, std::string_view text)
{
    const auto number = numberIn(text, field.shown.unit);
    return number ? doubtOf(field.shown.quantity, *number) : std::string_view();
}

std::string_view doubtOfShown(const Field& field, std::int64_t raw, std::string_view text)
{
    return field.shown.textOf(raw) == text ? doubtOf(field, raw) : doubtOfText(field, text);
}

std::string_view doubtOf(PlistDate date)
{
    return date.secondsSince1970 < startOf1980 ? "Date is before 1980" : std::string_view();
}

} // namespace ventrik
