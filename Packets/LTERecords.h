#pragma once

#include "Packets/ShownNumbers.h"

namespace ventrik
{

// The records of LTE basebands. Bit fields are those of little-endian words.

namespace LTERecords
{

// Cell info
inline constexpr std::array<Mark, 6> bandwidths{{
    {6, "1.4 MHz"},
    {15, "3 MHz"},
    {25, "5 MHz"},
    {50, "10 MHz"},
    {75, "15 MHz"},
    {100, "20 MHz"},
}}; // by resource blocks
inline constexpr Shown bandwidth = marked(labels({}, "Unknown"), bandwidths);
inline constexpr std::array<Field, 8> cellInfoFields{{
    {"Physical Cell ID", u16(14), physicalCellIdentity},
    {"Download Frequency", u16(16), downlinkEARFCN},
    {"Upload Frequency", u16(18), uplinkEARFCN},
    {"Download Bandwidth", u8(20), bandwidth},
    {"Upload Bandwidth", u8(21), bandwidth},
    {"Cell Identity", i32(22)},
    {"Tracking Area Code", u16(26)},
    {"Freq Band Indicator", i32(28)},
}};
inline constexpr std::array<Field, 1> cellInfoUnshown{{{"version", u8(13)}}};
inline constexpr Record cellInfo{
    0xB0C2, "LTE serving cell info", 38, {cellInfoFields, cellInfoUnshown}, {}, u8(13)};

// Antenna count
inline constexpr std::array<Field, 1> antennaCountFields{{{"Num Tx Antennas", u8(20)}}};
inline constexpr Record antennaCount{0xB0C1, "LTE master information", 22, {antennaCountFields}, {},
                                     u8(13)};

// Serving cell measurement
inline constexpr std::array<Mark, 1> noPower{{{64, "Not Present"}}};
inline constexpr std::array<Mark, 1> noThreshold{{{32, "Not Present"}}};
inline constexpr std::array<std::string_view, 1> falseLabel{"False"};
inline constexpr std::array<Field, 18> servingCellMeasurementFields{{
    {"Version", u8(13)},
    {"E-ARFCN", u16(17), downlinkEARFCN},
    {"Physical Cell ID", bits(19, 0, 9), physicalCellIdentity},
    {"Serving Layer Priority", bits(19, 9, 4)},
    {"Measured RSRP", bits(21, 0, 9), rsrp(0.25, -140)},
    {"Average RSRP", bits(22, 1, 9), rsrp(0.25, -140)},
    {"Measured RSRQ", bits(23, 2, 7), rsrq(0.25, -30)},
    {"Average RSRQ", bits(24, 1, 7), rsrq(0.25, -30)},
    {"Measured RSSI", bits(25, 0, 9), dbm(0.5, -140)},
    {"Qrxlevmin", bits(26, 1, 6), wholeDbm(2, -140)},
    {"P_Max", bits(26, 7, 7), marked(wholeDbm(1, -30), noPower)},
    // Six bits never reach the mark for "not present"; the comparison is the one of P-Max.
    {"Max UE Tx Power", bits(27, 6, 6), marked(wholeDbm(1, -30), noPower)},
    {"Srxlev", bits(29, 0, 7), wholeDbm(1, -30)},
    {"Num of Consecutive DRX Cycles of S < 0", bits(29, 7, 6)},
    {"S Intra Search", bits(30, 5, 6), marked(wholeDb(2), noThreshold)},
    {"S Non Intra Search", bits(31, 3, 6), marked(wholeDbm(2), noThreshold)},
    {"Measurement Rules Updated", bits(32, 1, 1), labels(falseLabel, "True")},
    {"Measurement Rules", bits(32, 2, 4)},
}};
inline constexpr Record servingCellMeasurement{
    0xB17F, "LTE serving cell measurement", 33, {servingCellMeasurementFields}, {}, u8(13)};

// Connected-mode intra-frequency measurement
inline constexpr std::array<Field, 5> connectedModeFields{{
    {"E-ARFCN", u16(17), downlinkEARFCN},
    {"Serving Physical Cell ID", u16(19), physicalCellIdentity},
    {"Subframe Number", u16(21)},
    {"Serving Filtered RSRP", u16(23), rsrp(0.25, -140)},
    {"Serving Filtered RSRQ", u16(25), rsrq(0.125, -20)},
}};
inline constexpr std::array<Field, 3> measuredNeighborFields{{
    {"Physical Cell ID", u16(0), physicalCellIdentity},
    {"Filtered RSRP", u16(2), rsrp(0.25, -140)},
    {"Filtered RSRQ", u16(4), rsrq(0.125, -20)},
}};
inline constexpr std::array<Field, 1> detectedCellFields{
    {{"Physical Cell ID", u16(0), physicalCellIdentity}}};
inline constexpr List measuredNeighbors{
    .offset = 29,
    .stride = 6,
    .needed = 6,
    .count = {u8(27)},
    .fields = measuredNeighborFields,
};
inline constexpr List detectedCells{
    .offset = 29,
    .stride = 2,
    .needed = 2,
    .count = {u8(28)},
    .fields = detectedCellFields,
    .before = {u8(27), 6},
};
inline constexpr Record connectedMode{0xB179,
                                      "LTE connected-mode measurement",
                                      29,
                                      {connectedModeFields},
                                      {&measuredNeighbors, &detectedCells},
                                      u8(13)};

// Idle-mode neighbour measurements
inline constexpr std::array<Field, 3> idleNeighborFields{{
    {"Version", u8(13)},
    {"E-ARFCN", u16(17), downlinkEARFCN},
    {"Qrxlevmin", bits(19, 0, 6), wholeDbm(2, -140)},
}};
// The levels have half-dB steps here, the serving cell's have quarters. The antenna 1 values repeat
// the antenna 0 bits: the record carries no others.
inline constexpr std::array<Field, 12> idleNeighborCellFields{{
    {"Physical Cell ID", bits(0, 0, 9), physicalCellIdentity},
    {"Measured RSSI", bits(1, 1, 8), dbm(0.5, -140)},
    {"Measured RSRP", bits(2, 1, 9), rsrp(0.5, -140)},
    {"Average RSRP", bits(4, 0, 9), rsrp(0.5, -140)},
    {"Measured RSRQ", bits(5, 1, 7), rsrq(0.25, -30)},
    {"Average RSRQ", bits(6, 0, 7), rsrq(0.25, -30)},
    {"Srxlev", bits(6, 7, 7), wholeDbm(1, -30)},
    {"Frequency Offset", u16(8)},
    {"Ant 0 Frame Offset", bits(12, 0, 11)},
    {"Ant 0 Sample Offset", bits(12, 11, 19)},
    {"Ant 1 Frame Offset", bits(12, 0, 11)},
    {"Ant 1 Sample Offset", bits(12, 11, 19)},
}};
inline constexpr List idleNeighborCells{
    .offset = 21,
    .stride = 20,
    .needed = 16,
    .count = {bits(19, 6, 5), 1},
    .fields = idleNeighborCellFields,
};
inline constexpr Record idleNeighbors{
    0xB180, "LTE idle-mode neighbour measurements", 21, {idleNeighborFields}, {&idleNeighborCells},
    u8(13)};

// Idle-mode reselection candidates. They lie 4 bytes apart: a candidate's technology part lies
// where the next one begins. Their count is taken as 8 bits.
inline constexpr std::array<Field, 3> reselectionFields{{
    {"Version", u8(13)},
    {"Serving EARFCN", u16(15), downlinkEARFCN},
    {"Serving Cell ID", u16(17), physicalCellIdentity},
}};
inline constexpr std::array<std::string_view, 5> candidateTechnologies{"LTE", "UTRAN", "GERAN",
                                                                       "CDMA1XRTT", "CDMAHRPD"};
inline constexpr std::array<Field, 2> candidateFields{{
    {"Candidate Priority", u16(0)},
    {"Candidate RAT Type", u16(2), labels(candidateTechnologies, "??")},
}};
inline constexpr std::array<Field, 2> lteCandidateFields{{
    {"E ARFCN", u16(4), downlinkEARFCN},
    {"Cell ID", bits(6, 7, 9), physicalCellIdentity},
}};
inline constexpr std::array<Field, 2> utranCandidateFields{{
    {"U ARFCN", u16(4)},
    {"PSC", u16(6)},
}};
inline constexpr std::array<Field, 3> geranCandidateFields{{
    {"ARFCN", u16(4)},
    {"Band", u8(6)},
    {"BSIC ID", u8(7)},
}};
inline constexpr std::array<Field, 3> cdmaCandidateFields{{
    {"Band", u8(4)},
    {"Channel", u16(8)},
    {"Pilot", u16(10)},
}};

/// The part of a candidate that depends on its technology, up to the last byte that is read.
struct CandidatePart {
    std::size_t needed;
    std::span<const Field> fields;
};
// By the candidate's technology, then for every other one.
inline constexpr std::array<CandidatePart, 6> candidateParts{{
    {8, lteCandidateFields},
    {8, utranCandidateFields},
    {8, geranCandidateFields},
    {12, cdmaCandidateFields},
    {12, cdmaCandidateFields},
    {4, {}},
}};
inline constexpr List candidates{
    .offset = 21,
    .stride = 4,
    .needed = 4,
    .count = {u8(19)},
    .fields = candidateFields,
};
inline constexpr Record reselection{
    0xB186, "LTE idle-mode reselection candidates", 21, {reselectionFields}, {&candidates}, u8(13)};

} // namespace LTERecords

} // namespace ventrik
