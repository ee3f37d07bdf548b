#include "LogGenerator/Orbel/GSM/UMTSSet.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/GSM/RankedCellsRecord.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

// Ranked UMTS cell, 10 bytes
//   0 i16 UARFCN | 2 u16 scrambling code | 4 i8 RSCP (dB above -21) | 5 i16 RSCP as ranked
//   7 i8 Ec/Io (half dB) | 8 i16 ranking value
PlistDictionary rankedRow(const LogPacket& cell)
{
    return {{"Scrambling Code", decimal(cell.u16(2))},
            {"RSCP", wholeDb(cell.i8(4) - 21)},
            {"Energy Per Chip", sixDecimalsDb(cell.i8(7) * 0.5)},
            {"Downlink Frequency", decimal(cell.i16(0))},
            {"Ranking Value", decimal(cell.i16(8))},
            {"Rank Cell RSCP", wholeDb(cell.i16(5))}};
}

std::string levelDbm(std::int32_t number)
{
    const auto level = cellLevel(number);
    return level ? wholeDbm(*level) : "";
}

std::string levelDb(std::int32_t number)
{
    const auto level = cellLevel(number);
    return level ? wholeDb(*level) : "";
}

constexpr std::array<CellRowField, 4> neighborFields{{
    {kQXCellMonitorUARFCN, "UARFCN", decimal},
    {kQXCellMonitorSCN, "Scrambling Code", decimal},
    {kQXCellMonitorRSCP, "RSCP", levelDbm},
    {kQXCellMonitorECN0, "Energy Per Chip", levelDb},
}};

} // namespace

std::string_view UMTSSet::getSectionName() const
{
    return "UMTS Set";
}

std::vector<std::uint32_t> UMTSSet::getLogCodeArray() const
{
    return {RankedCellsRecord::logCode, cellMonitorLogCode};
}

void UMTSSet::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("UMTSSet");
    switch (logCode) {
    case RankedCellsRecord::logCode:
        return updateFromRankedCells(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

void UMTSSet::updateFromRankedCells(const LogPacket& packet)
{
    if (packet.size() < RankedCellsRecord::minimumSize)
        return;
    clearRows();

    const RecordElements cells = RankedCellsRecord::umtsCells(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(rankedRow(cells.element(packet, i)));
    showRows(rows);
}

void UMTSSet::updateFromCellMonitor(const LogPacket& packet)
{
    showNeighborCells(packet, kQXCellMonitorRadioAccessTechnologyUMTS, neighborFields, "UMTSSet");
}

} // namespace ventrik
