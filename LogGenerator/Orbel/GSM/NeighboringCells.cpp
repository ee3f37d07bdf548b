#include "LogGenerator/Orbel/GSM/NeighboringCells.h"

#include "Packets/GSMRecords.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

namespace
{

// The monitor counts in steps of 2 dB.
constexpr std::array<std::string_view, 1> technologies{kQXCellMonitorRadioAccessTechnologyGSM};
constexpr std::array<CellField, 2> neighborFields{{
    {kQXCellMonitorARFCN, {"ARFCN", cellNumberPlace}, "ARFCN"},
    {kQXCellMonitorRSSI, {"RSSI", cellLevelPlace, marked(wholeDbm(2), notMeasured)}, "RSSI"},
}};
constexpr MonitoredCells neighbors{MonitoredCells::Kind::Neighbors, technologies, neighborFields,
                                   "NeighboringCells"};

constexpr SectionTable table{
    .name = "Neighboring Cells",
    .trace = "NeighboringCells",
    .records = {{
        {.record = &GSMRecords::idleMeasurements},
        {.record = &GSMRecords::bsicList},
        {.record = &SharedRecords::cellMonitor, .cells = &neighbors},
    }},
};

constexpr const Field& arfcn = GSMRecords::idleNeighborFields[0];
constexpr const Field& listedARFCN = GSMRecords::bsicFields[0];
constexpr const Field& bsic = GSMRecords::bsicFields[1];

} // namespace

NeighboringCells::NeighboringCells(SystemLog& log) : Base(log, table) {}

void NeighboringCells::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (shown.record == &GSMRecords::idleMeasurements)
        updateFromIdleMeasurements(packet);
    else if (shown.record == &GSMRecords::bsicList)
        updateFromBSICList(packet);
    else
        Base::decode(shown, packet);
}

void NeighboringCells::updateFromIdleMeasurements(const LogPacket& packet)
{
    const RecordElements cells = GSMRecords::idleNeighbors.elementsOf(packet);
    RowList::Rewrite rows = rewriteRows(GSMRecords::idleMeasurements);
    for (std::size_t i = 0; i < cells.completeIn(packet); ++i) {
        const LogPacket cell = cells.element(packet, i);
        rows.nextRow(cells.offset + cells.stride * i);
        rows.show(GSMRecords::idleNeighborFields, cell);
        const auto known = arfcnToBsic.find(numberOf(cell, arfcn));
        if (known != arfcnToBsic.end())
            rows.showWorkedOut(bsic, known->second);
    }
}

// The rows that are there stay as they are; the next measurements show it.
void NeighboringCells::updateFromBSICList(const LogPacket& packet)
{
    const RecordElements pairs = GSMRecords::bsics.elementsOf(packet);
    arfcnToBsic.clear();
    for (std::size_t i = 0; i < pairs.completeIn(packet); ++i) {
        const LogPacket pair = pairs.element(packet, i);
        arfcnToBsic[numberOf(pair, listedARFCN)] = numberOf(pair, bsic);
    }
}

} // namespace ventrik
