#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"

#include "Packets/LTERecords.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

namespace
{

constexpr std::array<std::string_view, 1> technologies{kQXCellMonitorRadioAccessTechnologyLTE};
constexpr std::array<CellField, 5> cellFields{{
    {kQXCellMonitorTAC, {"Tracking Area Code", cellNumberPlace}, "TAC"},
    {kQXCellMonitorCellId, {"Cell Identity", cellNumberPlace}, "Cell ID"},
    {kQXCellMonitorPID, {"Physical Cell ID", cellNumberPlace}, "Physical Cell ID"},
    {kQXCellMonitorBandInfo, {"Freq Band Indicator", cellNumberPlace}, "Freq Band Indicator"},
    {kQXCellMonitorUARFCN, {"UARFCN", cellNumberPlace}, "UARFCN"},
}};
constexpr MonitoredCells cells{MonitoredCells::Kind::Serving, technologies, cellFields,
                               "Serving Cell Info"};

constexpr SectionTable table{
    .name = "Serving Cell Info",
    .trace = "LTE Serving Cell Info",
    .records = {{
        // Only the cell monitor tells the UARFCN; a real record supersedes that.
        {.record = &LTERecords::cellInfo,
         .fields = LTERecords::cellInfoFields,
         .superseded = "UARFCN"},
        {.record = &LTERecords::antennaCount, .fields = LTERecords::antennaCountFields},
        {.record = &SharedRecords::cellMonitor, .cells = &cells},
    }},
};

} // namespace

LTEServingCellInfo::LTEServingCellInfo(SystemLog& log) : Base(log, table) {}

void LTEServingCellInfo::decode(const ShownRecord& shown, const LogPacket& packet)
{
    Base::decode(shown, packet);
    // This path has always reported its own record as unknown; readers of the log expect the line.
    if (shown.record == &LTERecords::antennaCount)
        logUnknownMessage(shown.record->logCode);
}

} // namespace ventrik
