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
    const RecordElements neighbors = LTERecords::measuredNeighbors.elementsOf(packet);
    const RecordElements detected = LTERecords::detectedCells.elementsOf(packet);
    // The check counts in 8 bits and leaves the header out.
    const auto expected = static_cast<std::uint8_t>(neighbors.stride * neighbors.count);
    const auto actual = static_cast<std::uint8_t>(packet.size() - detected.stride * detected.count);
    if (neighbors.count == 0 || actual < expected) {
        rewriteRows(*shown.record);
        log().error("Unexpected log packet bytes size: expected={} actual={}", expected, actual);
        return;
    }
    showRows(*shown.record, LTERecords::measuredNeighbors, packet);
}

} // namespace ventrik
