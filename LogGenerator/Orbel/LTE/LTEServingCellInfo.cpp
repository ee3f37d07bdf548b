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
    const Record& record = *shown.record;
    if (!isOfOtherCell(record, packet))
        Base::decode(shown, packet);
    if (record.logCode == LTERecords::cellInfo.logCode)
        _servingCell = {numberOf(packet, *record.find("Physical Cell ID")),
                        numberOf(packet, *record.find("Download Frequency"))};
    // This path has always reported its own record as unknown; readers of the log expect the line.
    if (record.logCode == LTERecords::antennaCount.logCode)
        logUnknownMessage(record.logCode);
}

// The antenna count also comes of cells that are only scanned; its newer layouts tell of which.
bool LTEServingCellInfo::isOfOtherCell(const Record& record, const LogPacket& packet) const
{
    const Field* identity = record.find("physical cell identity");
    const Field* earfcn = record.find("frequency");
    return _servingCell && identity && earfcn &&
           *_servingCell != Cell{numberOf(packet, *identity), numberOf(packet, *earfcn)};
}

} // namespace ventrik
