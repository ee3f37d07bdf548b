#include "LogGenerator/Orbel/PDPContextList.h"

#include "LogGenerator/Orbel/UnparsableDataException.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t pdpContextsLogCode = 0xFF0002;

} // namespace

std::string_view PDPContextList::getSectionName() const
{
    return "PDP Context Info";
}

std::vector<std::uint32_t> PDPContextList::getLogCodeArray() const
{
    return {pdpContextsLogCode};
}

// PDP contexts, extra code 2
//   13 a serialised property list: an array, its elements the rows as they are
void PDPContextList::updateWithData(const LogPacket& packet, std::uint32_t)
{
    log().warning("PDPContextList");
    const PropertyListReading& reading = packet.propertyList();
    if (!reading) {
        log().error("PDP context data could not be constructed");
        throw UnparsableDataException();
    }
    if (const PlistArray* contexts = reading.value->array())
        showRows(*contexts);
}

} // namespace ventrik
