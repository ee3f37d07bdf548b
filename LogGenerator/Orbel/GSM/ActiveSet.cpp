#include "LogGenerator/Orbel/GSM/ActiveSet.h"

#include "Packets/GSMRecords.h"

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "Active Set",
    .trace = "ActiveSet",
    .records = {{{.record = &GSMRecords::cellList}}},
};

constexpr const Field& scramblingCode = GSMRecords::activeSetFields[0];
constexpr const Field& rscp = GSMRecords::activeSetFields[1];
constexpr const Field& energyPerChip = GSMRecords::activeSetFields[2];
constexpr const Field& setType = GSMRecords::listedCellFields[1];
constexpr const Field& receiveAGC = GSMRecords::cellListUnshown[0];

// The first energy that is not 0 counts.
std::uint32_t energyOf(const LogPacket& energies)
{
    for (const Field& field : GSMRecords::energyFields)
        if (const std::int64_t energy = numberOf(energies, field))
            return static_cast<std::uint32_t>(energy);
    return 0;
}

} // namespace

ActiveSet::ActiveSet(SystemLog& log) : Base(log, table) {}

void ActiveSet::decode(const ShownRecord& shown, const LogPacket& packet)
{
    constexpr std::int64_t active = 0;
    const RecordElements cells = GSMRecords::listedCells.elementsOf(packet);
    const RecordElements energies = GSMRecords::energies.elementsOf(packet);
    const int level = (static_cast<int>(numberOf(packet, receiveAGC)) + 512) / 10 - 106;
    RowList::Rewrite rows = rewriteRows(*shown.record);
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i) {
        const LogPacket cell = cells.element(packet, i);
        if (numberOf(cell, setType) != active)
            continue;
        if (i >= energies.completeIn(packet))
            break; // its energies are cut
        const int ecno = lookUpECNO(energyOf(energies.element(packet, i)));
        rows.nextRow(cells.offset + cells.stride * i);
        rows.show(scramblingCode, numberOf(cell, scramblingCode));
        rows.showWorkedOut(rscp, level + ecno);
        rows.showWorkedOut(energyPerChip, ecno);
    }
}

} // namespace ventrik
