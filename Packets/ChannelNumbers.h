#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace ventrik
{

// What the channel numbers of LTE, UMTS and GSM stand for.

/// Where a channel lies.
struct ChannelFrequency {
    std::string_view band;           ///< empty where it is not known
    std::optional<double> megahertz; ///< the carrier's; none where it is not known
};

/// Of an LTE downlink (E-ARFCN); nothing known where the number is of no band.
ChannelFrequency downlinkOfEARFCN(std::int64_t number);
/// Likewise of an uplink. Bands of one frequency have one number for both.
ChannelFrequency uplinkOfEARFCN(std::int64_t number);
/// Whether a number is of some band. What is no number is of none.
bool isDownlinkEARFCN(double number);
bool isUplinkEARFCN(double number);

/// Of a UMTS downlink whose directions have two frequencies. Outside of the bands a number is taken
/// as a fifth of a megahertz.
ChannelFrequency downlinkOfUARFCN(std::int64_t number);
/// The same of those that take turns on one frequency.
ChannelFrequency timeDividedUARFCN(std::int64_t number);

/// Which of the two bands is meant that have the same numbers.
enum class GSMBandHint : std::uint8_t { None, DCS1800, PCS1900 };
/// Of a GSM downlink. Where a number is of two bands and there is no hint, the band names both and
/// there is no frequency.
ChannelFrequency downlinkOfARFCN(std::int64_t number, GSMBandHint hint = GSMBandHint::None);

} // namespace ventrik
