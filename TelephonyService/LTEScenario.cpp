#include "TelephonyService/LTEScenario.h"

#include "Platform/TelephonyConstants.h"
#include "TelephonyService/PacketBuilder.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr std::uint64_t cellMonitorSteps = 60;  // every 3 s
constexpr std::uint64_t idleNeighborSteps = 10; // every 0.5 s while idle
constexpr std::uint64_t reselectionSteps = 40;  // every 2 s while idle
constexpr int qrxlevmin = -124;                 // dBm
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
    report(PacketBuilder(0xB0C2)
               .u8(13, 2)
               .u16(14, cell.physicalCellId)
               .u16(16, cell.downlinkEarfcn)
               .u16(18, cell.uplinkEarfcn)
               .u8(20, cell.resourceBlocks)
               .u8(21, cell.resourceBlocks)
               .u32(22, cell.cellIdentity)
               .u16(26, cell.trackingAreaCode)
               .u32(28, cell.band)
               .size(38));
}

void LTEScenario::reportAntennaCount()
{
    report(PacketBuilder(0xB0C1).u8(20, _drive.servingCell().antennas).size(22));
}

void LTEScenario::reportIdleMeasurement()
{
    const LTECell& cell = _drive.servingCell();
    const double measured = _drive.measuredRsrp(cell);
    const double average = _drive.averageRsrp(cell);
    const double measuredRsrq = _drive.rsrq(cell, measured);
    const double averageRsrq = _drive.rsrq(cell, average);
    const double srxlev = average - qrxlevmin;
    report(PacketBuilder(0xB17F)
               .u8(13, 3)
               .u16(17, cell.downlinkEarfcn)
               .bits(19, 0, 9, cell.physicalCellId)
               .bits(19, 9, 4, cell.layerPriority)
               .bits(21, 0, 9, rawLevel(measured, -140, 0.25, 9))
               .bits(22, 1, 9, rawLevel(average, -140, 0.25, 9))
               .bits(23, 2, 7, rawLevel(measuredRsrq, -30, 0.25, 7))
               .bits(24, 1, 7, rawLevel(averageRsrq, -30, 0.25, 7))
               .bits(25, 0, 9, rawLevel(_drive.rssi(cell, measured, measuredRsrq), -140, 0.5, 9))
               .bits(26, 1, 6, (qrxlevmin + 140) / 2)
               .bits(26, 7, 7, 23 + 30)
               .bits(27, 6, 6, 23 + 30)
               .bits(29, 0, 7, rawLevel(srxlev, -30, 1, 7))
               .bits(29, 7, 6, srxlev < 0 ? 1 : 0)
               .bits(30, 5, 6, 62 / 2)
               .bits(31, 3, 6, 10 / 2)
               .bits(32, 1, 1, average < -100 ? 1 : 0)
               .bits(32, 2, 4, average < -100 ? 3 : 1)
               .size(33));
}

void LTEScenario::reportConnectedMeasurement()
{
    const LTECell& serving = _drive.servingCell();
    const double rsrp = _drive.averageRsrp(serving);
    PacketBuilder packet(0xB179);
    packet.u16(17, serving.downlinkEarfcn)
        .u16(19, serving.physicalCellId)
        .u16(21, static_cast<std::uint16_t>(step() * 50 % 10240))
        .u16(23, rawLevel(rsrp, -140, 0.25, 16))
        .u16(25, rawLevel(_drive.rsrq(serving, rsrp), -20, 0.125, 16));

    // What is much weaker than the serving cell is noticed, but not measured.
    auto neighbours = neighborsOfServingCell();
    const auto firstWeak =
        std::stable_partition(neighbours.begin(), neighbours.end(), [&](const LTECell* cell) {
            return _drive.averageRsrp(*cell) > rsrp - measurableMargin;
        });
    const auto measured = static_cast<std::size_t>(firstWeak - neighbours.begin());
    const std::size_t detected = neighbours.size() - measured;
    packet.u8(27, static_cast<std::uint8_t>(measured)).u8(28, static_cast<std::uint8_t>(detected));
    std::size_t offset = 29;
    for (std::size_t i = 0; i < measured; ++i, offset += 6) {
        const double level = _drive.averageRsrp(*neighbours[i]);
        packet.u16(offset, neighbours[i]->physicalCellId)
            .u16(offset + 2, rawLevel(level, -140, 0.25, 16))
            .u16(offset + 4, rawLevel(_drive.rsrq(*neighbours[i], level), -20, 0.125, 16));
    }
    for (std::size_t i = measured; i < neighbours.size(); ++i, offset += 2)
        packet.u16(offset, neighbours[i]->physicalCellId);
    report(std::move(packet));
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
    PacketBuilder packet(0xB180);
    packet.u8(13, 2)
        .u16(17, _drive.servingCell().downlinkEarfcn)
        .bits(19, 0, 6, (qrxlevmin + 140) / 2)
        .bits(19, 6, 5, static_cast<std::uint32_t>(neighbours.size() - 1));
    std::size_t offset = 21;
    for (const LTECell* cell : neighbours) {
        const double measured = _drive.measuredRsrp(*cell);
        const double average = _drive.averageRsrp(*cell);
        const double measuredRsrq = _drive.rsrq(*cell, measured);
        packet.bits(offset, 0, 9, cell->physicalCellId)
            .bits(offset + 1, 1, 8,
                  rawLevel(_drive.rssi(*cell, measured, measuredRsrq), -140, 0.5, 8))
            .bits(offset + 2, 1, 9, rawLevel(measured, -140, 0.5, 9))
            .bits(offset + 4, 0, 9, rawLevel(average, -140, 0.5, 9))
            .bits(offset + 5, 1, 7, rawLevel(measuredRsrq, -30, 0.25, 7))
            .bits(offset + 6, 0, 7, rawLevel(_drive.rsrq(*cell, average), -30, 0.25, 7))
            .bits(offset + 6, 7, 7, rawLevel(average - qrxlevmin, -30, 1, 7))
            .u16(offset + 8, static_cast<std::uint16_t>(cell->physicalCellId % 40))
            .bits(offset + 12, 0, 11, static_cast<std::uint32_t>(step() % 1024))
            .bits(offset + 12, 11, 19, static_cast<std::uint32_t>(cell->position))
            .u32(offset + 16, 0);
        offset += 20;
    }
    report(std::move(packet));
}

// One candidate: they lie 4 bytes apart, so only the last one's technology part is its own.
void LTEScenario::reportReselectionCandidates()
{
    const LTECell& serving = _drive.servingCell();
    const auto cells = LTEDrive::cells();
    const auto candidate = std::ranges::max_element(cells, {}, [&](const LTECell& cell) {
        return &cell == &serving ? -999.0 : _drive.averageRsrp(cell);
    });
    report(PacketBuilder(0xB186)
               .u8(13, 1)
               .u16(15, serving.downlinkEarfcn)
               .u16(17, serving.physicalCellId)
               .u16(19, 1)
               .u16(21, candidate->layerPriority)
               .u16(23, 0)
               .u16(25, candidate->downlinkEarfcn)
               .bits(27, 7, 9, candidate->physicalCellId)
               .size(29));
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
    reportPropertyList(0xFF0001, cells);
}

} // namespace ventrik
