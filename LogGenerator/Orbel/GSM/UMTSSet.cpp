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

bool isUMTSNeighbor(const PlistDictionary& cell)
{
    return cellEntryIs(cell, kQXCellMonitorCellRadioAccessTechnology,
                       kQXCellMonitorRadioAccessTechnologyUMTS) &&
           cellEntryIs(cell, kQXCellMonitorCellType, kQXCellMonitorCellTypeNeighbor);
}

// Levels are 16 bits wide; one of them says that the baseband has no value.
constexpr std::int16_t noLevel = 32767;

std::string levelDbm(std::int32_t value)
{
    const auto level = static_cast<std::int16_t>(value);
    return level == noLevel ? "" : wholeDbm(level);
}

std::string levelDb(std::int32_t value)
{
    const auto level = static_cast<std::int16_t>(value);
    return level == noLevel ? "" : wholeDb(level);
}

struct NeighborField {
    std::string_view cellKey;
    std::string_view rowKey; // also the name in the log
    std::string (*text)(std::int32_t);
};

constexpr std::array<NeighborField, 4> neighborFields{{
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
    const auto cells = parseCellMonitorArray(packet, log());
    clearRows(); // a record that holds no array empties the list
    if (!cells) {
        log().error("Failed to get Cell Array\n");
        return;
    }
    PlistArray rows;
    for (const PlistValue& cell : *cells)
        if (cell.dictionary() && isUMTSNeighbor(*cell.dictionary()))
            rows.append(neighborRow(*cell.dictionary()));
    showRows(rows);
}

PlistDictionary UMTSSet::neighborRow(const PlistDictionary& cell) const
{
    PlistDictionary row;
    for (const NeighborField& field : neighborFields) {
        if (const auto number = cellNumber(cell, field.cellKey))
            row.set(field.rowKey, field.text(*number));
        else
            log().error("UMTSSet: Failed to retrieve {}\n", field.rowKey);
    }
    return row;
}

} // namespace ventrik
