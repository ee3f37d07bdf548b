#include "LogGenerator/Orbel/LTE/ReselectionCandidatesMisc.h"

#include "LogGenerator/Orbel/LTE/ReselectionRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

std::string_view ReselectionCandidatesMisc::getSectionName() const
{
    return "Reselection Candidates";
}

std::vector<std::uint32_t> ReselectionCandidatesMisc::getLogCodeArray() const
{
    return {ReselectionRecord::logCode};
}

void ReselectionCandidatesMisc::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Reselection Candidates");
    if (logCode != ReselectionRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < ReselectionRecord::minimumSize)
        return;
    show("Version", decimal(packet.u8(13)));
    show("Serving EARFCN", decimal(packet.u16(15)));
    show("Serving Cell ID", decimal(packet.u16(17)));
}

} // namespace ventrik
