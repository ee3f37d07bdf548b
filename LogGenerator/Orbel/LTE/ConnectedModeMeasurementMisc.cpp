#include "LogGenerator/Orbel/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/Orbel/LTE/ConnectedModeRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

std::string_view ConnectedModeMeasurementMisc::getSectionName() const
{
    return "Connected mode LTE Intra-frequency Measurement";
}

std::vector<std::uint32_t> ConnectedModeMeasurementMisc::getLogCodeArray() const
{
    return {ConnectedModeRecord::logCode};
}

// Serving cell part of the connected-mode record
//   17 u16 E-ARFCN | 19 u16 serving physical cell identity | 21 u16 subframe number
//   23 u16 filtered RSRP (quarter dB above -140) | 25 u16 filtered RSRQ (eighth dB above -20)
void ConnectedModeMeasurementMisc::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Connected mode LTE Intra-frequency Measurement");
    if (logCode != ConnectedModeRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < ConnectedModeRecord::minimumSize)
        return;
    show("E-ARFCN", decimal(packet.u16(17)));
    show("Serving Physical Cell ID", decimal(packet.u16(19)));
    show("Subframe Number", decimal(packet.u16(21)));
    show("Serving Filtered RSRP", dbm(packet.u16(23) * 0.25 - 140.0));
    show("Serving Filtered RSRQ", db(packet.u16(25) * 0.125 - 20.0));
}

} // namespace ventrik
