#pragma once

#include "Packets/GSMRecords.h"

namespace ventrik
{

// The newer layouts of GSM/UMTS records. Their groups and lists stand in the order of the base
// layout's, so that whoever shows a group of one shows the same group of the other.

namespace GSMLayouts
{

// Ranked reselection candidates. The GSM cells lie behind the UMTS cells. A cell of the lowest rank
// that 16 bits hold has none.
inline constexpr std::int64_t noRank = -32768;
inline constexpr std::array<Field, 6> rankedUMTSCellFields{{
    {"Scrambling Code", u16(2)},
    {"RSCP", i8(4), wholeDb(1, -21)},
    {"Energy Per Chip", i8(7), {.digits = Digits::SixDecimals, .factor = 0.5, .unit = "dB"}},
    {"Downlink Frequency", u16(0)},
    {"Ranking Value", i16(8), {.none = noRank}},
    {"Rank Cell RSCP", i16(5), {.unit = "dB", .none = noRank}},
}};
inline constexpr std::array<Field, 4> rankedGSMCellFields{{
    {"ARFCN", bits(0, 0, 12)},
    {"BSIC", u16(2)},
    {"RSSI", i8(4), wholeDbm()},
    {"Ranking Value", i16(5), {.none = noRank}},
}};
inline constexpr std::array<Field, 1> rankedGSMCellUnshown{{{"band", bits(1, 4, 4)}}};
inline constexpr std::array<Field, 1> rankedCellsUnshown{{{"version", bits(13, 6, 2)}}};
inline constexpr Place rankedUMTSCellCount = bits(13, 0, 6);
inline constexpr Place rankedGSMCellCount = bits(14, 0, 6);
constexpr List rankedUMTSCells(std::size_t offset, std::size_t stride)
{
    return {
        .offset = offset,
        .stride = stride,
        .needed = stride,
        .count = {rankedUMTSCellCount},
        .fields = rankedUMTSCellFields,
    };
}
constexpr List rankedGSMCells(std::size_t offset, std::size_t umtsStride, std::size_t stride)
{
    return {
        .offset = offset,
        .stride = stride,
        .needed = stride,
        .count = {rankedGSMCellCount},
        .fields = rankedGSMCellFields,
        .unshown = rankedGSMCellUnshown,
        .before = {rankedUMTSCellCount, umtsStride},
    };
}
inline constexpr List rankedUMTSCells0 = rankedUMTSCells(15, 10);
inline constexpr List rankedUMTSCells1 = rankedUMTSCells(15, 11);
inline constexpr List rankedUMTSCells2 = rankedUMTSCells(20, 16);
inline constexpr List rankedGSMCells0 = rankedGSMCells(15, 10, 7);
inline constexpr List rankedGSMCells1 = rankedGSMCells(15, 11, 8);
inline constexpr List rankedGSMCells2 = rankedGSMCells(20, 16, 13);
inline constexpr Record rankedCells0{0x4005,
                                     "UMTS ranked cells",
                                     15,
                                     {rankedCellsUnshown},
                                     {&rankedUMTSCells0, &rankedGSMCells0},
                                     bits(13, 6, 2)};
inline constexpr Record rankedCells1{0x4005,
                                     "UMTS ranked cells",
                                     15,
                                     {rankedCellsUnshown},
                                     {&rankedUMTSCells1, &rankedGSMCells1},
                                     bits(13, 6, 2)};
inline constexpr Record rankedCells2{0x4005,
                                     "UMTS ranked cells",
                                     20,
                                     {rankedCellsUnshown},
                                     {&rankedUMTSCells2, &rankedGSMCells2},
                                     bits(13, 6, 2)};

// UMTS serving cell
inline constexpr std::array<Field, 5> umtsCellFields45{{
    {"Cell ID", i32(21)},
    {"Downlink Frequency", i32(17)},
    {"Uplink Frequency", i32(13)},
    {"URA ID", u16(25)},
    {"Scrambling Code", bits(29, 4, 12)},
}};
inline constexpr Record umtsCell45{0x4127, "UMTS serving cell", 45, {umtsCellFields45}};

// GSM serving cell identity. The bytes at 15 and 16 are the two colour codes; which is which is not
// sure, so there is no BSIC.
inline constexpr std::array<Field, 2> cellIdentityFieldsWithBand{{
    {"Cell ID", u16(17)},
    {"ARFCN", bits(13, 0, 12)},
}};
inline constexpr std::array<Field, 1> cellIdentityUnshown{{{"band", bits(14, 4, 4)}}};
inline constexpr Record cellIdentityWithBand{
    0x5134, "GSM serving cell identity", 26, {cellIdentityFieldsWithBand, cellIdentityUnshown}};

// Equivalent PLMNs: the registered network, then five slots. A network's digits are nibbles as in
// the serving PLMN.
inline constexpr std::array<Field, 2> equivalentPLMNFields{{
    {"Mobile Country Code", bits(0, 0, 12), {.text = GSMRecords::countryCode}},
    {"Mobile Network Code", bits(1, 4, 12), {.text = GSMRecords::networkCode}},
}};
inline constexpr std::array<Field, 1> equivalentPLMNUnshown{{{"digits", bits(0, 0, 24)}}};
inline constexpr List equivalentPLMNList{
    .offset = 17,
    .stride = 3,
    .needed = 3,
    .count = {u8(16)},
    .fields = equivalentPLMNFields,
    .unshown = equivalentPLMNUnshown,
};
inline constexpr std::array<Field, 1> equivalentPLMNsUnshown{
    {{"registered network", bits(13, 0, 24)}}};
inline constexpr Record equivalentPLMNs{
    0x7150, "Equivalent PLMNs", 32, {equivalentPLMNsUnshown}, {&equivalentPLMNList}};

} // namespace GSMLayouts

} // namespace ventrik
