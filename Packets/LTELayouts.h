#pragma once

#include "Packets/LTERecords.h"

namespace ventrik
{

// The newer layouts of LTE records. Their groups and lists stand in the order of the base layout's,
// so that whoever shows a group of one shows the same group of the other.

namespace LTELayouts
{

// Levels have sixteenths of a dB.
inline constexpr Shown rsrpLevel = rsrp(0.0625, -180);
inline constexpr Shown rsrqLevel = rsrq(0.0625, -30);
inline constexpr Shown rssiLevel = dbm(0.0625, -110);
inline constexpr Shown snrLevel = db(0.1, -20);

// Cell info
inline constexpr std::array<Field, 8> cellInfoFields3{{
    {"Physical Cell ID", u16(14), physicalCellIdentity},
    {"Download Frequency", u32(16), downlinkEARFCN},
    {"Upload Frequency", u32(20), uplinkEARFCN},
    {"Download Bandwidth", u8(24), LTERecords::bandwidth},
    {"Upload Bandwidth", u8(25), LTERecords::bandwidth},
    {"Cell Identity", i32(26)},
    {"Tracking Area Code", u16(30)},
    {"Freq Band Indicator", i32(32)},
}};
// The digits of the network's codes are a number; those of the second have as many as the third
// says.
inline constexpr std::array<Field, 4> cellInfoUnshown3{{
    {"version", u8(13)},
    {"mobile country code", u16(36)},
    {"digits of the mobile network code", u8(38)},
    {"mobile network code", u16(39)},
}};
inline constexpr Record cellInfo3{
    0xB0C2, "LTE serving cell info", 42, {cellInfoFields3, cellInfoUnshown3}, {}, u8(13)};

// Antenna count. The record also tells of cells that are only scanned.
inline constexpr std::array<Field, 1> antennaCountFields2{{{"Num Tx Antennas", u8(22)}}};
inline constexpr std::array<Field, 5> antennaCountUnshown2{{
    {"version", u8(13)},
    {"physical cell identity", u16(14)},
    {"frequency", u32(16), downlinkEARFCN},
    {"system frame number", u16(20)},
    {"bandwidth", u8(23), LTERecords::bandwidth},
}};
inline constexpr Record antennaCount2{
    0xB0C1, "LTE master information", 24, {antennaCountFields2, antennaCountUnshown2}, {}, u8(13)};
inline constexpr Record antennaCount3{
    0xB0C1, "LTE master information", 25, {antennaCountFields2, antennaCountUnshown2}, {}, u8(13)};
// Of narrow-band cells, which have no bandwidth to tell.
inline constexpr std::array<Field, 1> antennaCountFields17{{{"Num Tx Antennas", u8(30)}}};
inline constexpr Record antennaCount17{
    0xB0C1, "LTE master information",
    31,     {antennaCountFields17, std::span(antennaCountUnshown2).first(4)},
    {},     u8(13)};

// Serving cell measurement. Thresholds end at 31 on the air; what is above stands for none.
inline constexpr std::array<Mark, 32> noThresholds = [] {
    std::array<Mark, 32> marks{};
    std::int64_t raw = 32;
    for (Mark& mark : marks)
        mark = {raw++, "Not Present"};
    return marks;
}();
/// The first eight fields come from the word of the cell and from the levels behind it, the others
/// from the words of the criteria behind the levels.
constexpr std::array<Field, 16> servingCellMeasurementFields(Place earfcn, std::uint16_t cell,
                                                             std::uint16_t levels)
{
    const auto at = [&](unsigned offset) { return static_cast<std::uint16_t>(levels + offset); };
    return {{
        {"Version", u8(13)},
        {"E-ARFCN", earfcn, downlinkEARFCN},
        {"Physical Cell ID", bits(cell, 0, 9), physicalCellIdentity},
        {"Measured RSRP", bits(at(0), 0, 12), rsrpLevel},
        {"Average RSRP", bits(at(4), 0, 12), rsrpLevel},
        {"Measured RSRQ", bits(at(8), 0, 10), rsrqLevel},
        {"Average RSRQ", bits(at(10), 4, 10), rsrqLevel},
        {"Measured RSSI", bits(at(12), 10, 11), rssiLevel},
        {"Serving Layer Priority", bits(cell, 9, 4)},
        {"Qrxlevmin", bits(at(16), 0, 6), wholeDbm(2, -140)},
        {"P_Max", bits(at(16), 6, 7), marked(wholeDbm(1, -30), LTERecords::noPower)},
        {"Max UE Tx Power", bits(at(16), 13, 6), wholeDbm(1, -30)},
        {"Srxlev", bits(at(18), 3, 7), wholeDbm(1, -50)},
        {"Num of Consecutive DRX Cycles of S < 0", bits(at(18), 10, 6)},
        {"S Intra Search", bits(at(20), 0, 6), marked(wholeDb(2), noThresholds)},
        {"S Non Intra Search", bits(at(20), 6, 6), marked(wholeDbm(2), noThresholds)},
    }};
}
constexpr std::array<Field, 3> servingCellMeasurementUnshown(std::uint16_t levels)
{
    return {{
        {"release", u8(14)},
        {"repeated RSRP", bits(static_cast<std::uint16_t>(levels + 1), 4, 12)},
        {"repeated RSRQ", bits(static_cast<std::uint16_t>(levels + 9), 2, 10)},
    }};
}
// Version 3 may have its criteria elsewhere.
inline constexpr auto servingCellMeasurementFields4 = servingCellMeasurementFields(u16(17), 19, 21);
inline constexpr auto servingCellMeasurementFields5 = servingCellMeasurementFields(u32(17), 21, 25);
inline constexpr auto servingCellMeasurementUnshown4 = servingCellMeasurementUnshown(21);
inline constexpr auto servingCellMeasurementUnshown5 = servingCellMeasurementUnshown(25);
inline constexpr Record servingCellMeasurement3{
    0xB17F, "LTE serving cell measurement",
    45,     {std::span(servingCellMeasurementFields4).first(8), servingCellMeasurementUnshown4},
    {},     u8(13)};
inline constexpr Record servingCellMeasurement4{
    0xB17F, "LTE serving cell measurement",
    45,     {servingCellMeasurementFields4, servingCellMeasurementUnshown4},
    {},     u8(13)};
inline constexpr Record servingCellMeasurement5{
    0xB17F, "LTE serving cell measurement",
    49,     {servingCellMeasurementFields5, servingCellMeasurementUnshown5},
    {},     u8(13)};

// Connected-mode intra-frequency measurement. The number of the subframe counts on from the
// frame's: ten times that one, and itself. The elements carry each level twice.
constexpr std::array<Field, 5> connectedModeFields(Place earfcn, std::uint16_t cell)
{
    const auto at = [&](unsigned offset) { return static_cast<std::uint16_t>(cell + offset); };
    return {{
        {"E-ARFCN", earfcn, downlinkEARFCN},
        {"Serving Physical Cell ID", u16(at(0)), physicalCellIdentity},
        {"Subframe Number", u16(at(2))},
        {"Serving Filtered RSRP", u16(at(4)), rsrpLevel},
        {"Serving Filtered RSRQ", u16(at(8)), rsrqLevel},
    }};
}
constexpr std::array<Field, 4> connectedModeUnshown(std::uint16_t cell)
{
    const auto at = [&](unsigned offset) { return static_cast<std::uint16_t>(cell + offset); };
    return {{
        {"version", u8(13)},
        {"carrier", bits(17, 0, 3)},
        {"repeated RSRP", u16(at(6))},
        {"repeated RSRQ", u16(at(10))},
    }};
}
inline constexpr std::array<Field, 3> measuredNeighborFields{{
    {"Physical Cell ID", u16(0), physicalCellIdentity},
    {"Filtered RSRP", u16(2), rsrpLevel},
    {"Filtered RSRQ", u16(6), rsrqLevel},
}};
inline constexpr std::array<Field, 2> measuredNeighborUnshown{{
    {"repeated RSRP", u16(4)},
    {"repeated RSRQ", u16(8)},
}};
inline constexpr std::array<Field, 2> detectedCellUnshown{{
    {"correlation", u32(4)},
    {"time", bits(8, 0, 48)},
}};
constexpr List measuredNeighbors(Place count, std::uint16_t offset)
{
    return {
        .offset = offset,
        .stride = 12,
        .needed = 12,
        .count = {count},
        .fields = measuredNeighborFields,
        .unshown = measuredNeighborUnshown,
    };
}
constexpr List detectedCells(Place measured, Place count, std::uint16_t offset)
{
    return {
        .offset = offset,
        .stride = 16,
        .needed = 16,
        .count = {count},
        .fields = LTERecords::detectedCellFields,
        .unshown = detectedCellUnshown,
        .before = {measured, 12},
    };
}
inline constexpr auto connectedModeFields3 = connectedModeFields(u16(21), 23);
inline constexpr auto connectedModeUnshown3 = connectedModeUnshown(23);
inline constexpr List measuredNeighbors3 = measuredNeighbors(u8(35), 37);
inline constexpr List detectedCells3 = detectedCells(u8(35), u8(36), 37);
inline constexpr Record connectedMode3{0xB179,
                                       "LTE connected-mode measurement",
                                       37,
                                       {connectedModeFields3, connectedModeUnshown3},
                                       {&measuredNeighbors3, &detectedCells3},
                                       u8(13),
                                       bits(17, 0, 3)};
inline constexpr auto connectedModeFields4 = connectedModeFields(u32(21), 25);
inline constexpr auto connectedModeUnshown4 = connectedModeUnshown(25);
inline constexpr List measuredNeighbors4 = measuredNeighbors(u8(37), 41);
inline constexpr List detectedCells4 = detectedCells(u8(37), u8(38), 41);
inline constexpr Record connectedMode4{0xB179,
                                       "LTE connected-mode measurement",
                                       41,
                                       {connectedModeFields4, connectedModeUnshown4},
                                       {&measuredNeighbors4, &detectedCells4},
                                       u8(13),
                                       bits(17, 0, 3)};

// Idle-mode neighbour measurements. Every element is a neighbour; those of release 1 have a word of
// quality behind them.
constexpr std::array<Field, 3> idleNeighborFields(Place earfcn, std::uint16_t word)
{
    return {{
        {"Version", u8(13)},
        {"E-ARFCN", earfcn, downlinkEARFCN},
        {"Qrxlevmin", bits(word, 0, 6), wholeDbm(2, -140)},
    }};
}
inline constexpr std::array<Field, 1> idleNeighborUnshown{{{"release", u8(14)}}};
inline constexpr std::array<Mark, 1> noFrame{{{2047, "Not Present"}}};
inline constexpr std::array<Field, 12> idleNeighborCellFields{{
    {"Physical Cell ID", bits(0, 0, 9), physicalCellIdentity},
    {"Measured RSSI", bits(0, 9, 11), rssiLevel},
    {"Measured RSRP", bits(2, 4, 12), rsrpLevel},
    {"Average RSRP", bits(5, 4, 12), rsrpLevel},
    {"Measured RSRQ", bits(9, 4, 10), rsrqLevel},
    {"Average RSRQ", bits(12, 0, 10), rsrqLevel},
    {"Srxlev", bits(14, 4, 7), wholeDbm(1, -30)},
    {"Frequency Offset", u16(16)},
    {"Ant 0 Frame Offset", bits(20, 0, 11), marked(decimal, noFrame)},
    {"Ant 0 Sample Offset", bits(20, 11, 19)},
    {"Ant 1 Frame Offset", bits(24, 0, 11), marked(decimal, noFrame)},
    {"Ant 1 Sample Offset", bits(24, 11, 19)},
}};
inline constexpr std::array<Field, 4> idleNeighborCellUnshown{{
    {"repeated RSRP", bits(4, 0, 12)},
    {"repeated average RSRP", bits(8, 0, 12)},
    {"repeated RSRQ", bits(10, 6, 10)},
    {"repeated average RSRQ", bits(13, 2, 10)},
}};
constexpr List idleNeighborCells(Place count, std::uint16_t offset, std::size_t stride)
{
    return {
        .offset = offset,
        .stride = stride,
        .needed = stride,
        .count = {count},
        .fields = idleNeighborCellFields,
        .unshown = idleNeighborCellUnshown,
    };
}
inline constexpr auto idleNeighborFields4 = idleNeighborFields(u16(17), 19);
inline constexpr auto idleNeighborFields5 = idleNeighborFields(u32(17), 21);
inline constexpr List idleNeighborCells4 = idleNeighborCells(bits(19, 6, 10), 21, 28);
inline constexpr List idleNeighborCells41 = idleNeighborCells(bits(19, 6, 10), 21, 32);
inline constexpr List idleNeighborCells5 = idleNeighborCells(bits(21, 6, 26), 25, 28);
inline constexpr List idleNeighborCells51 = idleNeighborCells(bits(21, 6, 26), 25, 32);
inline constexpr Record idleNeighbors4{0xB180,
                                       "LTE idle-mode neighbour measurements",
                                       21,
                                       {idleNeighborFields4, idleNeighborUnshown},
                                       {&idleNeighborCells4},
                                       u8(13)};
inline constexpr Record idleNeighbors41{0xB180,
                                        "LTE idle-mode neighbour measurements",
                                        21,
                                        {idleNeighborFields4, idleNeighborUnshown},
                                        {&idleNeighborCells41},
                                        u8(13)};
inline constexpr Record idleNeighbors5{0xB180,
                                       "LTE idle-mode neighbour measurements",
                                       25,
                                       {idleNeighborFields5, idleNeighborUnshown},
                                       {&idleNeighborCells5},
                                       u8(13)};
inline constexpr Record idleNeighbors51{0xB180,
                                        "LTE idle-mode neighbour measurements",
                                        25,
                                        {idleNeighborFields5, idleNeighborUnshown},
                                        {&idleNeighborCells51},
                                        u8(13)};

} // namespace LTELayouts

} // namespace ventrik
