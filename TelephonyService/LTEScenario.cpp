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
constexpr std::uint64_t prefixedMessageGap = 7; // some messages carry the transport prefix
constexpr int qrxlevmin = -124;                 // dBm
constexpr double detectableRsrp = -118;         // dBm
constexpr std::size_t measuredNeighbours = 2;

// A level as a record carries it: steps above a floor, in so many bits.
std::uint16_t raw(double level, double floor, double step, unsigned bits)
{
    const double top = static_cast<double>((1U << bits) - 1);
    return static_cast<std::uint16_t>(std::clamp(std::round((level - floor) / step), 0.0, top));
}

} // namespace

std::optional<TimedMessage> LTEScenario::next()
{
    while (_messages.empty())
        reportStep();
    TimedMessage message = std::move(_messages.front());
    _messages.pop_front();
    return message;
}

void LTEScenario::reportStep()
{
    const bool hasNewCell = _drive.step() || _step == 0;
    if (hasNewCell)
        reportNewCell();
    if (_drive.isConnected())
        reportConnectedMeasurement();
    else
        reportIdleMeasurement();
    if (_step % cellMonitorSteps == cellMonitorSteps - 1)
        reportCellMonitor();
    ++_step;
}

void LTEScenario::reportNewCell()
{
    reportCellInfo();
    reportAntennaCount();
    reportIdleMeasurement();
    reportConnectedMeasurement();
    reportCellMonitor();
}

void LTEScenario::report(PacketBuilder packet)
{
    const auto due = _step * LTEDrive::stepDuration;
    packet.timestamp(static_cast<std::uint64_t>(due.count()));
    if (++_messageCount % prefixedMessageGap == 0)
        packet.withPrefix();
    _messages.push_back({due, packet.build()});
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
               .bits(21, 0, 9, raw(measured, -140, 0.25, 9))
               .bits(22, 1, 9, raw(average, -140, 0.25, 9))
               .bits(23, 2, 7, raw(measuredRsrq, -30, 0.25, 7))
               .bits(24, 1, 7, raw(averageRsrq, -30, 0.25, 7))
               .bits(25, 0, 9, raw(_drive.rssi(cell, measured, measuredRsrq), -140, 0.5, 9))
               .bits(26, 1, 6, (qrxlevmin + 140) / 2)
               .bits(26, 7, 7, 23 + 30)
               .bits(27, 6, 6, 23 + 30)
               .bits(29, 0, 7, raw(srxlev, -30, 1, 7))
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
        .u16(21, static_cast<std::uint16_t>(_step * 50 % 10240))
        .u16(23, raw(rsrp, -140, 0.25, 16))
        .u16(25, raw(_drive.rsrq(serving, rsrp), -20, 0.125, 16));

    std::vector<const LTECell*> neighbours;
    for (const LTECell& cell : LTEDrive::cells())
        if (&cell != &serving && cell.downlinkEarfcn == serving.downlinkEarfcn &&
            _drive.averageRsrp(cell) > detectableRsrp)
            neighbours.push_back(&cell);
    const std::size_t measured = std::min(neighbours.size(), measuredNeighbours);
    const std::size_t detected = neighbours.size() - measured;
    packet.u8(27, static_cast<std::uint8_t>(measured)).u8(28, static_cast<std::uint8_t>(detected));
    std::size_t offset = 29;
    for (std::size_t i = 0; i < measured; ++i, offset += 6) {
        const double level = _drive.averageRsrp(*neighbours[i]);
        packet.u16(offset, neighbours[i]->physicalCellId)
            .u16(offset + 2, raw(level, -140, 0.25, 16))
            .u16(offset + 4, raw(_drive.rsrq(*neighbours[i], level), -20, 0.125, 16));
    }
    for (std::size_t i = measured; i < neighbours.size(); ++i, offset += 2)
        packet.u16(offset, neighbours[i]->physicalCellId);
    report(std::move(packet));
}

void LTEScenario::reportCellMonitor()
{
    PlistArray cells;
    for (const LTECell& cell : LTEDrive::cells()) {
        const bool isServing = &cell == &_drive.servingCell();
        if (!isServing && _drive.averageRsrp(cell) < detectableRsrp)
            continue;
        cells.append(PlistDictionary{
            {kQXCellMonitorCellRadioAccessTechnology, kQXCellMonitorRadioAccessTechnologyLTE},
            {kQXCellMonitorCellType,
             isServing ? kQXCellMonitorCellTypeServing : kQXCellMonitorCellTypeNeighbor},
            {kQXCellMonitorMCC, 262},
            {kQXCellMonitorMNC, 7},
            {kQXCellMonitorTAC, cell.trackingAreaCode},
            {kQXCellMonitorCellId, cell.cellIdentity},
            {kQXCellMonitorPID, cell.physicalCellId},
            {kQXCellMonitorBandInfo, cell.band},
            {kQXCellMonitorUARFCN, cell.downlinkEarfcn}});
    }
    constexpr std::uint32_t cellMonitorLogCode = 0xFF0001;
    _messages.push_back(
        {_step * LTEDrive::stepDuration, propertyListPacket(cellMonitorLogCode, cells)});
}

} // namespace ventrik
