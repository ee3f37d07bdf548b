#include "TelephonyService/LTEScenario.h"

#include "Packets/LTESignalRecords.h"
#include "Packets/LTEStateRecords.h"
#include "Packets/RecordWriter.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <cmath>
#include <span>

namespace ventrik
{

namespace
{

constexpr std::uint64_t cellMonitorSteps = 60;  // every 3 s
constexpr std::uint64_t idleNeighborSteps = 10; // every 0.5 s while idle
constexpr std::uint64_t reselectionSteps = 40;  // every 2 s while idle
constexpr int qrxlevmin = -124;                 // dBm
constexpr int maximumPower = 23;                // dBm
constexpr double detectableRsrp = -118;         // dBm
constexpr double measurableMargin = 26;         // dB below the serving cell

} // namespace

void LTEScenario::reportStep()
{
    const bool hasNewCell = _drive.step() || step() == 0;
    if (step() == 0)
        reportSimFiles("E-UTRAN");
    if (hasNewCell)
        reportNewCell();
    if (step() == 0 || _drive.isConnected() != _wasConnected)
        reportPdpContexts(_drive.isConnected());
    if (isExtended() && (step() == 0 || _drive.isConnected() != _wasConnected))
        reportConnection();
    _wasConnected = _drive.isConnected();
    if (isExtended())
        reportServingCellSignal();

    if (_drive.isConnected())
        reportConnectedMeasurement();
    else
        reportIdleStep();
    if (step() % cellMonitorSteps == cellMonitorSteps - 1)
        reportCellMonitor();
}

void LTEScenario::reportIdleStep()
{
    reportIdleMeasurement();
    if (step() % idleNeighborSteps == 0)
        reportIdleNeighbors();
    if (step() % reselectionSteps == 0)
        reportReselectionCandidates();
}

void LTEScenario::reportNewCell()
{
    reportCellInfo();
    reportAntennaCount();
    reportIdleMeasurement();
    reportConnectedMeasurement();
    reportIdleNeighbors();
    reportReselectionCandidates();
    reportCellMonitor();
}

void LTEScenario::reportCellInfo()
{
    const LTECell& cell = _drive.servingCell();
    RecordWriter record(isNewer() ? LTELayouts::cellInfo3 : LTERecords::cellInfo);
    record.set("version", isNewer() ? 3 : 2)
        .set("Physical Cell ID", cell.physicalCellId)
        .set("Download Frequency", cell.downlinkEarfcn)
        .set("Upload Frequency", cell.uplinkEarfcn)
        .set("Download Bandwidth", cell.resourceBlocks)
        .set("Upload Bandwidth", cell.resourceBlocks)
        .set("Cell Identity", cell.cellIdentity)
        .set("Tracking Area Code", cell.trackingAreaCode)
        .set("Freq Band Indicator", cell.band);
    if (isNewer())
        record.set("mobile country code", 262)
            .set("digits of the mobile network code", 2)
            .set("mobile network code", 7);
    report(record);
}

void LTEScenario::reportAntennaCount()
{
    if (isNewer()) {
        const LTECell& cell = _drive.servingCell();
        report(RecordWriter(LTELayouts::antennaCount2)
                   .set("version", 2)
                   .set("physical cell identity", cell.physicalCellId)
                   .set("frequency", cell.downlinkEarfcn)
                   .set("system frame number", frame())
                   .set("bandwidth", cell.resourceBlocks)
                   .set("Num Tx Antennas", cell.antennas));
        return;
    }
    report(RecordWriter(LTERecords::antennaCount)
               .set("Num Tx Antennas", _drive.servingCell().antennas));
}

void LTEScenario::reportIdleMeasurement()
{
    const LTECell& cell = _drive.servingCell();
    const double measured = _drive.measuredRsrp(cell);
    const double average = _drive.averageRsrp(cell);
    const double measuredRsrq = _drive.rsrq(cell, measured);
    const double averageRsrq = _drive.rsrq(cell, average);
    const double srxlev = average - qrxlevmin;
    RecordWriter record(isNewer() ? LTELayouts::servingCellMeasurement5
                                  : LTERecords::servingCellMeasurement);
    record.set("Version", isNewer() ? 5 : 3)
        .set("E-ARFCN", cell.downlinkEarfcn)
        .set("Physical Cell ID", cell.physicalCellId)
        .set("Serving Layer Priority", cell.layerPriority)
        .level("Measured RSRP", measured)
        .level("Average RSRP", average)
        .level("Measured RSRQ", measuredRsrq)
        .level("Average RSRQ", averageRsrq)
        .level("Measured RSSI", _drive.rssi(cell, measured, measuredRsrq))
        .level("Qrxlevmin", qrxlevmin)
        .level("P_Max", maximumPower)
        .level("Max UE Tx Power", maximumPower)
        .level("Srxlev", srxlev)
        .set("Num of Consecutive DRX Cycles of S < 0", srxlev < 0 ? 1 : 0)
        .level("S Intra Search", 62)
        .level("S Non Intra Search", 10);
    if (isNewer())
        record
            .set("repeated RSRP",
                 rawNumber(*LTELayouts::servingCellMeasurement5.find("Measured RSRP"), measured))
            .set("repeated RSRQ",
                 rawNumber(*LTELayouts::servingCellMeasurement5.find("Measured RSRQ"),
                           measuredRsrq));
    else
        record.set("Measurement Rules Updated", average < -100 ? 1 : 0)
            .set("Measurement Rules", average < -100 ? 3 : 1);
    report(record);
}

void LTEScenario::reportConnectedMeasurement()
{
    const LTECell& serving = _drive.servingCell();
    const double rsrp = _drive.averageRsrp(serving);
    RecordWriter record(isNewer() ? LTELayouts::connectedMode4 : LTERecords::connectedMode);
    if (isNewer())
        record.set("version", 4)
            .set("repeated RSRP", rawNumber(LTELayouts::connectedModeFields4[3], rsrp))
            .set("repeated RSRQ",
                 rawNumber(LTELayouts::connectedModeFields4[4], _drive.rsrq(serving, rsrp)));
    record.set("E-ARFCN", serving.downlinkEarfcn)
        .set("Serving Physical Cell ID", serving.physicalCellId)
        .set("Subframe Number", static_cast<std::int64_t>(step() * 50 % 10240))
        .level("Serving Filtered RSRP", rsrp)
        .level("Serving Filtered RSRQ", _drive.rsrq(serving, rsrp));

    // What is much weaker than the serving cell is noticed, but not measured.
    auto neighbours = neighborsOfServingCell();
    const auto firstWeak =
        std::stable_partition(neighbours.begin(), neighbours.end(), [&](const LTECell* cell) {
            return _drive.averageRsrp(*cell) > rsrp - measurableMargin;
        });
    const List& measured =
        isNewer() ? LTELayouts::measuredNeighbors4 : LTERecords::measuredNeighbors;
    for (const LTECell* cell : std::span(neighbours.begin(), firstWeak)) {
        const double level = _drive.averageRsrp(*cell);
        record.add(measured)
            .set("Physical Cell ID", cell->physicalCellId)
            .level("Filtered RSRP", level)
            .level("Filtered RSRQ", _drive.rsrq(*cell, level));
    }
    for (const LTECell* cell : std::span(firstWeak, neighbours.end()))
        record.add(isNewer() ? LTELayouts::detectedCells4 : LTERecords::detectedCells)
            .set("Physical Cell ID", cell->physicalCellId);
    report(record);
    if (isExtended())
        reportNeighborSignal(LTESignalRecords::connectedNeighbors, 30, 4);
}

std::vector<const LTECell*> LTEScenario::neighborsOfServingCell() const
{
    const LTECell& serving = _drive.servingCell();
    std::vector<const LTECell*> neighbours;
    for (const LTECell& cell : LTEDrive::cells())
        if (&cell != &serving && cell.downlinkEarfcn == serving.downlinkEarfcn &&
            _drive.averageRsrp(cell) > detectableRsrp)
            neighbours.push_back(&cell);
    return neighbours;
}

void LTEScenario::reportIdleNeighbors()
{
    const auto neighbours = neighborsOfServingCell();
    if (neighbours.empty())
        return; // the record holds one cell at least
    const List& list = isNewer() ? LTELayouts::idleNeighborCells5 : LTERecords::idleNeighborCells;
    RecordWriter record(isNewer() ? LTELayouts::idleNeighbors5 : LTERecords::idleNeighbors);
    record.set("Version", isNewer() ? 5 : 2)
        .set("E-ARFCN", _drive.servingCell().downlinkEarfcn)
        .level("Qrxlevmin", qrxlevmin);
    for (const LTECell* cell : neighbours) {
        const double measured = _drive.measuredRsrp(*cell);
        const double average = _drive.averageRsrp(*cell);
        const double measuredRsrq = _drive.rsrq(*cell, measured);
        record.add(list)
            .set("Physical Cell ID", cell->physicalCellId)
            .level("Measured RSSI", _drive.rssi(*cell, measured, measuredRsrq))
            .level("Measured RSRP", measured)
            .level("Average RSRP", average)
            .level("Measured RSRQ", measuredRsrq)
            .level("Average RSRQ", _drive.rsrq(*cell, average))
            .level("Srxlev", average - qrxlevmin)
            .set("Frequency Offset", cell->physicalCellId % 40)
            .set("Ant 0 Frame Offset", static_cast<std::int64_t>(step() % 1024))
            .set("Ant 0 Sample Offset", static_cast<std::int64_t>(cell->position))
            .set("Ant 1 Frame Offset", static_cast<std::int64_t>(step() % 1024))
            .set("Ant 1 Sample Offset", static_cast<std::int64_t>(cell->position));
    }
    report(record);
    if (isExtended())
        reportNeighborSignal(LTESignalRecords::idleNeighbors, 26, 4);
}

// One candidate: they lie 4 bytes apart, so only the last one's technology part is its own.
void LTEScenario::reportReselectionCandidates()
{
    const LTECell& serving = _drive.servingCell();
    const auto cells = LTEDrive::cells();
    const auto candidate = std::ranges::max_element(cells, {}, [&](const LTECell& cell) {
        return &cell == &serving ? -999.0 : _drive.averageRsrp(cell);
    });
    RecordWriter record(LTERecords::reselection);
    record.set("Version", 1)
        .set("Serving EARFCN", serving.downlinkEarfcn)
        .set("Serving Cell ID", serving.physicalCellId);
    const FieldWriter writer = record.add(LTERecords::candidates);
    writer.set("Candidate Priority", candidate->layerPriority).set("Candidate RAT Type", 0);
    writer.with(LTERecords::lteCandidateFields)
        .set("E ARFCN", candidate->downlinkEarfcn)
        .set("Cell ID", candidate->physicalCellId);
    report(record);
}

// ---- Records that have no base layout

// A frame takes 10 ms; its number has 10 bits.
std::int64_t LTEScenario::frame() const
{
    constexpr std::uint64_t framesOfStep = 5;
    constexpr std::uint64_t frames = 1024;
    return static_cast<std::int64_t>(step() * framesOfStep % frames);
}

void LTEScenario::reportConnection()
{
    constexpr std::uint8_t registered = 3;
    constexpr std::uint8_t requesting = 5;
    // As version 20 numbers them.
    constexpr std::uint8_t requestChannel = 8;
    constexpr std::uint8_t dedicatedDownlinkChannel = 7;
    if (_drive.isConnected()) {
        reportRegistration(requesting);
        reportMessage(0, requestChannel, 6);
    } else {
        reportMessage(1, dedicatedDownlinkChannel, 2);
    }
    reportRegistration(registered);
}

// 262, 07; the low nibble of a byte comes first.
void LTEScenario::reportRegistration(std::uint8_t state)
{
    constexpr std::int64_t network = 0x70F262;
    report(RecordWriter(LTEStateRecords::emm)
               .set("version", 2)
               .set("EMM State", state)
               .set("sub-state", 0)
               .set("network", network)
               .set("has identity", 1)
               .set("kind of identity", 6)
               .set("GUTI Mobile Country Code", network & 0xFFF)
               .set("GUTI Mobile Network Code", network >> 12)
               .set("MME Group ID", 32769)
               .set("MME Code", 17));
}

void LTEScenario::reportMessage(std::uint8_t bearer, std::uint8_t channel, std::uint16_t length)
{
    const LTECell& cell = _drive.servingCell();
    RecordWriter record(LTEStateRecords::message14);
    record.set("version", 20)
        .set("Radio Bearer", bearer)
        .set("Physical Cell ID", cell.physicalCellId)
        .set("E-ARFCN", cell.downlinkEarfcn)
        .set("System Frame Number", frame())
        .set("Subframe Number", 5)
        .set("Channel", channel)
        .set("Length", length)
        .size(LTEStateRecords::message14.minimumSize + length);
    report(record);
}

// The second of two antennas receives a little less.
void LTEScenario::reportServingCellSignal()
{
    constexpr std::uint8_t version = 36;
    constexpr std::size_t slots = 4;
    constexpr double secondAntenna = -2; // dB
    constexpr double noiseRatio = 12;    // dB above the quality
    const auto& known = *std::ranges::find(LTESignalRecords::signalVersions, version,
                                           &LTESignalRecords::SignalVersion::version);
    const LTESignalRecords::SignalFields& fields = LTESignalRecords::signalFieldsOf(known);
    const std::size_t cellStart = Subpackets::headSize + known.headerSize;

    RecordWriter record(LTESignalRecords::servingCellSignal);
    const Subpacket kind{*LTESignalRecords::servingCellSignal.subpacket, fields.header()};
    const FieldWriter subpacket = record.add(kind, cellStart + slots * known.stride);
    const LTECell& cell = _drive.servingCell();
    subpacket.set("subpacket version", version)
        .set("E-ARFCN", cell.downlinkEarfcn)
        .set("cells", 1)
        .set("antennas", 0b11);
    const double rsrp = _drive.measuredRsrp(cell);
    const double rsrq = _drive.rsrq(cell, rsrp);
    const double rssi = _drive.rssi(cell, rsrp, rsrq);
    subpacket.at(cellStart, fields.cell())
        .set("Physical Cell ID", cell.physicalCellId)
        .set("System Frame Number", frame())
        .set("Subframe Number", 0)
        .level("Filtered RSRP", _drive.averageRsrp(cell))
        .level("Filtered RSRQ", _drive.rsrq(cell, _drive.averageRsrp(cell)))
        .level("RSRP", rsrp)
        .level("RSRQ", rsrq)
        .level("RSSI", rssi);
    subpacket.at(cellStart, std::span(&fields.serving, 1)).set("Serving", 1);
    subpacket.at(cellStart, fields.antenna(0))
        .level("RSRP Rx 0", rsrp)
        .level("RSRQ Rx 0", rsrq)
        .level("RSSI Rx 0", rssi)
        .level("SNR Rx 0", rsrq + noiseRatio);
    subpacket.at(cellStart, fields.antenna(1))
        .level("RSRP Rx 1", rsrp + secondAntenna)
        .level("RSRQ Rx 1", rsrq)
        .level("RSSI Rx 1", rssi + secondAntenna)
        .level("SNR Rx 1", rsrq + noiseRatio);
    report(record);
}

// A request that tells nothing more, and its response.
void LTEScenario::reportNeighborSignal(const Record& kind, std::uint8_t request,
                                       std::uint8_t version)
{
    constexpr std::size_t requestSize = 28;
    constexpr double secondAntenna = -1; // dB
    const auto neighbors = neighborsOfServingCell();
    const List& list = LTESignalRecords::wideNeighbors;
    RecordWriter record(kind);
    record.add(Subpacket{request}, requestSize);
    const FieldWriter response =
        record.add(Subpacket{*kind.subpacket, LTESignalRecords::wideNeighborHeader},
                   list.offset + list.stride * neighbors.size());
    response.set("subpacket version", version)
        .set("E-ARFCN", _drive.servingCell().downlinkEarfcn)
        .set("cells", static_cast<std::int64_t>(neighbors.size()));
    for (std::size_t i = 0; i < neighbors.size(); ++i) {
        const double rsrp = _drive.measuredRsrp(*neighbors[i]);
        const double rsrq = _drive.rsrq(*neighbors[i], rsrp);
        const double rssi = _drive.rssi(*neighbors[i], rsrp, rsrq);
        response.at(list.offset + list.stride * i, list.fields)
            .set("Physical Cell ID", neighbors[i]->physicalCellId)
            .level("Measured RSRP", rsrp)
            .level("Measured RSRQ", rsrq)
            .level("Measured RSSI", rssi)
            .level("RSRP Rx 0", rsrp)
            .level("RSRP Rx 1", rsrp + secondAntenna)
            .level("RSRQ Rx 0", rsrq)
            .level("RSRQ Rx 1", rsrq)
            .level("RSSI Rx 0", rssi)
            .level("RSSI Rx 1", rssi + secondAntenna);
    }
    report(record);
}

void LTEScenario::reportCellMonitor()
{
    PlistArray cells;
    for (const LTECell& cell : LTEDrive::cells()) {
        const bool isServing = &cell == &_drive.servingCell();
        if (!isServing && _drive.averageRsrp(cell) < detectableRsrp)
            continue;
        PlistDictionary entry = cellEntry(kQXCellMonitorRadioAccessTechnologyLTE, isServing);
        entry.set(kQXCellMonitorTAC, cell.trackingAreaCode);
        entry.set(kQXCellMonitorCellId, cell.cellIdentity);
        entry.set(kQXCellMonitorPID, cell.physicalCellId);
        entry.set(kQXCellMonitorBandInfo, cell.band);
        entry.set(kQXCellMonitorUARFCN, cell.downlinkEarfcn);
        cells.append(entry);
    }
    reportPropertyList(SharedRecords::cellMonitor.logCode, cells);
}

} // namespace ventrik
