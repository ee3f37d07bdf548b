#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

std::vector<std::uint32_t> PlaceholderSection::getLogCodeArray() const
{
    return {};
}

void PlaceholderSection::updateWithData(const LogPacket&, std::uint32_t)
{
    log().warning("{}", _tag);
}

} // namespace ventrik
