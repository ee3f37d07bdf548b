#include "Platform/Technology.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ResourceFiles.h"

#include <random>

namespace ventrik
{

namespace
{

PlistValue deepCopy(const PlistValue& value)
{
    if (const PlistDictionary* entries = value.dictionary()) {
        PlistDictionary copy;
        for (const auto& [key, entry] : *entries)
            copy.set(key, deepCopy(entry));
        return copy;
    }
    if (const PlistArray* elements = value.array()) {
        PlistArray copy;
        for (const PlistValue& element : *elements)
            copy.append(deepCopy(element));
        return copy;
    }
    return value;
}

// Packets of the technology's codes: some like the last of their code, some of its very bytes, some
// cut, some of anything.
class PacketSource
{
  public:
    explicit PacketSource(const LogGenerator& generator)
    {
        const PlistDictionary command = generator.getStartCommand();
        for (const char* key : {"SetOrbelLogCodes", "SetQxExtraCodes"})
            for (const PlistValue& code : *command.find(key)->array()) {
                const auto number = static_cast<std::uint32_t>(code.integer()->bits());
                _packets.push_back(key == std::string_view("SetOrbelLogCodes")
                                       ? PacketBuilder(number).size(64).build()
                                       : propertyListPacket(0xFF0000 + number, PlistArray()));
            }
    }

    const Bytes& next()
    {
        Bytes& packet = _packets[_random() % _packets.size()];
        const bool isPropertyList = packet[0] == 255;
        const auto changes = isPropertyList ? 0 : _random() % 4;
        for (std::size_t i = 0; i < changes && packet.size() > 13; ++i)
            packet[13 + _random() % (packet.size() - 13)] =
                static_cast<std::uint8_t>(_random() % 3 == 0 ? _random() : _random() % 5);
        if (!isPropertyList && _random() % 20 == 0)
            packet.resize(13 + _random() % 300);
        return packet;
    }

  private:
    std::mt19937 _random{11};
    std::vector<Bytes> _packets;
};

class RememberedNumbersTest : public GeneratorFixture,
                              public testing::WithParamInterface<const Technology*>
{
  protected:
    RememberedNumbersTest() { addTemplates(platform.resources, VENTRIK_RESOURCES); }

    std::unique_ptr<LogGenerator> makeGenerator()
    {
        return LogGenerator::generatorFromTechnology(GetParam()->identifier, services());
    }
};

} // namespace

// Sections that are bound to another container know nothing of what it shows.
TEST_P(RememberedNumbersTest, ShowWhatSectionsThatRememberNothingShow)
{
    const auto remembering = makeGenerator();
    const auto forgetting = makeGenerator();
    PlistDictionary other;
    PacketSource packets(*remembering);
    for (int i = 0; i < 3000; ++i) {
        const Bytes& packet = packets.next();
        remembering->updateState(state, packet);
        if (const PlistValue* display = other.find("Display"))
            other.set("Display", deepCopy(*display));
        forgetting->updateState(other, packet);
        ASSERT_EQ(*state.find("Display"), *other.find("Display")) << i;
    }
}

using SuccessorTest = RememberedNumbersTest;

// A generator that takes over another one's display knows nothing of what it shows.
TEST_P(SuccessorTest, ShowsWhatAGeneratorThatSawAllPacketsShows)
{
    const auto remembering = makeGenerator();
    const auto scenario = makeScenario(*GetParam(), 3);
    std::mt19937 random{5};
    PlistDictionary other;
    for (int i = 0; i < 3000; ++i) {
        Bytes packet = scenario->next()->data;
        if (packet.size() > 15 && packet.size() < 1000 && random() % 2 == 0)
            packet[15 + random() % (packet.size() - 15)] = static_cast<std::uint8_t>(random());
        remembering->updateState(state, packet);
        makeGenerator()->updateState(other, packet);
        ASSERT_EQ(*state.find("Display"), *other.find("Display")) << i;
    }
}

INSTANTIATE_TEST_SUITE_P(Technologies, SuccessorTest,
                         testing::Values(&Technologies::c2k, &Technologies::lte,
                                         &Technologies::utran),
                         [](const auto& technology) {
                             return std::string(technology.param->name);
                         });

INSTANTIATE_TEST_SUITE_P(Technologies, RememberedNumbersTest,
                         testing::Values(&Technologies::gsm, &Technologies::lte,
                                         &Technologies::utran),
                         [](const auto& technology) {
                             return std::string(technology.param->name);
                         });

} // namespace ventrik
