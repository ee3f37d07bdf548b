// Packets of records whose layouts differ by version and size, with what they show.

#include "LogGenerator/Core/StateKeys.h"
#include "Platform/Technology.h"
#include "Tests/LogGenerator/DisplayTexts.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ResourceFiles.h"

#include <algorithm>
#include <fstream>
#include <random>

namespace ventrik
{

namespace
{

struct LayoutGolden {
    std::string name;
    std::string technology;
    Bytes packet;
    RecordsMode records = RecordsMode::Newer;
    std::vector<std::string> texts;     ///< by its own layout
    std::vector<std::string> baseTexts; ///< by the base layout
};

Bytes bytesOf(const std::string& hexadecimal)
{
    Bytes bytes;
    for (std::size_t i = 0; i + 1 < hexadecimal.size(); i += 2)
        bytes.push_back(
            static_cast<std::uint8_t>(std::stoi(hexadecimal.substr(i, 2), nullptr, 16)));
    return bytes;
}

std::vector<LayoutGolden> readGoldens()
{
    std::vector<LayoutGolden> goldens;
    std::ifstream input(VENTRIK_GOLDEN "/layouts.txt");
    for (std::string line; std::getline(input, line);) {
        if (line.starts_with("== "))
            goldens.emplace_back().name = line.substr(3);
        const std::size_t colon = line.find(": ");
        if (goldens.empty() || colon == std::string::npos || line.starts_with("=="))
            continue;
        const std::string key = line.substr(0, colon);
        const std::string value = line.substr(colon + 2);
        LayoutGolden& golden = goldens.back();
        if (key == "technology")
            golden.technology = value;
        else if (key == "packet")
            golden.packet = bytesOf(value);
        else if (key == "records")
            golden.records = recordsModeNamed(value).value();
        else
            (key == "base" ? golden.baseTexts : golden.texts).push_back(value);
    }
    return goldens;
}

const std::vector<LayoutGolden>& goldens()
{
    static const std::vector<LayoutGolden> read = readGoldens();
    return read;
}

std::string testName(const testing::TestParamInfo<LayoutGolden>& info)
{
    std::string name = info.param.name;
    std::ranges::replace_if(
        name, [](unsigned char c) { return !std::isalnum(c); }, '_');
    return name;
}

class LayoutGoldenTest : public GeneratorFixture, public testing::WithParamInterface<LayoutGolden>
{
  protected:
    LayoutGoldenTest() { addTemplates(platform.resources, VENTRIK_RESOURCES); }

    /// What a fresh display shows of the packets.
    std::vector<std::string> textsOf(RecordsMode records, const std::vector<Bytes>& packets)
    {
        GeneratorServices with = services();
        with.records = records;
        const auto generator = LogGenerator::generatorFromTechnology(
            technologyNamed(GetParam().technology)->identifier, with);
        // A template that was read once is not read again.
        PlistDictionary fresh;
        if (const PlistValue* known = _templates.find(nameOf(records)))
            fresh.set(StateKey::displayTemplate, *known);
        for (const Bytes& packet : packets)
            generator->updateState(fresh, packet);
        _templates.set(nameOf(records), *fresh.find(StateKey::displayTemplate));
        return displayTexts(*fresh.find(StateKey::display));
    }

  private:
    PlistDictionary _templates; // by mode
};

} // namespace

TEST_P(LayoutGoldenTest, ShowsItsValues)
{
    EXPECT_EQ(textsOf(GetParam().records, {GetParam().packet}), GetParam().texts);
}

TEST_P(LayoutGoldenTest, ShowsByTheBaseLayoutWhatItAlwaysHas)
{
    EXPECT_EQ(textsOf(RecordsMode::Base, {GetParam().packet}), GetParam().baseTexts);
}

// Where a cut packet has no layout of its own any more, it is read as it always was; what it shows
// is never more than the whole one.
TEST_P(LayoutGoldenTest, CutAnywhereShowsWhatItsBytesTell)
{
    const Bytes& whole = GetParam().packet;
    for (std::size_t size = 0; size < whole.size(); ++size) {
        const Bytes cut(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size));
        const auto texts = textsOf(GetParam().records, {cut});
        if (texts == textsOf(RecordsMode::Base, {cut}))
            continue;
        EXPECT_TRUE(std::ranges::includes(GetParam().texts, texts)) << size;
    }
}

// The sanitizers watch over what is read.
TEST_P(LayoutGoldenTest, RandomBytesUnderItsVersionAreHarmless)
{
    constexpr std::size_t keptHead = 14; // with the version
    constexpr int runs = 30;
    std::minstd_rand random(4711);
    std::vector<Bytes> packets;
    for (int run = 0; run < runs; ++run) {
        packets.push_back(GetParam().packet);
        // Now all of them, now some: packets that still fit their layout are the ones to try.
        const auto one = run % 2 == 0 ? 1U : 16U;
        for (std::size_t i = keptHead; i < packets.back().size(); ++i)
            if (random() % one == 0)
                packets.back()[i] = static_cast<std::uint8_t>(random());
    }
    EXPECT_NO_THROW(textsOf(RecordsMode::Extended, packets));
}

INSTANTIATE_TEST_SUITE_P(Layouts, LayoutGoldenTest, testing::ValuesIn(goldens()), testName);

// A path that is spelled another way in the file would leave these tests without packets.
TEST(LayoutGoldens, AreAllThere)
{
    constexpr std::size_t count = 63;
    EXPECT_EQ(goldens().size(), count);
}

} // namespace ventrik
