#include "LogGenerator/Orbel/UTRAN/UTRANServingCellInfo.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t cellInfoLogCode = 0xD0E2;

bool isUTRANServingCell(const PlistDictionary& cell)
{
    return isCell(cell, kQXCellMonitorRadioAccessTechnologyUTRAN2, kQXCellMonitorCellTypeServing);
}

} // namespace

std::string_view UTRANServingCellInfo::getSectionName() const
{
    return "Serving Cell Info";
}

std::vector<std::uint32_t> UTRANServingCellInfo::getLogCodeArray() const
{
    return {cellInfoLogCode, cellMonitorLogCode};
}

void UTRANServingCellInfo::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Serving Cell Info");
    if (logCode == cellInfoLogCode)
        updateFromCellInfo(packet);
    else if (logCode == cellMonitorLogCode)
        updateFromCellMonitor(packet);
}

// Cell info, 0xD0E2, at least 26 bytes
//   14 u8 cell access restrictions | 15 u8 URA identity | 17 u16 uplink UARFCN
//   19 u16 downlink UARFCN | 21 u32 cell identity, shown signed | 25 bit 0 emergency calls only
void UTRANServingCellInfo::updateFromCellInfo(const LogPacket& packet)
{
    if (packet.size() < 26)
        return;
    show("Cell Access Restrictions", decimal(packet.u8(14)));
    show("Cell ID", decimal(packet.i32(21)));
    show("Downlink UARFCN", decimal(packet.u16(19)));
    show("Uplink UARFCN", decimal(packet.u16(17)));
    show("URA ID", decimal(packet.u8(15)));
    show("Allowed Access", packet.u8(25) & 1 ? "Emergency Calls Only" : "All Calls");
}

// Of several serving cells the last one's values remain.
void UTRANServingCellInfo::updateFromCellMonitor(const LogPacket& packet)
{
    const auto cells = parseCellMonitorArray(packet, log());
    if (!cells)
        return;
    for (const PlistValue& cell : *cells)
        if (cell.dictionary() && isUTRANServingCell(*cell.dictionary()))
            showCell(*cell.dictionary());
}

void UTRANServingCellInfo::showCell(const PlistDictionary& cell)
{
    showNumber(cell, kQXCellMonitorLAC, "LAC", {"Local Area Code"});
    showNumber(cell, kQXCellMonitorCellId, "Cell ID", {"Cell ID"});
    showNumber(cell, kQXCellMonitorBandInfo, "Freq Band Indicator", {"Freq Band Indicator"});
    showNumber(cell, kQXCellMonitorSCN, "Cell Scrambling Code", {"Cell Scrambling Code"});
    // The monitor tells one frequency: it serves both directions.
    showNumber(cell, kQXCellMonitorUARFCN, "UARFCN", {"Uplink UARFCN", "Downlink UARFCN"});
}

void UTRANServingCellInfo::showNumber(const PlistDictionary& cell, std::string_view cellKey,
                                      std::string_view nameInLog,
                                      std::initializer_list<std::string_view> displayKeys)
{
    const auto number = cellNumber(cell, cellKey);
    if (!number) {
        log().error("Serving Cell Info: Failed to retrieve {}\n", nameInLog);
        return;
    }
    for (const std::string_view displayKey : displayKeys)
        show(displayKey, decimal(*number));
}

} // namespace ventrik
