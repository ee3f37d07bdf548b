#pragma once

#include "Packets/ShownNumbers.h"

namespace ventrik
{

// The records of the second UTRAN family's basebands. Bit fields are those of little-endian words.

namespace UTRANRecords
{

// RRC state. Only a state whose validity is 1 counts.
inline constexpr std::array<std::string_view, 6> rrcStates{
    "Disconnected", "Connecting", "Cell Fach", "Cell DCH", "Cell PCH", "Cell URA PCH"};
inline constexpr std::array<Field, 1> rrcStateFields{
    {{"State", u8(14), labels(rrcStates, "Unknown RRC Mode")}}};
inline constexpr std::array<Field, 1> rrcStateUnshown{{{"validity", u8(13)}}};
inline constexpr Record rrcState{0xD0E0, "UTRAN RRC state", 15, {rrcStateFields, rrcStateUnshown}};

// Cell info
inline constexpr std::array<std::string_view, 2> allowedAccess{"All Calls", "Emergency Calls Only"};
inline constexpr std::array<Field, 6> cellInfoFields{{
    {"Cell Access Restrictions", u8(14)},
    {"Cell ID", i32(21)},
    {"Downlink UARFCN", u16(19)},
    {"Uplink UARFCN", u16(17)},
    {"URA ID", u8(15)},
    {"Allowed Access", bits(25, 0, 1), labels(allowedAccess, {})},
}};
inline constexpr Record cellInfo{0xD0E2, "UTRAN serving cell info", 26, {cellInfoFields}};

// Neighbour measurements
inline constexpr std::array<std::string_view, 3> neighborStatuses{"ASET", "MSET", "DSET"};
inline constexpr std::array<std::string_view, 2> truths{"FALSE", "TRUE"};
inline constexpr std::array<Field, 5> neighborFields{{
    {"UARFCN", bits(0, 0, 14)},
    {"Cell ID", bits(1, 6, 7)},
    {"Filter RSCP", bits(2, 5, 8), {.digits = Digits::SixDecimals, .factor = 1 / 256.0}},
    {"Status", bits(3, 5, 2), labels(neighborStatuses, {})},
    {"inJDCS", bits(3, 7, 1), labels(truths, {})},
}};
inline constexpr List neighbors{
    .offset = 168,
    .stride = 16,
    .needed = 4,
    .count = {bits(16, 1, 7)},
    .fields = neighborFields,
};
inline constexpr Record neighborMeasurements{
    0xD00A, "UTRAN neighbour measurements", 21, {}, {&neighbors}};

// GSM neighbour measurements
inline constexpr std::array<Field, 7> gsmNeighborFields{{
    {"Cell ID", bits(0, 0, 14)},
    {"Band Indicator", bits(1, 6, 1)},
    {"BSIC Valid", bits(1, 7, 1)},
    {"NCC", u8(2)},
    {"BCC", u8(3)},
    {"ARFCN", u16(4)},
    {"RSSI", i16(6)},
}};
inline constexpr List gsmNeighbors{
    .offset = 17,
    .stride = 8,
    .needed = 8,
    .count = {u8(16)},
    .fields = gsmNeighborFields,
};
inline constexpr Record gsmNeighborMeasurements{
    0xD00E, "UTRAN GSM neighbour measurements", 17, {}, {&gsmNeighbors}};

// Transport channel measurement
inline constexpr Place transportChannelCount = bits(14, 6, 6);
inline constexpr std::array<Field, 2> transportChannelFields{{
    {"TRCH ID", u8(0)},
    {"TRCH BLER Measurement", u8(1)},
}};
inline constexpr List transportChannels{
    .offset = 17,
    .stride = 2,
    .needed = 2,
    .count = {transportChannelCount},
    .fields = transportChannelFields,
};
// The signal-to-interference ratios of a composite channel's slots are one byte each.
inline constexpr Field slotRatio{"", u8(0)};
inline constexpr std::size_t slotCount = 6;
inline constexpr std::array<Field, 3> compositeChannelFields{{
    {"CCTRCH ID", u8(0)},
    {"TSNUM", u8(1)},
    {"SIR", bits(2, 0, 8 * slotCount)},
}};
inline constexpr List compositeChannels{
    .offset = 289,
    .stride = 8,
    .needed = 8,
    .count = {bits(15, 4, 4)},
    .fields = compositeChannelFields,
    .before = {transportChannelCount, 34},
};
inline constexpr Record transportChannelMeasurement{0xD00C,
                                                    "UTRAN transport channel measurement",
                                                    17,
                                                    {},
                                                    {&transportChannels, &compositeChannels}};

} // namespace UTRANRecords

} // namespace ventrik
