#include "LogGenerator/Orbel/UTRAN/UTRANLogGenerator.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

class UTRANLogGeneratorTest : public GeneratorFixture
{
  protected:
    void addTemplate(const std::string& path, std::string_view label)
    {
        platform.resources.add(path,
                               plistXml(fmt::format("<dict><key>{}</key><dict/></dict>", label)));
    }
    static std::vector<std::int64_t> numbers(const PlistDictionary& command, std::string_view key)
    {
        std::vector<std::int64_t> result;
        for (const PlistValue& number : *command.find(key)->array())
            result.push_back(number.integer()->signedBits());
        return result;
    }
    std::string firstLabel()
    {
        const auto generator = UTRANLogGenerator::generator(services());
        generator->updateState(state, Bytes(13, 1));
        const PlistValue* display = state.find("Display");
        return display ? keysOf(*display->dictionary()).front() : "(no display)";
    }
};

} // namespace

TEST_F(UTRANLogGeneratorTest, TakesTheFirstPathThatHoldsItsNameInAnyCase)
{
    addTemplate("/res/A.plist", "A");
    addTemplate("/res/my-utran2.plist", "first");
    addTemplate("/res/z-UTRAN.plist", "second");
    EXPECT_EQ(firstLabel(), "first");
    EXPECT_TRUE(platform.log.contains("Created UTRANLogGenerator object"));
}

TEST_F(UTRANLogGeneratorTest, SearchesTheWholePath)
{
    addTemplate("/utran/Plain.plist", "from the folder");
    EXPECT_EQ(firstLabel(), "from the folder");
}

TEST_F(UTRANLogGeneratorTest, LogsItsCreationAfterTheBaseInitialisation)
{
    addTemplate("/res/UTRAN.plist", "x");
    const auto generator = UTRANLogGenerator::generator(services());
    EXPECT_EQ(platform.log.texts().back(), "Created UTRANLogGenerator object");
}

TEST_F(UTRANLogGeneratorTest, StaysUnconfiguredWithoutATemplate)
{
    addTemplate("/res/LTE.plist", "x");
    const auto generator = UTRANLogGenerator::generator(services());
    EXPECT_TRUE(platform.log.lines().empty());
    generator->updateState(state, PacketBuilder(0xD0E0).build());
    EXPECT_TRUE(platform.log.contains("Cannot load template for display"));
    EXPECT_FALSE(generator->generateLogUsingState(state));
    EXPECT_FALSE(state.contains("DisplayState"));
    EXPECT_FALSE(state.contains("Display"));
}

TEST_F(UTRANLogGeneratorTest, UnconfiguredItAsksForNoCodes)
{
    const PlistDictionary command = UTRANLogGenerator::generator(services())->getStartCommand();
    EXPECT_EQ(textAt(command, {"SetState"}), "Streaming");
    EXPECT_TRUE(command.find("SetOrbelLogCodes")->array()->empty());
    EXPECT_TRUE(command.find("SetQxExtraCodes")->array()->empty());
}

TEST_F(UTRANLogGeneratorTest, AsksForTheCodesOfItsSections)
{
    addTemplate("/res/UTRAN.plist", "x");
    const PlistDictionary command = UTRANLogGenerator::generator(services())->getStartCommand();
    EXPECT_EQ(textAt(command, {"SetState"}), "Streaming");
    EXPECT_THAT(numbers(command, "SetOrbelLogCodes"),
                testing::UnorderedElementsAre(53472, 53474, 53258, 53262, 53260));
    EXPECT_THAT(numbers(command, "SetQxExtraCodes"), testing::UnorderedElementsAre(0, 1, 2));
    EXPECT_EQ(command.size(), 3U);
}

TEST_F(UTRANLogGeneratorTest, TheTransportChannelSectionsSeeAPacketInTheirOrder)
{
    addTemplate("/res/UTRAN.plist", "TRCH BLER");
    const auto generator = UTRANLogGenerator::generator(services());
    generator->updateState(state, Bytes(13, 1));
    platform.log.clear();
    generator->updateState(state, PacketBuilder(0xD00C).size(17).withPrefix().build());
    EXPECT_THAT(platform.log.texts(),
                testing::ElementsAre("TRCH BLER Measurement", "CCTRCH SIR Measurement"));
}

TEST_F(UTRANLogGeneratorTest, APacketUpdatesTheDisplay)
{
    addTemplate("/res/UTRAN.plist", "Serving Cell Info");
    const auto generator = UTRANLogGenerator::generator(services());
    generator->updateState(state, PacketBuilder(0xD0E2).u8(15, 21).size(26).build());
    EXPECT_EQ(textAt(*state.find("Display"), {"Serving Cell Info", "URA ID"}), "21");
}

TEST_F(UTRANLogGeneratorTest, SectionsThatTheTemplateLeavesOutStayUnbound)
{
    addTemplate("/res/UTRAN.plist", "x");
    const auto generator = UTRANLogGenerator::generator(services());
    for (const std::uint32_t code : {0xD0E2U, 0xD00AU, 0xD00EU, 0xD00CU})
        generator->updateState(state, PacketBuilder(code).size(400).build());
    EXPECT_EQ(keysOf(*state.find("Display")->dictionary()), std::vector<std::string>{"x"});
    EXPECT_TRUE(platform.log.contains("Serving Cell Info"));
}

TEST_F(UTRANLogGeneratorTest, ACodeOfNoSectionIsIgnored)
{
    addTemplate("/res/UTRAN.plist", "x");
    const auto generator = UTRANLogGenerator::generator(services());
    generator->updateState(state, Bytes(13, 1));
    platform.log.clear();
    generator->updateState(state, PacketBuilder(0xD00B).size(60).build());
    EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(UTRANLogGeneratorTest, DestructionLogsOnlyTheFamilysLine)
{
    addTemplate("/res/UTRAN.plist", "x");
    auto generator = UTRANLogGenerator::generator(services());
    platform.log.clear();
    generator.reset();
    EXPECT_THAT(platform.log.texts(), testing::ElementsAre(testing::StartsWith(
                                          "Orbel_GSMLogGenerator is destructed 0x")));
}

} // namespace ventrik
