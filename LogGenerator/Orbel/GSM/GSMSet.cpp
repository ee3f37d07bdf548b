#include "LogGenerator/Orbel/GSM/GSMSet.h"

#include "LogGenerator/Orbel/GSM/RankedCellsRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

// Ranked GSM cell, 7 bytes
//   0 u16 ARFCN | 2 u16 BSIC | 4 i8 RSSI | 5 i16 ranking value
PlistDictionary row(const LogPacket& cell)
{
    return {{"ARFCN", decimal(cell.u16(0))},
            {"BSIC", decimal(cell.u16(2))},
            {"RSSI", wholeDbm(cell.i8(4))},
            {"Ranking Value", decimal(cell.i16(5))}};
}

} // namespace

std::string_view GSMSet::getSectionName() const
{
    return "GSM Set";
}

std::vector<std::uint32_t> GSMSet::getLogCodeArray() const
{
    return {RankedCellsRecord::logCode};
}

void GSMSet::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("GSMSet");
    if (logCode != RankedCellsRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < RankedCellsRecord::minimumSize)
        return;
    clearRows();

    const RecordElements cells = RankedCellsRecord::gsmCells(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(row(cells.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
