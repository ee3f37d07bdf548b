#pragma once

#include "Packets/LTELayouts.h"
#include "Packets/Subpackets.h"

namespace ventrik
{

// The measurements that LTE basebands of today log most: records of subpackets whose versions tell
// the layout. Offsets of fields count from a cell's first byte, those of a subpacket's header from
// the subpacket's.

namespace LTESignalRecords
{

// ---- Neighbour cells: the response of a measurement, cells of 52 bytes behind a header

constexpr std::array<Field, 3> neighborHeader(Place earfcn, std::uint16_t counts)
{
    return {{
        {"E-ARFCN", earfcn, downlinkEARFCN},
        {"subpacket version", Subpackets::version},
        {"cells", bits(counts, 0, 6)},
    }};
}
inline constexpr auto narrowNeighborHeader = neighborHeader(u16(4), 6);
inline constexpr auto wideNeighborHeader = neighborHeader(u32(4), 8);
// Of two antennas and, under the plain names, of the better one.
inline constexpr std::array<Field, 10> neighborFields{{
    {"Physical Cell ID", bits(0, 0, 9), physicalCellIdentity},
    {"Measured RSRP", bits(12, 0, 12), LTELayouts::rsrpLevel},
    {"Measured RSRQ", bits(21, 2, 10), LTELayouts::rsrqLevel},
    {"Measured RSSI", bits(29, 3, 11), LTELayouts::rssiLevel},
    {"RSRP Rx 0", bits(4, 0, 12), LTELayouts::rsrpLevel},
    {"RSRP Rx 1", bits(8, 0, 12), LTELayouts::rsrpLevel},
    {"RSRQ Rx 0", bits(16, 0, 10), LTELayouts::rsrqLevel},
    {"RSRQ Rx 1", bits(18, 4, 10), LTELayouts::rsrqLevel},
    {"RSSI Rx 0", bits(24, 0, 11), LTELayouts::rssiLevel},
    {"RSSI Rx 1", bits(28, 0, 11), LTELayouts::rssiLevel},
}};
inline constexpr std::span<const Field> combinedNeighborFields = std::span(neighborFields).first(4);
constexpr List neighbors(std::size_t offset, std::uint16_t counts)
{
    return {
        .offset = offset,
        .stride = 52,
        .needed = 52,
        .count = {bits(counts, 0, 6)},
        .fields = neighborFields,
    };
}
inline constexpr List narrowNeighbors = neighbors(8, 6);
inline constexpr List wideNeighbors = neighbors(12, 8);

/// What a response's version tells.
struct NeighborLayout {
    std::uint8_t version;
    std::span<const Field> header;
    const List* cells;
};
inline constexpr std::array<NeighborLayout, 3> idleLayouts{{
    {2, narrowNeighborHeader, &narrowNeighbors},
    {4, wideNeighborHeader, &wideNeighbors},
    {56, wideNeighborHeader, &wideNeighbors},
}};
inline constexpr std::array<NeighborLayout, 2> connectedLayouts{{
    {3, narrowNeighborHeader, &narrowNeighbors},
    {4, wideNeighborHeader, &wideNeighbors},
}};
inline constexpr Record idleNeighbors{.logCode = 0xB192,
                                      .name = "LTE idle-mode neighbour signal",
                                      .minimumSize = Subpackets::minimumSize,
                                      .isExtension = true,
                                      .subpacket = 27};
inline constexpr Record connectedNeighbors{.logCode = 0xB195,
                                           .name = "LTE connected-mode neighbour signal",
                                           .minimumSize = Subpackets::minimumSize,
                                           .isExtension = true,
                                           .subpacket = 31};

// ---- Serving cell signal. Each version has its header, its cells, its order of the words that
// hold the levels.

/// Where a level stands: in the word, counted from the first of the levels' words, from the bit on.
struct LevelPlace {
    std::uint8_t word;
    std::uint8_t bit;
};
struct AntennaLevels {
    LevelPlace rsrp, rsrq, rssi;
};
/// An order of the words.
struct SignalOrder {
    std::uint8_t words;
    std::array<AntennaLevels, 4> antennas; ///< as many as there are
    std::uint8_t antennaCount;
    AntennaLevels best; ///< the better of the antennas
    double bestRSRPOffset;
    struct Filtered {
        LevelPlace rsrp, rsrq;
    };
    std::optional<Filtered> filtered;
};
inline constexpr SignalOrder orderA{
    7,    {{{{0, 10}, {3, 12}, {5, 10}}, {{1, 12}, {4, 0}, {5, 21}}}},
    2,    {{2, 12}, {4, 20}, {6, 0}},
    -180, {}};
inline constexpr SignalOrder orderB{
    10,   {{{{0, 10}, {4, 12}, {7, 10}}, {{1, 12}, {5, 0}, {7, 21}}}},
    2,    {{3, 12}, {6, 10}, {9, 0}},
    -180, {}};
// The combined RSRP counts from 40 dB further up.
inline constexpr SignalOrder orderC{11,
                                    {{{{0, 10}, {5, 0}, {8, 0}},
                                      {{1, 12}, {5, 20}, {8, 11}},
                                      {{2, 12}, {6, 10}, {9, 0}},
                                      {{3, 0}, {6, 20}, {9, 11}}}},
                                    4,
                                    {{3, 12}, {7, 0}, {10, 0}},
                                    -140,
                                    {{{4, 12}, {7, 20}}}};
inline constexpr SignalOrder orderD{12,
                                    {{{{0, 10}, {6, 0}, {9, 0}},
                                      {{1, 12}, {6, 20}, {9, 11}},
                                      {{2, 12}, {7, 10}, {10, 0}},
                                      {{4, 0}, {7, 20}, {10, 11}}}},
                                    4,
                                    {{4, 12}, {8, 0}, {11, 0}},
                                    -140,
                                    {{{5, 12}, {8, 20}}}};

/// Which antennas of a cell were measured.
enum class MeasuredAntennas : std::uint8_t {
    All,
    WithRSRP,     ///< those whose RSRP is not 0
    OfHeaderMask, ///< bit k of the header's mask: antenna k
    OfCellMask,   ///< bit k of the cell's mask
};

// In the place of an offset or a size: the version has no such thing.
inline constexpr std::uint16_t absent = 0xFFFF;

/// What a version of the subpacket tells.
struct SignalVersion {
    std::uint8_t version;
    Place earfcn; ///< of the subpacket
    std::uint16_t headerSize;
    /// Of the cells; 0: what the header leaves, in equal parts; absent: there is one.
    std::uint16_t stride;
    std::uint16_t identity; ///< of the cell
    std::uint16_t frame;    ///< of the cell, or absent
    std::uint16_t levels;   ///< of the cell
    const SignalOrder* order;
    std::uint16_t noise; ///< of the cell, or absent
    MeasuredAntennas measured;
    std::uint8_t servingBit; ///< of the identity's word; 0: the one cell is the serving cell
};
inline constexpr Place narrowEARFCN = u16(4);
inline constexpr Place wideEARFCN = bits(4, 0, 18);
inline constexpr Place signalCellCount = u16(8);
inline constexpr Place headerMask = u16(10);
inline constexpr Place cellMask = u32(0);
using enum MeasuredAntennas;
inline constexpr std::array<SignalVersion, 12> signalVersions{{
    {4, narrowEARFCN, 2, absent, 0, absent, 10, &orderA, 58, All, 0},
    {7, wideEARFCN, 4, absent, 0, absent, 12, &orderA, 60, All, 0},
    {18, wideEARFCN, 4, absent, 0, 4, 16, &orderA, 64, All, 0},
    {19, wideEARFCN, 8, 88, 0, 4, 16, &orderA, 64, All, 12},
    {22, wideEARFCN, 8, 120, 0, 4, 16, &orderB, 76, All, 12},
    {35, wideEARFCN, 8, 128, 0, 4, 16, &orderC, 80, WithRSRP, 12},
    {36, wideEARFCN, 8, 128, 0, 4, 16, &orderC, 80, OfHeaderMask, 12},
    {40, wideEARFCN, 8, 132, 0, 4, 16, &orderD, 84, OfHeaderMask, 12},
    {48, wideEARFCN, 12, 140, 0, 4, 16, &orderD, 92, OfHeaderMask, 12},
    {56, wideEARFCN, 8, 0, 8, absent, 24, &orderD, absent, OfCellMask, 15},
    {59, wideEARFCN, 8, 0, 8, absent, 24, &orderD, absent, OfCellMask, 15},
    {60, wideEARFCN, 8, 0, 8, 12, 24, &orderD, absent, OfCellMask, 15},
}};

/// The fields of a version's cells, as places in the cell.
struct SignalFields {
    std::array<Field, 8> ofCell{}; ///< identity, frame, levels of all antennas
    std::size_t ofCellCount = 0;
    /// RSRP, RSRQ, RSSI and, where it stands, SNR.
    std::array<std::array<Field, 4>, 4> ofAntennas{};
    std::size_t ofAntennaCount = 0;
    std::array<Field, 4> ofHeader{}; ///< the frequency first
    Field carrier{};
    Field serving{};
    std::size_t needed = 0; ///< the bytes that a complete cell has

    constexpr std::span<const Field> header() const { return ofHeader; }
    constexpr const Field& earfcn() const { return ofHeader.front(); }
    constexpr std::span<const Field> cell() const { return std::span(ofCell).first(ofCellCount); }
    constexpr std::span<const Field> antenna(std::size_t index) const
    {
        return std::span(ofAntennas[index]).first(ofAntennaCount);
    }
};

inline constexpr std::array<std::array<std::string_view, 4>, 4> antennaKeys{{
    {"RSRP Rx 0", "RSRQ Rx 0", "RSSI Rx 0", "SNR Rx 0"},
    {"RSRP Rx 1", "RSRQ Rx 1", "RSSI Rx 1", "SNR Rx 1"},
    {"RSRP Rx 2", "RSRQ Rx 2", "RSSI Rx 2", "SNR Rx 2"},
    {"RSRP Rx 3", "RSRQ Rx 3", "RSSI Rx 3", "SNR Rx 3"},
}};

constexpr Place levelPlace(const SignalVersion& version, LevelPlace level, std::uint8_t width)
{
    const unsigned bit = 32U * level.word + level.bit;
    return bits(static_cast<std::uint16_t>(version.levels + bit / 16 * 2),
                static_cast<std::uint8_t>(bit % 16), width);
}

// Two antennas share a word of noise.
constexpr Place noisePlace(const SignalVersion& version, std::size_t antenna)
{
    return bits(static_cast<std::uint16_t>(version.noise + antenna / 2 * 4),
                static_cast<std::uint8_t>(antenna % 2 * 9), 9);
}

constexpr SignalFields signalFields(const SignalVersion& version)
{
    using namespace LTELayouts;
    SignalFields fields;
    const auto add = [&](const Field& field) { fields.ofCell[fields.ofCellCount++] = field; };
    const SignalOrder& order = *version.order;
    add({"Physical Cell ID", bits(version.identity, 0, 9), physicalCellIdentity});
    if (version.frame != absent) {
        add({"System Frame Number", bits(version.frame, 0, 10)});
        add({"Subframe Number", bits(version.frame, 10, 4)});
    }
    if (order.filtered) {
        add({"Filtered RSRP", levelPlace(version, order.filtered->rsrp, 12), rsrpLevel});
        add({"Filtered RSRQ", levelPlace(version, order.filtered->rsrq, 10), rsrqLevel});
    }
    add({"RSRP", levelPlace(version, order.best.rsrp, 12), rsrp(0.0625, order.bestRSRPOffset)});
    add({"RSRQ", levelPlace(version, order.best.rsrq, 10), rsrqLevel});
    add({"RSSI", levelPlace(version, order.best.rssi, 11), rssiLevel});

    const bool hasNoise = version.noise != absent;
    fields.ofAntennaCount = hasNoise ? 4 : 3;
    for (std::size_t i = 0; i < order.antennaCount; ++i) {
        const AntennaLevels& levels = order.antennas[i];
        fields.ofAntennas[i] = {{
            {antennaKeys[i][0], levelPlace(version, levels.rsrp, 12), rsrpLevel},
            {antennaKeys[i][1], levelPlace(version, levels.rsrq, 10), rsrqLevel},
            {antennaKeys[i][2], levelPlace(version, levels.rssi, 11), rssiLevel},
            {antennaKeys[i][3], noisePlace(version, i), snrLevel},
        }};
    }

    fields.ofHeader = {{
        {"E-ARFCN", version.earfcn, downlinkEARFCN},
        {"subpacket version", Subpackets::version},
        {"cells", signalCellCount},
        {"antennas", headerMask},
    }};
    fields.carrier = {"Carrier Index",
                      bits(static_cast<std::uint16_t>(version.identity + 1), 1, 3)};
    fields.serving = {"Serving", bits(version.identity, version.servingBit, 1),
                      labels(LTERecords::falseLabel, "True")};
    fields.needed = version.levels + 4 * std::size_t{order.words};
    if (hasNoise)
        fields.needed = noisePlace(version, order.antennaCount - std::size_t{1}).offset + 4U;
    return fields;
}

inline constexpr auto signalFieldsOfVersions = [] {
    std::array<SignalFields, signalVersions.size()> all{};
    for (std::size_t i = 0; i < all.size(); ++i)
        all[i] = signalFields(signalVersions[i]);
    return all;
}();

/// The fields of a version of the table.
constexpr const SignalFields& signalFieldsOf(const SignalVersion& version)
{
    return signalFieldsOfVersions[static_cast<std::size_t>(&version - signalVersions.data())];
}

inline constexpr Record servingCellSignal{.logCode = 0xB193,
                                          .name = "LTE serving cell signal",
                                          .minimumSize = Subpackets::minimumSize,
                                          .isExtension = true,
                                          .subpacket = 25};

} // namespace LTESignalRecords

} // namespace ventrik
