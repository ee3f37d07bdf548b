#include "Platform/Technology.h"
#include "Tests/LogGenerator/DisplayTexts.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ResourceFiles.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace ventrik
{

namespace
{

const std::filesystem::path goldenDirectory = VENTRIK_GOLDEN;

// Packets in hexadecimal, with an empty line between one and the next.
std::vector<Bytes> readPackets(const std::filesystem::path& file)
{
    std::vector<Bytes> packets(1);
    std::ifstream input(file);
    for (std::string line; std::getline(input, line);) {
        if (line.empty())
            packets.emplace_back();
        std::istringstream bytes(line);
        for (std::string byte; bytes >> byte;)
            packets.back().push_back(static_cast<std::uint8_t>(std::stoi(byte, nullptr, 16)));
    }
    return packets;
}

std::vector<std::string> readLines(const std::filesystem::path& file)
{
    std::vector<std::string> lines;
    std::ifstream input(file);
    for (std::string line; std::getline(input, line);)
        lines.push_back(line);
    return lines;
}

std::vector<std::string> goldenNames()
{
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(goldenDirectory))
        if (entry.path().extension() == ".hex")
            names.push_back(entry.path().stem().string());
    std::ranges::sort(names);
    return names;
}

std::string testName(const testing::TestParamInfo<std::string>& info)
{
    std::string name = info.param;
    std::ranges::replace(name, '-', '_');
    return name;
}

// A record as it was received, named for its technology and its kind, and what it shows.
class GoldenPacketTest : public GeneratorFixture, public testing::WithParamInterface<std::string>
{
  protected:
    void SetUp() override
    {
        addTemplates(platform.resources, VENTRIK_RESOURCES);
        packets = readPackets(goldenDirectory / (GetParam() + ".hex"));
    }
    std::unique_ptr<LogGenerator> makeGenerator()
    {
        const auto technology = technologyNamed(GetParam().substr(0, GetParam().find('-')));
        return LogGenerator::generatorFromTechnology(technology->identifier, services());
    }

    std::vector<Bytes> packets;
};

} // namespace

TEST_P(GoldenPacketTest, ShowsItsValues)
{
    const auto generator = makeGenerator();
    for (const Bytes& packet : packets)
        generator->updateState(state, packet);
    EXPECT_EQ(displayTexts(*state.find("Display")),
              readLines(goldenDirectory / (GetParam() + ".txt")));
}

// The sanitizers watch over what is read.
TEST_P(GoldenPacketTest, CutShortAnywhereIsHarmless)
{
    const auto generator = makeGenerator();
    for (const Bytes& packet : packets)
        for (std::size_t size = 0; size < packet.size(); ++size)
            generator->updateState(state, Bytes(packet.begin(), packet.begin() + size));
    EXPECT_TRUE(state.find("Display")->dictionary());
}

INSTANTIATE_TEST_SUITE_P(Records, GoldenPacketTest, testing::ValuesIn(goldenNames()), testName);

} // namespace ventrik
