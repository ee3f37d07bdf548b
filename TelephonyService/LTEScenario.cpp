#include "TelephonyService/LTEScenario.h"

#include "Packets/LTERecords.h"
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
    _wasConnected = _drive.isConnected();

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
    report(RecordWriter(LTERecords::cellInfo)
               .set("version", 2)
               .set("Physical Cell ID", cell.physicalCellId)
               .set("Download Frequency", cell.downlinkEarfcn)
               .set("Upload Frequency", cell.uplinkEarfcn)
               .set("Download Bandwidth", cell.resourceBlocks)
               .set("Upload Bandwidth", cell.resourceBlocks)
               .set("Cell Identity", cell.cellIdentity)
               .set("Tracking Area Code", cell.trackingAreaCode)
               .set("Freq Band Indicator", cell.band));
}

void LTEScenario::reportAntennaCount()
{
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
    report(RecordWriter(LTERecords::servingCellMeasurement)
               .set("Version", 3)
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
               .level("S Non Intra Search", 10)
               .set("Measurement Rules Updated", average < -100 ? 1 : 0)
               .set("Measurement Rules", average < -100 ? 3 : 1));
}

void LTEScenario::reportConnectedMeasurement()
{
    const LTECell& serving = _drive.servingCell();
    const double rsrp = _drive.averageRsrp(serving);
    RecordWriter record(LTERecords::connectedMode);
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
    for (const LTECell* cell : std::span(neighbours.begin(), firstWeak)) {
        const double level = _drive.averageRsrp(*cell);
        record.add(LTERecords::measuredNeighbors)
            .set("Physical Cell ID", cell->physicalCellId)
            .level("Filtered RSRP", level)
            .level("Filtered RSRQ", _drive.rsrq(*cell, level));
    }
    for (const LTECell* cell : std::span(firstWeak, neighbours.end()))
        record.add(LTERecords::detectedCells).set("Physical Cell ID", cell->physicalCellId);
    report(record);
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
    RecordWriter record(LTERecords::idleNeighbors);
    record.set("Version", 2)
        .set("E-ARFCN", _drive.servingCell().downlinkEarfcn)
        .level("Qrxlevmin", qrxlevmin);
    for (const LTECell* cell : neighbours) {
        const double measured = _drive.measuredRsrp(*cell);
        const double average = _drive.averageRsrp(*cell);
        const double measuredRsrq = _drive.rsrq(*cell, measured);
        record.add(LTERecords::idleNeighborCells)
            .set("Physical Cell ID", cell->physicalCellId)
            .level("Measured RSSI", _drive.rssi(*cell, measured, measuredRsrq))
            .level("Measured RSRP", measured)
            .level("Average RSRP", average)
            .level("Measured RSRQ", measuredRsrq)
            .level("Average RSRQ", _drive.rsrq(*cell, average))
            .level("Srxlev", average - qrxlevmin)
            .set("Frequency Offset", cell->physicalCellId % 40)
            .set("Ant 0 Frame Offset", static_cast<std::int64_t>(step() % 1024))
            .set("Ant 0 Sample Offset", static_cast<std::int64_t>(cell->position));
    }
    report(record);
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
