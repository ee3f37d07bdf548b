#include "Packets/Plausibility.h"

#include "Packets/ChannelNumbers.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>

namespace ventrik
{

namespace
{

/// A number of that quantity that is not possible is in doubt.
struct Limits {
    Quantity quantity;
    bool (*isPossible)(double number);
    std::string_view doubt;
};

template <int first, int last>
bool isWithin(double number)
{
    return first <= number && number <= last;
}

constexpr std::array<Limits, 5> limits{{
    {Quantity::RSRP, isWithin<-144, -44>, "RSRP is outside -144 to -44 dBm"},
    {Quantity::RSRQ, isWithin<-30, 3>, "RSRQ is outside -30 to 3 dB"},
    {Quantity::PhysicalCellIdentity, isWithin<0, 503>, "Physical cell identity is above 503"},
    {Quantity::DownlinkEARFCN, isDownlinkEARFCN, "Downlink EARFCN is in no band"},
    {Quantity::UplinkEARFCN, isUplinkEARFCN, "Uplink EARFCN is in no band"},
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
    return known == limits.end() || known->isPossible(number) ? std::string_view() : known->doubt;
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
