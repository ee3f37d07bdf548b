#include "Tests/Model/ModelFixture.h"

#include "PropertyList/PropertyListWriter.h"
#include "Tests/Support/ResourceFiles.h"

namespace ventrik
{

namespace
{

std::string withoutAddresses(std::string text)
{
    for (std::size_t at = 0; (at = text.find("0x", at)) != text.npos;) {
        const std::size_t end = text.find_first_not_of("0123456789abcdef", at + 2);
        text.replace(at, end - at, "%p");
    }
    return text;
}

} // namespace

ModelFixture::ModelFixture()
{
    addFile(fake.resources, VENTRIK_RESOURCES "/LTE.plist");
    fake.ports.listen(remoteName);
    answerTechnology(kQXLogChannelTechnology_Orbel_LTE);
}

void ModelFixture::answerTechnology(const PlistValue& technology)
{
    fake.ports.setDefaultResult(
        {PortError::success, xml(PlistDictionary{{"GetTechnology", technology}})});
}

Bytes ModelFixture::xml(const PlistValue& value)
{
    return propertyListBytes(value).value();
}

void ModelFixture::arrive(const Bytes& message, std::int32_t id)
{
    EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, id, message));
    fake.mainQueue.run();
}

Bytes ModelFixture::cellInfo(std::uint16_t physicalCellId)
{
    return PacketBuilder(0xB0C2).u16(14, physicalCellId).size(38).build();
}

std::vector<std::string> ModelFixture::errors()
{
    std::vector<std::string> result;
    for (const std::string& text : fake.log.texts(LogPriority::error))
        result.push_back(withoutAddresses(text));
    return result;
}

} // namespace ventrik
