#include "LogGenerator/Orbel/UTRAN/UTRANNeighbhorMeasurements.h"

#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t neighborsLogCode = 0xD00A;

constexpr std::array<std::string_view, 3> statusLabels{"ASET", "MSET", "DSET"};

// Neighbour cell, 16 bytes, of which 4 are read; bit fields of little-endian words
//   0 14 bits UARFCN | 1.6 7 bits cell parameter identity | 2.5 8 bits filtered RSCP
//   3.5 2 bits status | 3.7 1 bit in the joint detection cell set
PlistDictionary row(const LogPacket& cell)
{
    PlistDictionary row{{"UARFCN", decimal(cell.u16(0) & 0x3FFF)},
                        {"Cell ID", decimal(cell.u16(1) >> 6 & 0x7F)},
                        {"Filter RSCP", sixDecimals((cell.u16(2) >> 5 & 0xFF) / 256.0)}};
    const std::size_t status = cell.u8(3) >> 5 & 3U;
    if (status < statusLabels.size())
        row.set("Status", statusLabels[status]);
    row.set("inJDCS", cell.u8(3) >> 7 ? "TRUE" : "FALSE");
    return row;
}

} // namespace

std::string_view UTRANNeighbhorMeasurements::getSectionName() const
{
    return "Neighbor Cell List";
}

std::vector<std::uint32_t> UTRANNeighbhorMeasurements::getLogCodeArray() const
{
    return {neighborsLogCode};
}

// Neighbour measurements, 0xD00A, at least 21 bytes
//   16.1 7 bits number of cells | 168 elements of 16 bytes
void UTRANNeighbhorMeasurements::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("NeighbhorMeasurements List");
    if (logCode != neighborsLogCode || packet.size() < 21)
        return;
    clearRows();

    const RecordElements cells{168, 16, std::size_t{packet.u8(16)} >> 1, 4};
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        rows.append(row(cells.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
