#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t cellInfoLogCode = 0xB0C2;
constexpr std::uint32_t antennaCountLogCode = 0xB0C1;

// By the number of resource blocks.
std::string bandwidthLabel(std::uint8_t resourceBlocks)
{
    switch (resourceBlocks) {
    case 6:
        return "1.4 MHz";
    case 15:
        return "3 MHz";
    case 25:
        return "5 MHz";
    case 50:
        return "10 MHz";
    case 75:
        return "15 MHz";
    case 100:
        return "20 MHz";
    default:
        return "Unknown";
    }
}

constexpr std::array<CellField, 5> cellFields{{
    {kQXCellMonitorTAC, "Tracking Area Code", "TAC"},
    {kQXCellMonitorCellId, "Cell Identity", "Cell ID"},
    {kQXCellMonitorPID, "Physical Cell ID", "Physical Cell ID"},
    {kQXCellMonitorBandInfo, "Freq Band Indicator", "Freq Band Indicator"},
    {kQXCellMonitorUARFCN, "UARFCN", "UARFCN"},
}};

} // namespace

std::string_view LTEServingCellInfo::getSectionName() const
{
    return "Serving Cell Info";
}

std::vector<std::uint32_t> LTEServingCellInfo::getLogCodeArray() const
{
    return {cellInfoLogCode, antennaCountLogCode, cellMonitorLogCode};
}

void LTEServingCellInfo::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("LTE Serving Cell Info");
    switch (logCode) {
    case cellInfoLogCode:
        return updateFromCellInfo(packet);
    case antennaCountLogCode:
        return updateFromAntennaCount(packet, logCode);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// Cell info, 0xB0C2, at least 38 bytes
//   14 u16 physical cell identity | 16 u16 downlink EARFCN | 18 u16 uplink EARFCN
//   20 u8 downlink bandwidth | 21 u8 uplink bandwidth (resource blocks)
//   22 u32 cell identity | 26 u16 tracking area code | 28 u32 frequency band indicator
void LTEServingCellInfo::updateFromCellInfo(const LogPacket& packet)
{
    if (packet.size() < 38)
        return;
    show("Physical Cell ID", decimal(packet.u16(14)));
    show("Download Frequency", decimal(packet.u16(16)));
    show("Upload Frequency", decimal(packet.u16(18)));
    withdraw("UARFCN"); // only the cell monitor tells it; a real record supersedes that
    show("Download Bandwidth", bandwidthLabel(packet.u8(20)));
    show("Upload Bandwidth", bandwidthLabel(packet.u8(21)));
    show("Cell Identity", decimal(packet.i32(22)));
    show("Tracking Area Code", decimal(packet.u16(26)));
    show("Freq Band Indicator", decimal(packet.i32(28)));
}

// Antenna count, 0xB0C1, at least 22 bytes
//   20 u8 number of transmit antennas
void LTEServingCellInfo::updateFromAntennaCount(const LogPacket& packet, std::uint32_t logCode)
{
    if (packet.size() < 22)
        return;
    show("Num Tx Antennas", decimal(packet.u8(20)));
    // This path has always reported its own record as unknown; readers of the log expect the line.
    logUnknownMessage(logCode);
}

void LTEServingCellInfo::updateFromCellMonitor(const LogPacket& packet)
{
    const auto cells = getCellArray(packet);
    if (!cells)
        return;
    if (const auto* serving = servingCell(*cells, {kQXCellMonitorRadioAccessTechnologyLTE}))
        showCellFields(*serving, cellFields, "Serving Cell Info");
}

} // namespace ventrik
