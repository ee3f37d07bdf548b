#include "Packets/LTERecords.h"
#include "Tests/Model/ModelFixture.h"
#include "Tests/Support/IdleGenerator.h"

#include <map>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::string_view levelDoubt = "RSRP is outside -144 to -44 dBm";
constexpr std::string_view identityDoubt = "Physical cell identity is above 503";

// Origins and layouts are found by the keys with ">" between them.
std::string joined(std::span<const std::string_view> keys)
{
    return fmt::format("{}", fmt::join(keys, ">"));
}

/// What the generator of a test knows; it outlives the generator.
struct Knowledge {
    std::optional<PlistValue> display;
    std::map<std::string, ValueOrigin> origins;
    std::map<std::string, std::vector<ReadLayout>> layouts;
};

/// Knows what its test says.
class FakeGenerator : public IdleGenerator
{
  public:
    explicit FakeGenerator(const Knowledge& knowledge) : _knowledge(knowledge) {}
    std::optional<PlistValue> generateLogUsingState(PlistDictionary&) override
    {
        return _knowledge.display;
    }
    std::optional<ValueOrigin> originOf(const PlistDictionary&,
                                        std::span<const std::string_view> path) const override
    {
        const auto known = _knowledge.origins.find(joined(path));
        return known == _knowledge.origins.end() ? std::nullopt : std::optional(known->second);
    }
    std::vector<ReadLayout> layoutsAt(const PlistDictionary&,
                                      std::span<const std::string_view> path) const override
    {
        const auto known = _knowledge.layouts.find(joined(path));
        return known == _knowledge.layouts.end() ? std::vector<ReadLayout>() : known->second;
    }

  private:
    const Knowledge& _knowledge;
};

/// A model whose generator knows what the test says.
class NodeNotesTest : public ModelFixture
{
  protected:
    void show(PlistValue display)
    {
        known.display = std::move(display);
        noted.startMonitor();
        noted.topLevelNodes();
    }
    void putLevel(const std::string& keys, std::int64_t raw)
    {
        known.origins.insert_or_assign(keys, ValueOrigin{nullptr, std::nullopt, &level, 0, raw});
    }
    std::string doubtAt(const std::string& path) const { return std::string(noted.doubtAt(path)); }

    static constexpr Field level{"Level", u16(0), rsrp(0.25, -180)};
    Knowledge known;
    VentrikModel noted{fake.platform(), {}, [this](const PlistValue&, const auto&) {
                           return std::make_unique<FakeGenerator>(known);
                       }};
};

/// The real decoders.
class DecodedDoubtTest : public ModelFixture
{
  protected:
    void show(const PacketBuilder& packet)
    {
        model.startMonitor();
        arrive(packet.build());
        model.refresh();
        model.topLevelNodes();
    }
    std::string doubtAt(const std::string& path) const { return std::string(model.doubtAt(path)); }
    /// The paths of all doubtful values at a path and below it.
    std::vector<std::string> doubtfulPaths(const std::string& path = "/")
    {
        std::vector<std::string> result;
        if (!doubtAt(path).empty())
            result.push_back(path);
        const auto node = model.nodeAtPath(path);
        if (const auto* children = node->childNodes())
            for (const ModelNodePointer& child : *children)
                for (std::string& found : doubtfulPaths(pathJoining(path, child->displayName())))
                    result.push_back(std::move(found));
        return result;
    }
};

// A packet of that size, in which all bits behind its header are set.
PacketBuilder filled(std::uint32_t logCode, std::size_t size)
{
    PacketBuilder packet(logCode);
    for (std::size_t i = 13; i < size; ++i)
        packet.u8(i, 0xFF);
    return packet;
}

ReadLayout layout(std::uint32_t code, LayoutKind kind, std::optional<std::uint8_t> version = 7)
{
    return {code, version, 40, kind};
}

PlistDictionary section(const std::string& key, PlistValue value)
{
    return {{"Section", PlistDictionary{{key, std::move(value)}}}};
}

} // namespace

TEST_F(DecodedDoubtTest, ValuesThatCannotBeAreInDoubtAndTheOthersAreNot)
{
    show(PacketBuilder(0xB0C2).u16(14, 504).u16(16, 4950).u16(18, 19300).u8(20, 9).size(38));
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), identityDoubt);
    EXPECT_EQ(doubtAt("/Serving Cell Info/Download Frequency"), "Downlink EARFCN is in no band");
    EXPECT_EQ(doubtAt("/Serving Cell Info/Upload Frequency"), "");
    EXPECT_EQ(doubtAt("/Serving Cell Info/Download Bandwidth"), "");    // "Unknown"
    EXPECT_EQ(doubtAt("/Serving Cell Measurements/Measured RSRP"), ""); // a dash
}

TEST_F(DecodedDoubtTest, AValueInAListIsJudgedInItsOwnRow)
{
    show(PacketBuilder(0xB179).u8(27, 2).u16(29, 11).u16(35, 504).size(41));
    EXPECT_EQ(doubtAt("/Neighbors/Measured Neighbor Cells/0/Physical Cell ID"), "");
    EXPECT_EQ(doubtAt("/Neighbors/Measured Neighbor Cells/1/Physical Cell ID"), identityDoubt);
}

TEST_F(DecodedDoubtTest, TheServingCellsValuesWithLimitsAreJudged)
{
    show(filled(0xB0C2, 38));
    EXPECT_THAT(doubtfulPaths(), ElementsAre("/Serving Cell Info/Physical Cell ID",
                                             "/Serving Cell Info/Download Frequency",
                                             "/Serving Cell Info/Upload Frequency"));
}

// 1.75 dB, the most that an RSRQ of 7 bits can say, is within the limits.
TEST_F(DecodedDoubtTest, TheServingCellsMeasurementsAreJudged)
{
    const std::string section = "/Serving Cell Measurements/";
    show(filled(0xB17F, 33));
    EXPECT_THAT(doubtfulPaths(), ElementsAre(section + "Measured RSRP", section + "Average RSRP",
                                             section + "E-ARFCN", section + "Physical Cell ID"));
}

TEST_F(DecodedDoubtTest, MeasurementsInConnectedModeAreJudged)
{
    const std::string serving = "/Connected mode LTE Intra-frequency Measurement/";
    const std::string neighbor = "/Neighbors/Measured Neighbor Cells/0/";
    show(filled(0xB179, 37).u8(27, 1).u8(28, 1));
    EXPECT_THAT(doubtfulPaths(),
                ElementsAre(serving + "Serving Filtered RSRP", serving + "Serving Filtered RSRQ",
                            serving + "E-ARFCN", serving + "Serving Physical Cell ID",
                            neighbor + "Physical Cell ID", neighbor + "Filtered RSRP",
                            neighbor + "Filtered RSRQ",
                            "/Neighbors/Detected Cells/0/Physical Cell ID"));
}

TEST_F(DecodedDoubtTest, MeasurementsOfNeighborsInIdleModeAreJudged)
{
    const std::string cell = "/Neighbors/Neighbor Cells List/0/";
    show(filled(0xB180, 41));
    EXPECT_THAT(doubtfulPaths(),
                ElementsAre(cell + "Physical Cell ID", cell + "Measured RSRP",
                            cell + "Average RSRP", "/Neighbors/Neighbor Measurements/E-ARFCN"));
}

TEST_F(DecodedDoubtTest, CandidatesOfAReselectionAreJudged)
{
    const std::string serving = "/Reselection/Reselection Candidates/";
    const std::string candidate = "/Reselection/Reselection Candidates List/0/";
    show(filled(0xB186, 29).u8(19, 1).u16(23, 0));
    EXPECT_THAT(doubtfulPaths(),
                ElementsAre(serving + "Serving EARFCN", serving + "Serving Cell ID",
                            candidate + "E ARFCN", candidate + "Cell ID"));
}

TEST_F(DecodedDoubtTest, ADoubtGoesWithItsValue)
{
    show(PacketBuilder(0xB0C2).u16(14, 504).size(38));
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), identityDoubt);
    show(PacketBuilder(0xB0C2).u16(14, 503).size(38));
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), "");
}

TEST_F(DecodedDoubtTest, WhatIsShownIsJudgedNotWhatHasComeSince)
{
    show(PacketBuilder(0xB0C2).u16(14, 504).size(38));
    arrive(cellInfo(1));
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), identityDoubt);
    model.refresh();
    model.topLevelNodes();
    arrive(cellInfo(504));
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), "");
}

TEST_F(DecodedDoubtTest, WithoutAGeneratorOrATreeThereIsNone)
{
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), "");
    EXPECT_THAT(model.layoutWarningsAt("/Serving Cell Info"), IsEmpty());
    show(PacketBuilder(0xB0C2).u16(14, 504).size(38));
    arrive(cellInfo(504));
    model.refresh();
    EXPECT_EQ(doubtAt("/Serving Cell Info/Physical Cell ID"), "");
}

TEST_F(NodeNotesTest, TheGeneratorIsAskedByTheDisplaysKeys)
{
    putLevel("2;Cell a/b>1>1;C/I", 0); // -180.00
    const PlistValue row = PlistDictionary{{"1;C/I", "-180.00 dBm"}, {"_sorted", ""}};
    show(PlistDictionary{{"2;Cell a/b", PlistArray{"", row}}, {"_sorted", ""}});
    EXPECT_EQ(doubtAt("/Cell a/b/1/C/I"), levelDoubt);
}

TEST_F(NodeNotesTest, AValueIsJudgedByItsNumberMoreExactlyThanItShows)
{
    constexpr Field whole{"Level", u16(0), of(Quantity::RSRP, {.offset = -144.5, .unit = "dBm"})};
    known.origins.insert_or_assign("Section>Level",
                                   ValueOrigin{nullptr, std::nullopt, &whole, 0, 0});
    show(section("Level", "-144 dBm"));
    EXPECT_EQ(doubtAt("/Section/Level"), levelDoubt);
}

TEST_F(NodeNotesTest, AnInnerNodeAndAPlaceWithoutANodeHaveNoDoubt)
{
    putLevel("Section", 0);
    putLevel("Elsewhere", 0);
    show(section("Level", "-180.00 dBm"));
    EXPECT_EQ(doubtAt("/Section"), "");
    EXPECT_EQ(doubtAt("/Elsewhere"), "");
}

TEST_F(NodeNotesTest, AValueThatNoFieldShowsHasNoDoubt)
{
    show(section("Level", "-180.00 dBm"));
    EXPECT_EQ(doubtAt("/Section/Level"), "");
}

TEST_F(NodeNotesTest, ADateBefore1980IsInDoubt)
{
    show(PlistDictionary{{"Old", PlistDate{0}}, {"New", PlistDate{1e9}}});
    EXPECT_EQ(doubtAt("/Old"), "Date is before 1980");
    EXPECT_EQ(doubtAt("/New"), "");
    EXPECT_EQ(*noted.nodeAtPath("/Old")->value(), "(unknown)");
}

TEST_F(NodeNotesTest, OnlyLayoutsThatAreNotKnownAreWarnedOf)
{
    known.layouts["Section"] = {layout(0xB17F, LayoutKind::NotKnown),
                                layout(0xB0C2, LayoutKind::Base),
                                layout(0xB179, LayoutKind::Newer)};
    show(section("Level", "-"));
    EXPECT_THAT(noted.layoutWarningsAt("/Section"),
                ElementsAre("0xB17F version 7: layout not known, values may be wrong"));
}

TEST_F(NodeNotesTest, TheLayoutsOfASectionAreAskedByItsKeys)
{
    known.layouts["2;Cell a/b>0"] = {layout(0xB17F, LayoutKind::NotKnown, std::nullopt)};
    show(PlistDictionary{{"2;Cell a/b", PlistArray{PlistDictionary()}}, {"_sorted", ""}});
    EXPECT_THAT(noted.layoutWarningsAt("/Cell a/b/0"),
                ElementsAre("0xB17F of 40 bytes: layout not known, values may be wrong"));
    EXPECT_THAT(noted.layoutWarningsAt("/Cell a/b"), IsEmpty());
}

TEST_F(NodeNotesTest, TwoWarningsStandThereAndTheOthersAreCounted)
{
    auto& layouts = known.layouts["Section"];
    show(section("Level", "-"));
    const std::string first = "0xB001 version 7: layout not known, values may be wrong";
    const std::string second = "0xB002 version 7: layout not known, values may be wrong";
    layouts = {layout(0xB001, LayoutKind::NotKnown), layout(0xB002, LayoutKind::NotKnown)};
    EXPECT_THAT(noted.layoutWarningsAt("/Section"), ElementsAre(first, second));
    layouts.push_back(layout(0xB003, LayoutKind::NotKnown));
    EXPECT_THAT(noted.layoutWarningsAt("/Section"), ElementsAre(first, second, "and 1 more"));
    layouts.insert(layouts.end(), 9, layout(0xB004, LayoutKind::NotKnown));
    EXPECT_THAT(noted.layoutWarningsAt("/Section"), ElementsAre(first, second, "and 10 more"));
}

} // namespace ventrik
