#include "LogGenerator/Orbel/GSM/EmptySet.h"

#include "LogGenerator/Orbel/GSM/UMTSCellListRecord.h"

namespace ventrik
{

std::vector<std::uint32_t> EmptySet::getLogCodeArray() const
{
    return {UMTSCellListRecord::logCode};
}

void EmptySet::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("{}", _tag);
    if (logCode != UMTSCellListRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() >= UMTSCellListRecord::minimumSize)
        clearRows();
}

} // namespace ventrik
