#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"

#include "Packets/LTERecords.h"

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "Neighbor Cells List",
    .records = {{{&LTERecords::idleNeighbors, {}, {{{&LTERecords::idleNeighborCells}}}}}},
};

// A cell's identity and its five levels. One text for every level, whichever it is.
void trace(const LogPacket& cell, SystemLog& log)
{
    const auto fields = std::span(LTERecords::idleNeighborCellFields).first(6);
    const auto number = [&](const Field& field) {
        return field.shown.number(numberOf(cell, field)).value_or(0);
    };
    log.warning("Physical Cell ID: {}\n", static_cast<int>(number(fields.front())));
    for (const Field& level : fields.subspan(1))
        log.warning("Measured RSSI: {:f}\n", number(level));
}

} // namespace

NeighborCellsList::NeighborCellsList(SystemLog& log) : Base(log, table) {}

void NeighborCellsList::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (log().isEnabled(LogPriority::warning)) {
        const RecordElements cells = LTERecords::idleNeighborCells.elementsOf(packet);
        log().warning("Number of neighboring cells being reported: {}\n", cells.count);
        for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
            trace(cells.element(packet, i), log());
    }
    Base::decode(shown, packet);
}

} // namespace ventrik
