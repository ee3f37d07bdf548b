#include "LogGenerator/Orbel/LTE/NeighborSignal.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace LTESignalRecords;

constexpr SectionTable neighborMeasurementMisc{
    .name = "Neighbor Measurements",
    .records = {{
        {&LTERecords::idleNeighbors, LTERecords::idleNeighborFields},
        {.record = &LTESignalRecords::idleNeighbors},
    }},
};
constexpr SectionTable connectedNeighborsMisc{
    .name = "Connected Neighbors",
    .records = {{{.record = &connectedNeighbors}}},
};
constexpr SectionTable connectedNeighborCells{
    .name = "Connected Neighbor Cells",
    .records = {{{.record = &connectedNeighbors}}},
};

} // namespace

std::vector<NeighborResponse> neighborResponses(const Record& record, const LogPacket& packet)
{
    const std::span<const NeighborLayout> layouts =
        record.logCode == connectedNeighbors.logCode
            ? std::span<const NeighborLayout>(connectedLayouts)
            : idleLayouts;
    std::vector<NeighborResponse> responses;
    for (const PlacedSubpacket& subpacket : subpacketsOf(packet, *record.subpacket)) {
        const auto layout = std::ranges::find(layouts, subpacket.version, &NeighborLayout::version);
        if (layout != layouts.end())
            responses.push_back({subpacket, &*layout});
    }
    return responses;
}

void showNeighborSignal(RowList::Rewrite rows, const Record& record, std::span<const Field> fields,
                        const LogPacket& packet)
{
    for (const auto& [subpacket, layout] : neighborResponses(record, packet)) {
        const RecordElements cells = layout->cells->elementsOf(subpacket.bytes);
        for (std::size_t i = 0; i < cells.completeIn(subpacket.bytes); ++i) {
            rows.nextRow(subpacket.start + cells.offset + cells.stride * i);
            rows.show(fields, cells.element(subpacket.bytes, i));
        }
    }
}

// Several responses are of one carrier, or the last one's remains.
void NeighborSignalMisc::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (!shown.record->subpacket)
        return Base::decode(shown, packet);
    for (const auto& [subpacket, layout] : neighborResponses(*shown.record, packet)) {
        const Field& earfcn = layout->header.front();
        if (subpacket.bytes.size() >= layout->cells->offset)
            show(earfcn, numberOf(subpacket.bytes, earfcn), subpacket.start);
    }
}

NeighborMeasurementMisc::NeighborMeasurementMisc(SystemLog& log)
    : NeighborSignalMisc(log, neighborMeasurementMisc)
{
}

ConnectedNeighbors::ConnectedNeighbors(SystemLog& log)
    : NeighborSignalMisc(log, connectedNeighborsMisc)
{
}

ConnectedNeighborCells::ConnectedNeighborCells(SystemLog& log) : Base(log, connectedNeighborCells)
{
}

void ConnectedNeighborCells::decode(const ShownRecord& shown, const LogPacket& packet)
{
    showNeighborSignal(rewriteRows(*shown.record), *shown.record, neighborFields, packet);
}

} // namespace ventrik
