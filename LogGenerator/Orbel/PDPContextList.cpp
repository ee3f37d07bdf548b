#include "LogGenerator/Orbel/PDPContextList.h"

#include "LogGenerator/Orbel/UnparsableDataException.h"
#include "Packets/SharedRecords.h"

namespace ventrik
{

namespace
{

// PDP data is parsed whatever the code that it came with.
constexpr SectionTable table{
    .name = "PDP Context Info",
    .trace = "PDPContextList",
    .records = {{{.record = &SharedRecords::pdpContexts}}},
    .unknownCode = UnknownCode::Ignored,
};

} // namespace

PDPContextList::PDPContextList(SystemLog& log) : Base(log, table) {}

void PDPContextList::decode(const ShownRecord&, const LogPacket& packet)
{
    const PropertyListReading& reading = packet.propertyList();
    if (!reading) {
        log().error("PDP context data could not be constructed");
        throw UnparsableDataException();
    }
    auto list = sectionRef.array();
    if (list && reading.value->array())
        replaceArray(*list, *reading.value->array());
}

} // namespace ventrik
