#include "TelephonyService/UTRANScenario.h"

#include "Packets/RecordWriter.h"
#include "Packets/SharedRecords.h"
#include "Packets/UTRANRecords.h"
#include "Platform/TelephonyConstants.h"

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
constexpr double lowestRscp = -120;             // dBm, as the record counts
constexpr double rscpStep = 0.25;               // dB
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
    report(RecordWriter(UTRANRecords::rrcState)
               .set("validity", 1)
               .set("State", static_cast<std::int64_t>(_walk.state())));
}

void UTRANScenario::reportCellInfo()
{
    const UTRANCell& cell = _walk.servingCell();
    report(RecordWriter(UTRANRecords::cellInfo)
               .set("URA ID", cell.uraId)
               .set("Uplink UARFCN", cell.uarfcn)
               .set("Downlink UARFCN", cell.uarfcn)
               .set("Cell ID", cell.cellIdentity));
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
    RecordWriter record(UTRANRecords::neighborMeasurements);
    record.begin(UTRANRecords::neighbors);
    for (const UTRANCell* cell : cells) {
        const double level = _walk.rscp(*cell);
        const bool isJoint =
            cell->uarfcn == serving.uarfcn && level > _walk.rscp(serving) - jointDetectionMargin;
        record.add(UTRANRecords::neighbors)
            .set("UARFCN", cell->uarfcn)
            .set("Cell ID", cell->parameterId)
            .set("Filter RSCP", rawOf((level - lowestRscp) / rscpStep, 8))
            .set("Status", statusOf(*cell, serving))
            .set("inJDCS", isJoint ? 1 : 0);
    }
    report(record);
}

void UTRANScenario::reportGsmNeighbors()
{
    RecordWriter record(UTRANRecords::gsmNeighborMeasurements);
    for (const GSMCell* cell : gsmNeighbors())
        record.add(UTRANRecords::gsmNeighbors)
            .set("Cell ID", cell->cellIdentity)
            .set("Band Indicator", cell->isHighBand ? 1 : 0)
            .set("BSIC Valid", 1)
            .set("NCC", cell->ncc)
            .set("BCC", cell->bcc)
            .set("ARFCN", cell->arfcn)
            .set("RSSI", static_cast<int>(_walk.rssi(*cell)));
    report(record);
}

void UTRANScenario::reportTransportChannels()
{
    const auto [transport, composite] = channelsIn(_walk.state());
    RecordWriter record(UTRANRecords::transportChannelMeasurement);
    for (unsigned i = 0; i < transport; ++i)
        record.add(UTRANRecords::transportChannels)
            .set("TRCH ID", i + 1)
            .set("TRCH BLER Measurement", byteOf(_walk.blockErrorRate(i)));

    constexpr unsigned firstDownlinkSlot = 4;
    for (unsigned i = 0; i < composite; ++i) {
        std::int64_t ratios = 0;
        for (unsigned slot = 0; slot < UTRANWalk::slotCount; ++slot)
            ratios |= std::int64_t{byteOf(_walk.signalToInterference(slot + i))} << (8 * slot);
        record.add(UTRANRecords::compositeChannels)
            .set("CCTRCH ID", i + 1)
            .set("TSNUM", firstDownlinkSlot + i)
            .set("SIR", ratios);
    }
    report(record);
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
    reportPropertyList(SharedRecords::cellMonitor.logCode, cells);
}

} // namespace ventrik
