#include "LogGenerator/Orbel/UTRAN/UTRANServingCellInfo.h"

#include "Packets/SharedRecords.h"
#include "Packets/UTRANRecords.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

namespace
{

constexpr std::array<std::string_view, 1> technologies{kQXCellMonitorRadioAccessTechnologyUTRAN2};
constexpr std::array<CellField, 5> cellFields{{
    {kQXCellMonitorLAC, {"Local Area Code", cellNumberPlace}, "LAC"},
    {kQXCellMonitorCellId, {"Cell ID", cellNumberPlace}, "Cell ID"},
    {kQXCellMonitorBandInfo, {"Freq Band Indicator", cellNumberPlace}, "Freq Band Indicator"},
    {kQXCellMonitorSCN, {"Cell Scrambling Code", cellNumberPlace}, "Cell Scrambling Code"},
    {kQXCellMonitorUARFCN, {"Uplink UARFCN", cellNumberPlace}, "UARFCN"},
}};
// The monitor tells one frequency: it serves both directions.
constexpr Field downlink{"Downlink UARFCN", cellNumberPlace};

constexpr SectionTable table{
    .name = "Serving Cell Info",
    .records = {{
        {.record = &UTRANRecords::cellInfo, .fields = UTRANRecords::cellInfoFields},
        {.record = &SharedRecords::cellMonitor},
    }},
    .unknownCode = UnknownCode::Ignored,
};

} // namespace

UTRANServingCellInfo::UTRANServingCellInfo(SystemLog& log) : Base(log, table) {}

void UTRANServingCellInfo::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (shown.record != &SharedRecords::cellMonitor)
        return Base::decode(shown, packet);
    const auto cells = parseCellMonitorArray(packet, log());
    if (!cells)
        return;
    // Of several serving cells the last one's values remain.
    for (const PlistValue& cell : *cells)
        if (cell.dictionary() &&
            isCell(*cell.dictionary(), technologies, kQXCellMonitorCellTypeServing))
            showCell(*cell.dictionary());
}

void UTRANServingCellInfo::showCell(const PlistDictionary& cell)
{
    for (const CellField& field : cellFields) {
        const auto number = cellFieldNumber(cell, field, getSectionName(), log());
        if (!number)
            continue;
        show(field.field, *number);
        if (field.cellKey == kQXCellMonitorUARFCN)
            show(downlink, *number);
    }
}

} // namespace ventrik
