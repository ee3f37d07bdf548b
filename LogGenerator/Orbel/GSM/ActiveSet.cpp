#include "LogGenerator/Orbel/GSM/ActiveSet.h"

#include "LogGenerator/Orbel/GSM/UMTSCellListRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

// Cell, 15 bytes; bit fields of little-endian words
//   7 13 bits primary scrambling code | 8.5 3 bits set type, 0: active set
bool isActive(const LogPacket& cell)
{
    return cell.u8(8) >> 5 == 0;
}

// Energies, 44 bytes: the first that is not 0 counts
//   32 u32 first Ec/Io | 36 u32 second | 40 u32 third
std::uint32_t energyOf(const LogPacket& energies)
{
    for (const std::size_t offset : {32U, 36U})
        if (const std::uint32_t energy = energies.u32(offset))
            return energy;
    return energies.u32(40);
}

// The level is a code power; its unit is shown as dB all the same.
PlistDictionary row(const LogPacket& cell, int receiveAgc, int ecno)
{
    return {{"Scrambling Code", decimal(cell.u16(7) & 0x1FFF)},
            {"RSCP", wholeDb((receiveAgc + 512) / 10 - 106 + ecno)},
            {"Energy Per Chip", wholeDb(ecno)}};
}

} // namespace

std::string_view ActiveSet::getSectionName() const
{
    return "Active Set";
}

std::vector<std::uint32_t> ActiveSet::getLogCodeArray() const
{
    return {UMTSCellListRecord::logCode};
}

void ActiveSet::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("ActiveSet");
    if (logCode != UMTSCellListRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < UMTSCellListRecord::minimumSize)
        return;
    clearRows();

    const RecordElements cells = UMTSCellListRecord::cells(packet);
    const RecordElements energies = UMTSCellListRecord::energies(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i) {
        const LogPacket cell = cells.element(packet, i);
        if (!isActive(cell))
            continue;
        if (i >= energies.completeIn(packet))
            break; // its energies are cut
        const std::uint32_t energy = energyOf(energies.element(packet, i));
        rows.append(row(cell, packet.i16(13), lookUpECNO(energy)));
    }
    showRows(rows);
}

} // namespace ventrik
