#include "LogGenerator/Orbel/GSM/UMTSRRInfo.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t stateLogCode = 0x4125;
constexpr std::uint32_t transmitPowerLogCode = 0x4031;
constexpr std::uint32_t servingCellLogCode = 0x4127;
constexpr std::uint32_t securityLogCode = 0x4157;

constexpr std::array<std::string_view, 6> stateLabels{"Disconnected", "Connecting", "CELL_FACH",
                                                      "CELL_DCH",     "CELL_PCH",   "URA_PCH"};

constexpr std::array<CellField, 3> cellFields{{
    {kQXCellMonitorCellId, "Cell ID", "Cell ID"},
    {kQXCellMonitorUARFCN, "UARFCN", "UARFCN"},
    {kQXCellMonitorSCN, "Scrambling Code", "Scrambling Code"},
}};

} // namespace

std::string_view UMTSRRInfo::getSectionName() const
{
    return "UMTS RR Info";
}

std::vector<std::uint32_t> UMTSRRInfo::getLogCodeArray() const
{
    return {stateLogCode, transmitPowerLogCode, servingCellLogCode, securityLogCode,
            cellMonitorLogCode};
}

void UMTSRRInfo::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("UMTSRRInfo");
    switch (logCode) {
    case stateLogCode:
        return updateFromState(packet);
    case transmitPowerLogCode:
        return updateFromTransmitPower(packet);
    case servingCellLogCode:
        return updateFromServingCell(packet);
    case securityLogCode:
        return updateFromSecurity(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// RRC state, 0x4125, at least 14 bytes
//   13 u8 state
void UMTSRRInfo::updateFromState(const LogPacket& packet)
{
    if (packet.size() < 14)
        return;
    show("RRC State", labelOr(stateLabels, packet.u8(13), "Unknown"));
}

// Transmit power, 0x4031, at least 16 bytes
//   14 u8 s | 16 s samples of 14 bytes: 4 i16 tenths of a dB above -121.2 dBm, 0: no sample
// Each sample counts in whole dB, truncated. Without one the mean is no number, which is shown.
void UMTSRRInfo::updateFromTransmitPower(const LogPacket& packet)
{
    if (packet.size() < 16)
        return;
    const RecordElements samples{16, 14, packet.u8(14), 6};
    double sum = 0;
    int count = 0;
    for (std::size_t i = 0; i < samples.completeIn(packet); ++i) {
        const int raw = samples.element(packet, i).i16(4);
        if (raw == 0)
            continue;
        const int power = (raw + 512) / 10 - 70;
        sum += power;
        ++count;
    }
    show("Transmit Power", dbm(sum / count));
}

// Serving cell, 0x4127, at least 29 bytes, the 32-bit numbers shown signed
//   13 u32 uplink frequency | 17 u32 downlink frequency | 21 u32 cell identity | 25 u16 URA
//   identity
void UMTSRRInfo::updateFromServingCell(const LogPacket& packet)
{
    if (packet.size() < 29)
        return;
    show("Cell ID", decimal(packet.i32(21)));
    show("Downlink Frequency", decimal(packet.i32(17)));
    show("Uplink Frequency", decimal(packet.i32(13)));
    withdraw("UARFCN"); // only the cell monitor tells it; the two frequencies supersede it
    show("URA ID", decimal(packet.u16(25)));
}

// Security, 0x4157, at least 19 bytes
//   13 u8 ciphering
void UMTSRRInfo::updateFromSecurity(const LogPacket& packet)
{
    if (packet.size() < 19)
        return;
    show("Ciphering", packet.u8(13) ? "Enabled" : "Disabled");
}

void UMTSRRInfo::updateFromCellMonitor(const LogPacket& packet)
{
    const auto cells = getCellArray(packet);
    if (!cells)
        return;
    if (const auto* serving = servingCell(*cells, {kQXCellMonitorRadioAccessTechnologyUMTS}))
        showCellFields(*serving, cellFields, "UMTSRRInfo");
}

} // namespace ventrik
