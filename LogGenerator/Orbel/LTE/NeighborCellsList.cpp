#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"

#include "LogGenerator/Orbel/LTE/NeighborSignal.h"
#include "Packets/LTERecords.h"

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "Neighbor Cells List",
    .records = {{
        {&LTERecords::idleNeighbors, {}, {{{&LTERecords::idleNeighborCells}}}},
        {.record = &LTESignalRecords::idleNeighbors},
    }},
};

// A cell's identity and its five levels, which are its first fields in every layout. One text for
// every level, whichever it is.
void trace(const LogPacket& cell, std::span<const Field> fields, SystemLog& log)
{
    const auto number = [&](const Field& field) {
        return field.shown.number(numberOf(cell, field)).value_or(0);
    };
    log.warning("Physical Cell ID: {}\n", static_cast<int>(number(fields.front())));
    for (const Field& level : fields.subspan(1))
        log.warning("Measured RSSI: {:f}\n", number(level));
}

void traceCells(const List& list, const LogPacket& packet, SystemLog& log)
{
    const RecordElements cells = list.elementsOf(packet);
    log.warning("Number of neighboring cells being reported: {}\n", cells.count);
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i)
        trace(cells.element(packet, i), list.fields.first(6), log);
}

} // namespace

NeighborCellsList::NeighborCellsList(SystemLog& log) : Base(log, table) {}

void NeighborCellsList::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (shown.record == &LTESignalRecords::idleNeighbors)
        return showNeighborSignal(rewriteRows(*shown.record), *shown.record,
                                  LTESignalRecords::combinedNeighborFields, packet);
    if (log().isEnabled(LogPriority::warning))
        traceCells(*shown.record->lists[0], packet, log());
    Base::decode(shown, packet);
}

} // namespace ventrik
