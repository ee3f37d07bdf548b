#include "LogGenerator/Orbel/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t intraFrequencyLogCode = 0xB179;

} // namespace

std::string_view ConnectedModeMeasurementMisc::getSectionName() const
{
    return "Connected mode LTE Intra-frequency Measurement";
}

std::vector<std::uint32_t> ConnectedModeMeasurementMisc::getLogCodeArray() const
{
    return {intraFrequencyLogCode};
}

// Connected-mode intra-frequency measurement, 0xB179, at least 29 bytes
//   17 u16 E-ARFCN | 19 u16 serving physical cell identity | 21 u16 subframe number
//   23 u16 filtered RSRP (quarter dB above -140) | 25 u16 filtered RSRQ (eighth dB above -20)
void ConnectedModeMeasurementMisc::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Connected mode LTE Intra-frequency Measurement");
    if (logCode != intraFrequencyLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() < 29)
        return;
    show("E-ARFCN", decimal(packet.u16(17)));
    show("Serving Physical Cell ID", decimal(packet.u16(19)));
    show("Subframe Number", decimal(packet.u16(21)));
    show("Serving Filtered RSRP", dbm(packet.u16(23) * 0.25 - 140.0));
    show("Serving Filtered RSRQ", db(packet.u16(25) * 0.125 - 20.0));
}

} // namespace ventrik
