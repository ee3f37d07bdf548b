#include "TelephonyService/UTRANScenario.h"

#include "Platform/TelephonyConstants.h"
#include "TelephonyService/PacketBuilder.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr std::uint64_t cellMonitorSteps = 60;  // every 3 s
constexpr std::uint64_t gsmNeighborSteps = 20;  // every 1 s
constexpr std::uint64_t callNeighborSteps = 10; // every 0.5 s in a call
constexpr std::uint64_t stateSteps = 40;        // every 2 s
constexpr double detectableRscp = -112;         // dBm
constexpr double detectableRssi = -105;         // dBm
constexpr double jointDetectionMargin = 12;     // dB below the serving cell

enum NeighborStatus : std::uint8_t { activeSet, monitoredSet, detectedSet };

// The network names the cells of its own location area; others the phone finds by itself.
NeighborStatus statusOf(const UTRANCell& cell, const UTRANCell& serving)
{
    if (&cell == &serving)
        return activeSet;
    return cell.locationAreaCode == serving.locationAreaCode ? monitoredSet : detectedSet;
}

struct ChannelCounts {
    unsigned transport;
    unsigned composite;
};

ChannelCounts channelsIn(RRCState state)
{
    switch (state) {
    case RRCState::cellDch:
        return {3, 2}; // signalling and two of data, in two bundles
    case RRCState::cellFach:
        return {1, 1};
    default:
        return {0, 0};
    }
}

} // namespace

void UTRANScenario::reportStep()
{
    const UTRANWalk::Changes changes = _walk.step();
    if (step() == 0) {
        reportSimFiles("UTRAN");
        reportNewState();
    }
    if (changes.cell || step() == 0)
        reportNewCell();
    if (changes.state)
        reportNewState();
    reportRegularly();
}

void UTRANScenario::reportNewCell()
{
    reportCellInfo();
    reportState();
    reportNeighbors();
    reportGsmNeighbors();
    reportTransportChannels();
    reportCellMonitor();
}

void UTRANScenario::reportNewState()
{
    reportState();
    reportTransportChannels();
    reportPdpContexts(isInCall());
}

void UTRANScenario::reportRegularly()
{
    if (isInCall())
        reportTransportChannels();
    if (!isInCall() || step() % callNeighborSteps == 0)
        reportNeighbors();
    if (step() % gsmNeighborSteps == 0)
        reportGsmNeighbors();
    if (step() % stateSteps == 0)
        reportState();
    if (step() % cellMonitorSteps == cellMonitorSteps - 1)
        reportCellMonitor();
}

void UTRANScenario::reportState()
{
    report(PacketBuilder(0xD0E0).u8(13, 1).u8(14, static_cast<std::uint8_t>(_walk.state())));
}

void UTRANScenario::reportCellInfo()
{
    const UTRANCell& cell = _walk.servingCell();
    report(PacketBuilder(0xD0E2)
               .u8(14, 0)
               .u8(15, cell.uraId)
               .u16(17, cell.uarfcn)
               .u16(19, cell.uarfcn)
               .u32(21, cell.cellIdentity)
               .u8(25, 0)
               .size(26));
}

std::vector<const UTRANCell*> UTRANScenario::neighbors() const
{
    std::vector<const UTRANCell*> found;
    for (const UTRANCell& cell : UTRANWalk::cells())
        if (&cell != &_walk.servingCell() && _walk.rscp(cell) > detectableRscp)
            found.push_back(&cell);
    return found;
}

std::vector<const GSMCell*> UTRANScenario::gsmNeighbors() const
{
    std::vector<const GSMCell*> found;
    for (const GSMCell& cell : UTRANWalk::gsmCells())
        if (_walk.rssi(cell) > detectableRssi)
            found.push_back(&cell);
    return found;
}

// In a call the serving cell stands in the list as well, as the active one.
void UTRANScenario::reportNeighbors()
{
    const UTRANCell& serving = _walk.servingCell();
    auto cells = neighbors();
    if (isInCall())
        cells.insert(cells.begin(), &serving);
    PacketBuilder packet(0xD00A);
    packet.bits(16, 1, 7, static_cast<std::uint32_t>(cells.size())).size(168);
    std::size_t offset = 168;
    for (const UTRANCell* cell : cells) {
        const double level = _walk.rscp(*cell);
        const bool isJoint =
            cell->uarfcn == serving.uarfcn && level > _walk.rscp(serving) - jointDetectionMargin;
        packet.bits(offset, 0, 14, cell->uarfcn)
            .bits(offset + 1, 6, 7, cell->parameterId)
            .bits(offset + 2, 5, 8, rawLevel(level, -120, 0.25, 8))
            .bits(offset + 3, 5, 2, statusOf(*cell, serving))
            .bits(offset + 3, 7, 1, isJoint ? 1 : 0);
        offset += 16;
        packet.size(offset);
    }
    report(std::move(packet));
}

void UTRANScenario::reportGsmNeighbors()
{
    const auto cells = gsmNeighbors();
    PacketBuilder packet(0xD00E);
    packet.u8(16, static_cast<std::uint8_t>(cells.size()));
    std::size_t offset = 17;
    for (const GSMCell* cell : cells) {
        packet.bits(offset, 0, 14, cell->cellIdentity)
            .bits(offset + 1, 6, 1, cell->isHighBand ? 1 : 0)
            .bits(offset + 1, 7, 1, 1)
            .u8(offset + 2, cell->ncc)
            .u8(offset + 3, cell->bcc)
            .u16(offset + 4, cell->arfcn)
            .u16(offset + 6, static_cast<std::uint16_t>(static_cast<int>(_walk.rssi(*cell))));
        offset += 8;
    }
    report(std::move(packet));
}

void UTRANScenario::reportTransportChannels()
{
    const auto [transport, composite] = channelsIn(_walk.state());
    PacketBuilder packet(0xD00C);
    packet.size(17).bits(14, 6, 6, transport).bits(15, 4, 4, composite);
    for (unsigned i = 0; i < transport; ++i)
        packet.u8(17 + 2 * i, static_cast<std::uint8_t>(i + 1))
            .u8(18 + 2 * i, byteOf(_walk.blockErrorRate(i)));

    constexpr unsigned firstDownlinkSlot = 4;
    std::size_t offset = 289 + 34 * std::size_t{transport};
    for (unsigned i = 0; i < composite; ++i, offset += 8) {
        packet.u8(offset, static_cast<std::uint8_t>(i + 1))
            .u8(offset + 1, static_cast<std::uint8_t>(firstDownlinkSlot + i));
        for (unsigned slot = 0; slot < UTRANWalk::slotCount; ++slot)
            packet.u8(offset + 2 + slot, byteOf(_walk.signalToInterference(slot + i)));
    }
    report(std::move(packet));
}

void UTRANScenario::reportCellMonitor()
{
    PlistArray cells;
    auto shown = neighbors();
    shown.insert(shown.begin(), &_walk.servingCell());
    for (const UTRANCell* cell : shown) {
        PlistDictionary entry =
            cellEntry(kQXCellMonitorRadioAccessTechnologyUTRAN2, cell == &_walk.servingCell());
        entry.set(kQXCellMonitorLAC, cell->locationAreaCode);
        entry.set(kQXCellMonitorCellId, cell->cellIdentity);
        entry.set(kQXCellMonitorBandInfo, cell->band);
        entry.set(kQXCellMonitorSCN, cell->parameterId);
        entry.set(kQXCellMonitorUARFCN, cell->uarfcn);
        cells.append(entry);
    }
    for (const GSMCell* cell : gsmNeighbors()) {
        PlistDictionary entry = cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, false);
        entry.set(kQXCellMonitorCellId, cell->cellIdentity);
        entry.set(kQXCellMonitorARFCN, cell->arfcn);
        cells.append(entry);
    }
    reportPropertyList(0xFF0001, cells);
}

} // namespace ventrik
