#include "LogGenerator/Orbel/LTE/MeasuredNeighborCells.h"

#include "LogGenerator/Orbel/LTE/ConnectedModeRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

// Measured neighbour
//   0 u16 physical cell identity | 2 u16 filtered RSRP (quarter dB above -140)
//   4 u16 filtered RSRQ (eighth dB above -20)
PlistDictionary row(const LogPacket& cell)
{
    return {{"Physical Cell ID", decimal(cell.u16(0))},
            {"Filtered RSRP", dbm(cell.u16(2) * 0.25 - 140.0)},
            {"Filtered RSRQ", db(cell.u16(4) * 0.125 - 20.0)}};
}

} // namespace

std::string_view MeasuredNeighborCells::getSectionName() const
{
    return "Measured Neighbor Cells";
}

std::vector<std::uint32_t> MeasuredNeighborCells::getLogCodeArray() const
{
    return {ConnectedModeRecord::logCode};
}

void MeasuredNeighborCells::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Measured Neighbor Cells");
    if (logCode != ConnectedModeRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < ConnectedModeRecord::minimumSize)
        return;
    clearRows();

    const RecordElements neighbors = ConnectedModeRecord::measuredNeighbors(packet);
    const RecordElements detected = ConnectedModeRecord::detectedCells(packet);
    // The check counts in 8 bits and leaves the header out.
    const auto expected = static_cast<std::uint8_t>(neighbors.stride * neighbors.count);
    const auto actual = static_cast<std::uint8_t>(packet.size() - detected.stride * detected.count);
    if (neighbors.count == 0 || actual < expected) {
        log().error("Unexpected log packet bytes size: expected={} actual={}", expected, actual);
        return;
    }
    PlistArray rows;
    for (std::size_t i = 0; i < neighbors.completeIn(packet); ++i)
        rows.append(row(neighbors.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
