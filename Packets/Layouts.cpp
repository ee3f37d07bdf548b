#include "Packets/Layouts.h"

#include "Packets/GSMLayouts.h"
#include "Packets/LTELayouts.h"
#include "Packets/LTESignalRecords.h"
#include "Packets/LTEStateRecords.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::size_t anySize = std::numeric_limits<std::size_t>::max();

std::size_t endOf(const RecordElements& elements)
{
    return elements.offset + elements.stride * elements.count;
}

// ---- LTE

bool isOfRelease1(const LogPacket& packet)
{
    constexpr std::size_t releaseOffset = 14;
    return packet.u8(releaseOffset) == 1;
}

// Release 1 brings one more word at the end.
bool endsAsItsReleaseSays(const Record& record, const LogPacket& packet)
{
    constexpr std::size_t word = 4;
    return packet.size() == record.minimumSize + (isOfRelease1(packet) ? word : 0);
}

bool hasWholeElements(const Record& record, const LogPacket& packet)
{
    const RecordElements cells = record.lists.front()->elementsOf(packet);
    if (packet.size() < cells.offset || (packet.size() - cells.offset) % cells.stride != 0)
        return false;
    return cells.count >= 1 && cells.count <= (packet.size() - cells.offset) / cells.stride;
}

bool hasWholeShortElements(const Record& record, const LogPacket& packet)
{
    return !isOfRelease1(packet) && hasWholeElements(record, packet);
}

bool hasWholeLongElements(const Record& record, const LogPacket& packet)
{
    return isOfRelease1(packet) && hasWholeElements(record, packet);
}

// Zeros stand beside the carrier's number, and both lists lie in the packet. More may follow.
bool holdsItsListsBehindZeros(const Record& record, const LogPacket& packet)
{
    constexpr std::size_t zerosBefore = 14;
    constexpr std::size_t zerosBehind = 18;
    for (const std::size_t zeros : {zerosBefore, zerosBehind})
        if (numberAt(packet, bits(static_cast<std::uint16_t>(zeros), 0, 24)) != 0)
            return false;
    return endOf(record.lists.back()->elementsOf(packet)) <= packet.size();
}

bool endsWithItsLists(const Record& record, const LogPacket& packet)
{
    return endOf(record.lists.back()->elementsOf(packet)) == packet.size();
}

// ---- GSM and UMTS

bool endsWithItsLongerList(const Record& record, const LogPacket& packet)
{
    return std::max(endOf(record.lists.front()->elementsOf(packet)),
                    endOf(record.lists.back()->elementsOf(packet))) == packet.size();
}

bool tellsItsBand(const Record& record, const LogPacket& packet)
{
    constexpr std::int64_t firstBand = 8;
    constexpr std::int64_t lastBand = 12;
    const std::int64_t band = numberOf(packet, *record.find("band"));
    return band >= firstBand && band <= lastBand;
}

bool tellsNoBand(const Record&, const LogPacket& packet)
{
    return numberOf(packet, GSMLayouts::cellIdentityUnshown.front()) == 0;
}

// Whether the three bytes are a network: its country begins with 2 to 7, and a blank may stand for
// the last digit only.
bool isNetwork(std::int64_t digits)
{
    constexpr std::int64_t blank = 15;
    const auto digit = [&](unsigned index) { return digits >> (4 * index) & 0xF; };
    // The last digit of the code of the network stands fourth, in front of the others.
    for (const unsigned index : {1U, 2U, 4U, 5U})
        if (digit(index) > 9)
            return false;
    return digit(0) >= 2 && digit(0) <= 7 && (digit(3) <= 9 || digit(3) == blank);
}

// Slots that are not counted are all ones.
bool countsItsNetworks(const Record& record, const LogPacket& packet)
{
    constexpr std::size_t slots = 5;
    constexpr std::int64_t empty = 0xFFFFFF;
    const RecordElements networks = record.lists.front()->elementsOf(packet);
    const Field& digits = record.lists.front()->unshown.front();
    if (networks.count > slots)
        return false;
    for (std::size_t i = 0; i < slots; ++i) {
        const LogPacket slot = packet.from(networks.offset + networks.stride * i);
        const std::int64_t number = numberOf(slot, digits);
        if (i < networks.count ? !isNetwork(number) : number != empty)
            return false;
    }
    return true;
}

// One digit a byte; the last element reaches beyond its stride.
bool countsItsDigits(const Record& record, const LogPacket& packet)
{
    const RecordElements networks = record.lists.front()->elementsOf(packet);
    if (networks.count == 0)
        return true;
    const std::size_t end = endOf(networks) - networks.stride + networks.needed;
    for (std::size_t i = networks.offset; i < end; ++i)
        if (packet.u8(i) > 9)
            return false;
    return packet.size() == end;
}

// ---- Records of subpackets

bool hasKnownSignal(const Record& record, const LogPacket& packet)
{
    const auto version = versionOf(record, packet);
    return version && std::ranges::find(LTESignalRecords::signalVersions, *version,
                                        &LTESignalRecords::SignalVersion::version) !=
                          LTESignalRecords::signalVersions.end();
}

// ---- The choice: of each log code its layouts, in the order in which they are tried. A base
// layout has its row where it is surely right.

using namespace LTELayouts;
using namespace GSMLayouts;
using namespace LTEStateRecords;
using namespace LTESignalRecords;

constexpr std::array layouts{
    Layout{&rankedCells0, 0, 0, 15, anySize, endsWithItsLists, "ending with its lists"},
    Layout{&rankedCells1, 1, 1, 15, anySize, endsWithItsLists, "ending with its lists"},
    Layout{&rankedCells2, 2, 2, 20, anySize, endsWithItsLists, "ending with its lists"},
    Layout{&GSMRecords::rankedCells, 0, 255, 15, anySize, endsWithItsLongerList,
           "ending with the longer of its lists"},
    Layout{&umtsCell45, 0, 255, 45, 45},
    Layout{&GSMRecords::umtsCell, 0, 255, 29, 29},
    Layout{&cellIdentityWithBand, 0, 255, 26, 26, tellsItsBand,
           "a band in the top four bits of 13 u16"},
    Layout{&GSMRecords::cellIdentity, 0, 255, 26, 26, tellsNoBand,
           "no band in the top four bits of 13 u16"},
    Layout{&GSMLayouts::equivalentPLMNs, 0, 255, 32, 32, countsItsNetworks,
           "networks as digits in nibbles, empty slots all ones"},
    Layout{&GSMRecords::equivalentPLMNs, 0, 255, 17, anySize, countsItsDigits,
           "a digit a byte, ending with the last network"},
    Layout{&message2, 2, 4, 26},
    Layout{&message5, 5, 5, 30},
    Layout{&message6, 6, 7, 30},
    Layout{&message8, 8, 8, 32},
    Layout{&message9, 9, 9, 32},
    Layout{&message10, 10, 11, 32},
    Layout{&message9, 12, 12, 32},
    Layout{&message8, 13, 13, 32},
    Layout{&message14, 14, 16, 32},
    Layout{&message10, 17, 18, 32},
    Layout{&message19, 19, 19, 32},
    Layout{&message14, 20, 20, 32},
    Layout{&message10, 21, 21, 32},
    Layout{&message8, 22, 22, 32},
    Layout{&message10, 23, 23, 32},
    Layout{&message14, 24, 24, 32},
    Layout{&message25, 25, 25, 34},
    Layout{&message26, 26, 27, 34},
    Layout{&message30, 30, 30, 37},
    Layout{&LTERecords::antennaCount, 0, 1, 22, 22},
    Layout{&antennaCount2, 2, 2, 24, 24},
    Layout{&antennaCount3, 3, 3, 25, 25},
    Layout{&antennaCount17, 17, 17, 31},
    Layout{&LTERecords::cellInfo, 0, 2, 38, 38},
    Layout{&cellInfo3, 3, 3, 42, 42},
    Layout{&emm, 2, 2, 32, 32},
    Layout{&connectedMode3, 3, 3, 37, anySize, holdsItsListsBehindZeros,
           "zeros at 14 to 16 and 18 to 20, both lists within"},
    Layout{&connectedMode4, 4, 4, 41, anySize, holdsItsListsBehindZeros,
           "zeros at 14 to 16 and 18 to 20, both lists within"},
    Layout{&LTERecords::connectedMode, 0, 2, 29, anySize, endsWithItsLists,
           "ending with its lists"},
    Layout{&servingCellMeasurement3, 3, 3, 45, 45},
    Layout{&servingCellMeasurement4, 4, 4, 45, 49, endsAsItsReleaseSays,
           "four bytes longer where 14 u8 is 1"},
    Layout{&servingCellMeasurement5, 5, 5, 49, 53, endsAsItsReleaseSays,
           "four bytes longer where 14 u8 is 1"},
    Layout{&LTERecords::servingCellMeasurement, 0, 3, 33, 33},
    Layout{&idleNeighbors4, 4, 4, 49, anySize, hasWholeShortElements,
           "14 u8 not 1, whole elements"},
    Layout{&idleNeighbors41, 4, 4, 53, anySize, hasWholeLongElements, "14 u8 is 1, whole elements"},
    Layout{&idleNeighbors5, 5, 5, 53, anySize, hasWholeShortElements,
           "14 u8 not 1, whole elements"},
    Layout{&idleNeighbors51, 5, 5, 57, anySize, hasWholeLongElements, "14 u8 is 1, whole elements"},
    Layout{&LTERecords::idleNeighbors, 0, 3, 21, anySize, hasWholeElements, "whole elements"},
    Layout{&LTESignalRecords::idleNeighbors, 2, 2},
    Layout{&LTESignalRecords::idleNeighbors, 4, 4},
    Layout{&LTESignalRecords::idleNeighbors, 56, 56},
    Layout{&servingCellSignal, 0, 255, 0, anySize, hasKnownSignal,
           "a subpacket of a known version"},
    Layout{&connectedNeighbors, 3, 4},
};

constexpr std::uint32_t codeOf(const Layout& layout)
{
    return layout.record->logCode;
}

static_assert(std::ranges::is_sorted(layouts, {}, codeOf));

constexpr bool tellsVersion(const Record& record)
{
    return record.version || record.subpacket;
}

// So that it is read once for all of them.
constexpr bool tellVersionsAlike()
{
    for (const Layout& layout : layouts) {
        const Record& record = *layout.record;
        const Record& first = *std::ranges::find(layouts, codeOf(layout), codeOf)->record;
        if (tellsVersion(record) &&
            (record.version != first.version || record.subpacket != first.subpacket))
            return false;
        if (!layout.isOfAnyVersion() && !tellsVersion(record))
            return false;
    }
    return true;
}

static_assert(tellVersionsAlike());

} // namespace

std::string_view nameOf(RecordsMode mode)
{
    constexpr std::array<std::string_view, 3> names{"base", "newer", "extended"};
    return names.at(static_cast<std::size_t>(mode));
}

std::optional<RecordsMode> recordsModeNamed(std::string_view name)
{
    for (const RecordsMode mode : {RecordsMode::Base, RecordsMode::Newer, RecordsMode::Extended})
        if (nameOf(mode) == name)
            return mode;
    return std::nullopt;
}

bool Layout::isOf(const LogPacket& packet, std::optional<std::uint8_t> version) const
{
    if (packet.size() < minimumSize || packet.size() > maximumSize)
        return false;
    if (!isOfAnyVersion() && (!version || *version < firstVersion || *version > lastVersion))
        return false;
    return !fits || fits(*record, packet);
}

std::optional<std::uint8_t> versionOf(const Record& record, const LogPacket& packet)
{
    if (record.version)
        return static_cast<std::uint8_t>(numberAt(packet, *record.version));
    if (!record.subpacket)
        return std::nullopt;
    const auto subpackets = subpacketsOf(packet, *record.subpacket);
    return subpackets.empty() ? std::nullopt : std::optional(subpackets.front().version);
}

std::span<const Layout> layoutsOf(std::uint32_t logCode)
{
    const auto first = std::ranges::lower_bound(layouts, logCode, {}, codeOf);
    const auto last = std::ranges::upper_bound(layouts, logCode, {}, codeOf);
    return {first, last};
}

ChosenLayout chooseLayout(const Record& base, std::span<const Layout> ofCode,
                          const LogPacket& packet)
{
    if (ofCode.empty())
        return {&base, LayoutKind::Base, versionOf(base, packet)};
    const auto version = versionOf(*ofCode.front().record, packet);
    const auto chosen = [&](const Record& record, LayoutKind kind) {
        return ChosenLayout{&record, kind, tellsVersion(record) ? version : std::nullopt};
    };
    for (const Layout& layout : ofCode)
        if (layout.isOf(packet, version)) {
            const bool isBase = layout.record == &base && !base.isExtension;
            return chosen(*layout.record, isBase ? LayoutKind::Base : LayoutKind::Newer);
        }
    return chosen(base, LayoutKind::NotKnown);
}

std::string_view nameOf(LayoutKind kind)
{
    switch (kind) {
    case LayoutKind::Base:
        return "base";
    case LayoutKind::Newer:
        return "newer";
    case LayoutKind::NotKnown:
        break;
    }
    return "not known";
}

std::string warningOf(const ReadLayout& layout)
{
    const std::string version = layout.version ? fmt::format("version {}", *layout.version)
                                               : fmt::format("of {} bytes", layout.size);
    return fmt::format("0x{:04X} {}: layout not known, values may be wrong", layout.logCode,
                       version);
}

} // namespace ventrik
