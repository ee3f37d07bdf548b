#include "LogGenerator/Orbel/LTE/MeasuredNeighborCells.h"

#include "Packets/LTERecords.h"

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "Measured Neighbor Cells",
    .records = {{{.record = &LTERecords::connectedMode}}},
};

} // namespace

MeasuredNeighborCells::MeasuredNeighborCells(SystemLog& log) : Base(log, table) {}

void MeasuredNeighborCells::decode(const ShownRecord& shown, const LogPacket& packet)
{
    const List& measured = *shown.record->lists[0];
    const RecordElements neighbors = measured.elementsOf(packet);
    const RecordElements detected = shown.record->lists[1]->elementsOf(packet);
    // The check counts in 8 bits and leaves the header out. A newer layout has been checked.
    const auto expected = static_cast<std::uint8_t>(neighbors.stride * neighbors.count);
    const auto actual = static_cast<std::uint8_t>(packet.size() - detected.stride * detected.count);
    const bool isBase = shown.record == &LTERecords::connectedMode;
    if (isBase && (neighbors.count == 0 || actual < expected)) {
        rewriteRows(*shown.record);
        log().error("Unexpected log packet bytes size: expected={} actual={}", expected, actual);
        return;
    }
    showRows(*shown.record, measured, packet);
}

} // namespace ventrik
