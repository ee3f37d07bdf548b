#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

struct Names {
    std::string_view section;
    std::string_view tag;
};

template <typename Section>
constexpr Names namesOf{};
template <>
constexpr Names namesOf<CellChangeCounters>{"Cell Change Counters", "CellChangeCounters"};
template <>
constexpr Names namesOf<CodingScheme>{"Coding Scheme", "CellChangeCounters"};
template <>
constexpr Names namesOf<NonRankedGSMSet>{"Non-Ranked GSM Set", "NonRankedGSMSet"};
template <>
constexpr Names namesOf<NonRankedUMTSSet>{"Non-Ranked UMTS Set", "NonRankedUMTSSet"};
template <>
constexpr Names namesOf<UMTSRRMeasurement>{"UMTS RR Measurement", "UMTSRRMeasurement"};
template <>
constexpr Names namesOf<DetectedSet>{"Detected Set", "DetectedSet"};
template <>
constexpr Names namesOf<MonitoredSet>{"Monitored Set", "MonitoredSet"};
template <>
constexpr Names namesOf<VirtualActiveSet>{"Virtual Active Set", "VirtualActiveSet"};

// Sections that want no codes, bound to whatever container the template gives them.
template <typename Section>
class PlaceholderTest : public testing::Test
{
  protected:
    void feed(const PacketBuilder& packet)
    {
        const Bytes bytes = packet.build();
        const LogPacket logPacket(bytes);
        section.updateWithData(logPacket, effectiveLogCode(logPacket));
    }

    CapturingSystemLog log;
    Section section{log};
};

using Placeholders = testing::Types<CellChangeCounters, CodingScheme, NonRankedGSMSet,
                                    NonRankedUMTSSet, UMTSRRMeasurement>;
TYPED_TEST_SUITE(PlaceholderTest, Placeholders);

// Sections that stay empty whatever the cell list holds.
template <typename Section>
class EmptySetTest : public ListSectionFixture<Section>
{
  protected:
    // n cells of each of the eight set types in turn, with energies.
    static PacketBuilder cellList(std::uint8_t n)
    {
        PacketBuilder packet = PacketBuilder(0x417A).u8(15, n);
        for (std::size_t i = 0; i < n; ++i)
            packet.bits(16 + 15 * i + 8, 5, 3, static_cast<std::uint32_t>(i % 8))
                .u32(16 + 15 * std::size_t{n} + 44 * i + 32, 417648);
        return packet.size(16 + 59 * std::size_t{n});
    }
};

using EmptySets = testing::Types<DetectedSet, MonitoredSet, VirtualActiveSet>;
TYPED_TEST_SUITE(EmptySetTest, EmptySets);

} // namespace

TYPED_TEST(PlaceholderTest, NamesItselfAndWantsNoCodes)
{
    EXPECT_EQ(this->section.getSectionName(), namesOf<TypeParam>.section);
    EXPECT_TRUE(this->section.getLogCodeArray().empty());
}

TYPED_TEST(PlaceholderTest, APacketOnlyLeavesATrace)
{
    PlistDictionary values{{"Key", "value"}};
    this->section.updateSectionRef(values);
    this->log.clear();
    this->feed(PacketBuilder(0x417A).size(60));
    EXPECT_EQ(values, (PlistDictionary{{"Key", "value"}}));
    EXPECT_THAT(this->log.lines(), ElementsAre(Line{4, std::string(namesOf<TypeParam>.tag)}));
}

TYPED_TEST(PlaceholderTest, AListKeepsItsRows)
{
    PlistArray rows{"row"};
    this->section.updateSectionRef(rows);
    this->feed(PacketBuilder(0x4005).size(60));
    EXPECT_EQ(rows, PlistArray{"row"});
}

TYPED_TEST(EmptySetTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(this->section.getSectionName(), namesOf<TypeParam>.section);
    EXPECT_THAT(this->section.getLogCodeArray(), ElementsAre(0x417A));
}

TYPED_TEST(EmptySetTest, StaysEmptyWhateverTheCellListHolds)
{
    for (const int n : {0, 1, 8, 255}) {
        this->feed(this->cellList(static_cast<std::uint8_t>(n)));
        EXPECT_TRUE(this->rows.empty()) << n;
    }
    EXPECT_EQ(this->log.lines(),
              std::vector<Line>(4, Line{4, std::string(namesOf<TypeParam>.tag)}));
}

TYPED_TEST(EmptySetTest, ACellListOf16BytesEmptiesTheList)
{
    this->rows.append("row");
    this->feed(this->cellList(1).size(16));
    EXPECT_TRUE(this->rows.empty());
}

TYPED_TEST(EmptySetTest, ACellListOf15BytesLeavesTheListAsItWas)
{
    this->rows.append("row");
    this->feed(PacketBuilder(0x417A).size(15));
    EXPECT_EQ(this->rows.size(), 1U);
    EXPECT_TRUE(this->log.texts(3).empty());
}

TYPED_TEST(EmptySetTest, AnotherCodeIsReported)
{
    this->rows.append("row");
    this->feed(PacketBuilder(0x4005).size(60));
    EXPECT_EQ(this->rows.size(), 1U);
    EXPECT_THAT(this->log.lines(), ElementsAre(Line{4, std::string(namesOf<TypeParam>.tag)},
                                               Line{3, "Received an unknown log message: 16389"}));
}

} // namespace ventrik
