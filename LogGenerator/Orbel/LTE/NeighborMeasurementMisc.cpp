#include "LogGenerator/Orbel/LTE/NeighborMeasurementMisc.h"

#include "LogGenerator/Orbel/LTE/IdleNeighborRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

std::string_view NeighborMeasurementMisc::getSectionName() const
{
    return "Neighbor Measurements";
}

std::vector<std::uint32_t> NeighborMeasurementMisc::getLogCodeArray() const
{
    return {IdleNeighborRecord::logCode};
}

void NeighborMeasurementMisc::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Neighbor Measurements");
    if (logCode != IdleNeighborRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < IdleNeighborRecord::minimumSize)
        return;
    show("Version", decimal(packet.u8(13)));
    show("E-ARFCN", decimal(packet.u16(17)));
    show("Qrxlevmin", wholeDbm(2 * (packet.u8(19) & 0x3F) - 140));
}

} // namespace ventrik
