#include "LogGenerator/Orbel/LTE/DetectedCells.h"

#include "LogGenerator/Orbel/LTE/ConnectedModeRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

std::string_view DetectedCells::getSectionName() const
{
    return "Detected Cells";
}

std::vector<std::uint32_t> DetectedCells::getLogCodeArray() const
{
    return {ConnectedModeRecord::logCode};
}

void DetectedCells::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Detected Cells");
    if (logCode != ConnectedModeRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < ConnectedModeRecord::minimumSize)
        return;
    clearRows();

    // Detected cell
    //   0 u16 physical cell identity
    const RecordElements cells = ConnectedModeRecord::detectedCells(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(
            PlistDictionary{{"Physical Cell ID", decimal(cells.element(packet, i).u16(0))}});
    showRows(rows);
}

} // namespace ventrik
