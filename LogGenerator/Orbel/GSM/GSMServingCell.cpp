#include "LogGenerator/Orbel/GSM/GSMServingCell.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/GSM/IdleMeasurementsRecord.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t identityLogCode = 0x5134;
constexpr std::uint32_t dedicatedChannelLogCode = 0x5076;

constexpr std::array<CellField, 2> cellFields{{
    {kQXCellMonitorCellId, "Cell ID", "Cell ID"},
    {kQXCellMonitorARFCN, "ARFCN", "ARFCN"},
}};

} // namespace

std::string_view GSMServingCell::getSectionName() const
{
    return "GSM Serving Cell";
}

std::vector<std::uint32_t> GSMServingCell::getLogCodeArray() const
{
    return {identityLogCode, IdleMeasurementsRecord::logCode, dedicatedChannelLogCode,
            cellMonitorLogCode};
}

void GSMServingCell::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("GSMServingCell");
    switch (logCode) {
    case identityLogCode:
        return updateFromIdentity(packet);
    case IdleMeasurementsRecord::logCode:
        return updateFromIdleMeasurements(packet);
    case dedicatedChannelLogCode:
        return updateFromDedicatedChannel(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// Serving cell identity, 0x5134, at least 26 bytes
//   13 u16 ARFCN | 15 u16 BSIC | 17 u16 cell identity
void GSMServingCell::updateFromIdentity(const LogPacket& packet)
{
    if (packet.size() < 26)
        return;
    show("Cell ID", decimal(packet.u16(17)));
    show("ARFCN", decimal(packet.u16(13)));
    show("BSIC", decimal(packet.u16(15)));
}

void GSMServingCell::updateFromIdleMeasurements(const LogPacket& packet)
{
    if (packet.size() < IdleMeasurementsRecord::minimumSize)
        return;
    show("RSSI", wholeDbm(packet.u8(15))); // without its sign, as the record carries it
    show("C1 Value", decimal(packet.u16(16)));
    show("C2 Value", decimal(packet.u16(20)));
}

// Dedicated channel, 0x5076, at least 17 bytes
//   13 u16 ARFCN of the mobile allocation, its low byte shown
void GSMServingCell::updateFromDedicatedChannel(const LogPacket& packet)
{
    if (packet.size() < 17)
        return;
    show("MA Dedicated ARFCN", decimal(packet.u8(13)));
}

// The monitor tells no BSIC; otherwise whichever record came last is shown.
void GSMServingCell::updateFromCellMonitor(const LogPacket& packet)
{
    const auto cells = getCellArray(packet);
    if (!cells)
        return;
    if (const auto* serving = servingCell(*cells, {kQXCellMonitorRadioAccessTechnologyGSM}))
        showCellFields(*serving, cellFields, "GSMServingCell");
}

} // namespace ventrik
