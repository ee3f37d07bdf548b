#include "LogGenerator/Orbel/GSM/ActiveSet.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using ActiveSetTest = ListSectionFixture<ActiveSet>;

// A raw energy of -5 dB.
constexpr std::uint32_t minus5 = 209463;

/// A cell list of n cells, all of the active set, all bytes of cells and energies 0.
class CellList
{
  public:
    explicit CellList(std::uint8_t n) : _count(n) { _packet.u8(15, n).size(energies(n)); }

    CellList& agc(std::int16_t value)
    {
        _packet.u16(13, static_cast<std::uint16_t>(value));
        return *this;
    }
    CellList& code(std::size_t cell, std::uint32_t value)
    {
        _packet.bits(16 + 15 * cell + 7, 0, 13, value);
        return *this;
    }
    CellList& setType(std::size_t cell, std::uint32_t value)
    {
        _packet.bits(16 + 15 * cell + 8, 5, 3, value);
        return *this;
    }
    CellList& energy(std::size_t cell, std::size_t offset, std::uint32_t value)
    {
        _packet.u32(energies(cell) + offset, value);
        return *this;
    }
    CellList& size(std::size_t size)
    {
        _packet.size(size);
        return *this;
    }
    operator const PacketBuilder&() const { return _packet; }

  private:
    std::size_t energies(std::size_t cell) const { return 16 + 15 * _count + 44 * cell; }

    std::size_t _count;
    PacketBuilder _packet{0x417A};
};

} // namespace

TEST_F(ActiveSetTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Active Set");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0x417A));
}

TEST_F(ActiveSetTest, ShowsACellsCodeAndLevelsInOrder)
{
    feed(CellList(1).agc(88).code(0, 300).energy(0, 32, minus5));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("Scrambling Code", "RSCP", "Energy Per Chip"));
    EXPECT_EQ(shown(0, "Scrambling Code"), "300");
    EXPECT_EQ(shown(0, "RSCP"), "-51 dB"); // (88 + 512) / 10 - 106 - 5
    EXPECT_EQ(shown(0, "Energy Per Chip"), "-5 dB");
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ActiveSet"}));
}

TEST_F(ActiveSetTest, ScramblingCodesHave13Bits)
{
    feed(CellList(2).code(0, 255).code(1, 8191));
    EXPECT_EQ(shown(0, "Scrambling Code"), "255");
    EXPECT_EQ(shown(1, "Scrambling Code"), "8191");
}

TEST_F(ActiveSetTest, ReceiveAgcIsTruncatedTowardZero)
{
    feed(CellList(1).agc(-1000).energy(0, 32, minus5));
    EXPECT_EQ(shown(0, "RSCP"), "-159 dB"); // -488 / 10 = -48; -48 - 106 - 5
    feed(CellList(1).agc(-512));
    EXPECT_EQ(shown(0, "RSCP"), "-106 dB");
    feed(CellList(1).agc(-521)); // -9 / 10 = 0
    EXPECT_EQ(shown(0, "RSCP"), "-106 dB");
    feed(CellList(1).agc(32767)); // 33279 / 10 = 3327
    EXPECT_EQ(shown(0, "RSCP"), "3221 dB");
    feed(CellList(1).agc(-32768)); // -32256 / 10 = -3225
    EXPECT_EQ(shown(0, "RSCP"), "-3331 dB");
}

TEST_F(ActiveSetTest, TheFirstEnergyThatIsNotZeroCounts)
{
    feed(CellList(4)
             .energy(0, 32, 417648) // -1 dB
             .energy(0, 36, minus5)
             .energy(1, 36, minus5)
             .energy(1, 40, 417648)
             .energy(2, 40, 757)); // -31 dB
    EXPECT_EQ(shown(0, "Energy Per Chip"), "-1 dB");
    EXPECT_EQ(shown(1, "Energy Per Chip"), "-5 dB");
    EXPECT_EQ(shown(2, "Energy Per Chip"), "-31 dB");
    EXPECT_EQ(shown(3, "Energy Per Chip"), "0 dB");
}

TEST_F(ActiveSetTest, BytesAroundTheEnergiesDoNotCount)
{
    feed(CellList(2).energy(0, 28, minus5).energy(0, 44, minus5));
    EXPECT_EQ(shown(0, "Energy Per Chip"), "0 dB");
    EXPECT_EQ(shown(1, "Energy Per Chip"), "0 dB");
}

TEST_F(ActiveSetTest, EnergiesBelongToThePositionAmongAllCells)
{
    feed(CellList(2)
             .setType(0, 1)
             .code(1, 17)
             .energy(0, 32, 417648)
             .energy(1, 32, minus5)); // at 16 + 30 + 44
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "Scrambling Code"), "17");
    EXPECT_EQ(shown(0, "Energy Per Chip"), "-5 dB");
}

TEST_F(ActiveSetTest, CellsOfOtherSetTypesAreNotShown)
{
    for (std::uint32_t type = 1; type < 8; ++type) {
        feed(CellList(1).setType(0, type));
        EXPECT_TRUE(rows.empty()) << type;
    }
}

TEST_F(ActiveSetTest, Shows255CellsAtMost)
{
    feed(CellList(255).code(254, 511).size(16 + 255 * 59));
    EXPECT_EQ(rows.size(), 255U);
    EXPECT_EQ(shown(254, "Scrambling Code"), "511");
}

TEST_F(ActiveSetTest, AListWithoutCellsEmptiesTheRows)
{
    rows.append("row");
    feed(CellList(0).size(16));
    EXPECT_TRUE(rows.empty());
    EXPECT_THAT(log.texts(), ElementsAre("ActiveSet"));
}

TEST_F(ActiveSetTest, AnActiveCellNeedsItsEnergies)
{
    feed(CellList(2).size(16 + 30 + 87));
    EXPECT_EQ(rows.size(), 1U);
    feed(CellList(2).size(16 + 30 + 88));
    EXPECT_EQ(rows.size(), 2U);
}

TEST_F(ActiveSetTest, AnInactiveCellNeedsNoEnergies)
{
    feed(CellList(2).setType(1, 2).size(16 + 30 + 44));
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(ActiveSetTest, AListCutWithinItsEnergiesOrCellsIsShortened)
{
    rows.append("row");
    feed(CellList(2).size(16 + 30 + 43)); // the first cell's energies
    EXPECT_TRUE(rows.empty());
    rows.append("row");
    feed(CellList(2).size(16 + 8)); // the first cell's set type
    EXPECT_TRUE(rows.empty());
}

TEST_F(ActiveSetTest, AListOf16BytesWithACountEmptiesTheRows)
{
    rows.append("row");
    feed(CellList(255).size(16));
    EXPECT_TRUE(rows.empty());
}

TEST_F(ActiveSetTest, AListOf15BytesLeavesTheRowsAsTheyWere)
{
    rows.append("row");
    feed(CellList(0).size(15));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.texts(), ElementsAre("ActiveSet"));
}

TEST_F(ActiveSetTest, EveryShorterListIsHarmless)
{
    for (std::size_t size = 13; size < 16 + 3 * 59; ++size) {
        feed(CellList(3).size(size));
        EXPECT_LE(rows.size(), 2U) << size;
    }
}

TEST_F(ActiveSetTest, AnotherCodeIsReported)
{
    rows.append("row");
    feed(PacketBuilder(0x4005).size(60));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "ActiveSet"},
                                         Line{3, "Received an unknown log message: 16389"}));
}

} // namespace ventrik
