#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"

#include "LogGenerator/Orbel/LTE/IdleNeighborRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

// Neighbour cell, 20 bytes; bit fields of little-endian words
//   0 9 bits physical cell identity | 1.1 8 bits RSSI | 2.1 9 bits RSRP | 4 9 bits average RSRP
//   5.1 7 bits RSRQ | 6 7 bits average RSRQ | 6.7 7 bits Srxlev | 8 u16 frequency offset
//   12 11 bits frame offset | 12.11 19 bits sample offset
// The levels have half-dB steps here, the serving cell's have quarters. The antenna 1 values repeat
// the antenna 0 bits: the record carries no others.
PlistDictionary row(const LogPacket& cell, SystemLog& log)
{
    const int physicalCellId = cell.u16(0) & 0x1FF;
    const double rssi = (cell.u16(1) >> 1 & 0xFF) * 0.5 - 140.0;
    const double rsrp = (cell.u16(2) >> 1 & 0x1FF) * 0.5 - 140.0;
    const double averageRsrp = (cell.u16(4) & 0x1FF) * 0.5 - 140.0;
    const double rsrq = (cell.u8(5) >> 1) * 0.25 - 30.0;
    const double averageRsrq = (cell.u8(6) & 0x7F) * 0.25 - 30.0;
    const int frameOffset = cell.u16(12) & 0x7FF;
    const auto sampleOffset = static_cast<std::int32_t>(cell.u32(12) >> 11 & 0x7FFFF);

    log.warning("Physical Cell ID: {}\n", physicalCellId);
    // One text for every level, whichever it is.
    for (const double level : {rssi, rsrp, averageRsrp, rsrq, averageRsrq})
        log.warning("Measured RSSI: {:f}\n", level);

    return {{"Physical Cell ID", decimal(physicalCellId)},
            {"Measured RSSI", dbm(rssi)},
            {"Measured RSRP", dbm(rsrp)},
            {"Average RSRP", dbm(averageRsrp)},
            {"Measured RSRQ", db(rsrq)},
            {"Average RSRQ", db(averageRsrq)},
            {"Srxlev", wholeDbm((cell.u16(6) >> 7 & 0x7F) - 30)},
            {"Frequency Offset", decimal(cell.u16(8))},
            {"Ant 0 Frame Offset", decimal(frameOffset)},
            {"Ant 0 Sample Offset", decimal(sampleOffset)},
            {"Ant 1 Frame Offset", decimal(frameOffset)},
            {"Ant 1 Sample Offset", decimal(sampleOffset)}};
}

} // namespace

std::string_view NeighborCellsList::getSectionName() const
{
    return "Neighbor Cells List";
}

std::vector<std::uint32_t> NeighborCellsList::getLogCodeArray() const
{
    return {IdleNeighborRecord::logCode};
}

void NeighborCellsList::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Neighbor Cells List");
    if (logCode != IdleNeighborRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < IdleNeighborRecord::minimumSize)
        return;
    clearRows();

    const RecordElements cells = IdleNeighborRecord::cells(packet);
    log().warning("Number of neighboring cells being reported: {}\n", cells.count);
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(row(cells.element(packet, i), log()));
    showRows(rows);
}

} // namespace ventrik
