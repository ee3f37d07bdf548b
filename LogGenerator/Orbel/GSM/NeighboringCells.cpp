#include "LogGenerator/Orbel/GSM/NeighboringCells.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/GSM/IdleMeasurementsRecord.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t bsicListLogCode = 0x51FF;

// The monitor counts in steps of 2 dB.
std::string doubledDbm(std::int32_t number)
{
    const auto level = cellLevel(number);
    return level ? wholeDbm(2 * *level) : "";
}

constexpr std::array<CellRowField, 2> neighborFields{{
    {kQXCellMonitorARFCN, "ARFCN", decimal},
    {kQXCellMonitorRSSI, "RSSI", doubledDbm},
}};

} // namespace

std::string_view NeighboringCells::getSectionName() const
{
    return "Neighboring Cells";
}

std::vector<std::uint32_t> NeighboringCells::getLogCodeArray() const
{
    return {IdleMeasurementsRecord::logCode, bsicListLogCode, cellMonitorLogCode};
}

void NeighboringCells::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("NeighboringCells");
    switch (logCode) {
    case IdleMeasurementsRecord::logCode:
        return updateFromIdleMeasurements(packet);
    case bsicListLogCode:
        return updateFromBSICList(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

void NeighboringCells::updateFromIdleMeasurements(const LogPacket& packet)
{
    if (packet.size() < IdleMeasurementsRecord::minimumSize)
        return;
    clearRows();

    const RecordElements neighbors = IdleMeasurementsRecord::neighbors(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < neighbors.completeIn(packet); ++i)
        rows.append(row(neighbors.element(packet, i)));
    showRows(rows);
}

// Neighbour of the idle measurements, 14 bytes
//   0 u16 ARFCN | 2 u8 RSSI | 3 u32 C1, shown signed
PlistDictionary NeighboringCells::row(const LogPacket& neighbor) const
{
    const std::uint16_t arfcn = neighbor.u16(0);
    PlistDictionary row{{"ARFCN", decimal(arfcn)},
                        {"RSSI", decimal(neighbor.u8(2))},
                        {"C1 Value", decimal(neighbor.i32(3))}};
    if (const auto bsic = arfcnToBsic.find(arfcn); bsic != arfcnToBsic.end())
        row.set("BSIC", decimal(bsic->second));
    return row;
}

// BSIC list, 0x51FF, at least 15 bytes
//   14 u8 m | 15 m elements of 4 bytes: 0 u16 ARFCN | 2 u8 BSIC
// The rows that are there stay as they are; the next measurements show it.
void NeighboringCells::updateFromBSICList(const LogPacket& packet)
{
    if (packet.size() < 15)
        return;
    const RecordElements pairs{15, 4, packet.u8(14), 3};
    arfcnToBsic.clear();
    for (std::size_t i = 0; i < pairs.completeIn(packet); ++i) {
        const LogPacket pair = pairs.element(packet, i);
        arfcnToBsic[pair.u16(0)] = pair.u8(2);
    }
}

void NeighboringCells::updateFromCellMonitor(const LogPacket& packet)
{
    showNeighborCells(packet, kQXCellMonitorRadioAccessTechnologyGSM, neighborFields,
                      "NeighboringCells");
}

} // namespace ventrik
