#pragma once

#include "Packets/Record.h"

namespace ventrik
{

// How tables say what shows for a raw number. Levels are steps of `factor` above `offset`.

inline constexpr Shown decimal{};

constexpr Shown wholeDb(double factor = 1, double offset = 0)
{
    return {.factor = factor, .offset = offset, .unit = "dB"};
}
constexpr Shown wholeDbm(double factor = 1, double offset = 0)
{
    return {.factor = factor, .offset = offset, .unit = "dBm"};
}
constexpr Shown db(double factor, double offset)
{
    return {.digits = Digits::TwoDecimals, .factor = factor, .offset = offset, .unit = "dB"};
}
constexpr Shown dbm(double factor = 1, double offset = 0)
{
    return {.digits = Digits::TwoDecimals, .factor = factor, .offset = offset, .unit = "dBm"};
}
constexpr Shown signedWholeDbm()
{
    return {.digits = Digits::SignedWhole, .unit = "dBm"};
}
constexpr Shown signedDbm(double factor, double offset)
{
    return {.digits = Digits::SignedTwoDecimals, .factor = factor, .offset = offset, .unit = "dBm"};
}

/// The same number, with what it measures.
constexpr Shown of(Quantity quantity, Shown shown = decimal)
{
    shown.quantity = quantity;
    return shown;
}

// What LTE cells are told by.
constexpr Shown rsrp(double factor, double offset)
{
    return of(Quantity::RSRP, dbm(factor, offset));
}
constexpr Shown rsrq(double factor, double offset)
{
    return of(Quantity::RSRQ, db(factor, offset));
}
inline constexpr Shown physicalCellIdentity = of(Quantity::PhysicalCellIdentity);
inline constexpr Shown downlinkEARFCN = of(Quantity::DownlinkEARFCN);
inline constexpr Shown uplinkEARFCN = of(Quantity::UplinkEARFCN);

/// The label of the raw number; the other text for one that has none.
constexpr Shown labels(std::span<const std::string_view> labels, std::string_view otherwise)
{
    return {.labels = labels, .otherwise = otherwise};
}

/// The same number, but where the mark's is meant: then its text.
constexpr Shown marked(Shown shown, std::span<const Mark> marks)
{
    shown.marks = marks;
    return shown;
}

} // namespace ventrik
