#include "Tests/Model/ModelFixture.h"

#include "PropertyList/PropertyListWriter.h"

#include <fstream>
#include <regex>

namespace ventrik
{

ModelFixture::ModelFixture()
{
    std::ifstream file(VENTRIK_RESOURCES "/LTE.plist", std::ios::binary);
    fake.resources.add("/res/LTE.plist", Bytes{std::istreambuf_iterator<char>(file), {}});
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
    const std::string text = writeXmlPropertyList(value).text.value();
    return {text.begin(), text.end()};
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
    static const std::regex address("0x[0-9a-f]+");
    std::vector<std::string> result;
    for (const std::string& text : fake.log.texts(LogPriority::error))
        result.push_back(std::regex_replace(text, address, "%p"));
    return result;
}

} // namespace ventrik
