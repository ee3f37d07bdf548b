#include "LogGenerator/Orbel/CellMonitor.h"
#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "LogGenerator/Orbel/GSM/NeighboringCells.h"
#include "Packets/SharedRecords.h"
#include "Tests/LogGenerator/CellEntry.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using Line = CapturingSystemLog::Line;

struct Names {
    std::string_view trace;
    std::string_view technology;
};

template <typename Section>
constexpr Names namesOf{};
template <>
constexpr Names namesOf<NeighboringCells>{"NeighboringCells",
                                          kQXCellMonitorRadioAccessTechnologyGSM};
template <>
constexpr Names namesOf<UMTSSet>{"UMTSSet", kQXCellMonitorRadioAccessTechnologyUMTS};

// What the lists that the cell monitor fills do alike.
template <typename Section>
class NeighborListTest : public ListSectionFixture<Section>
{
  protected:
    void SetUp() override { this->rows.append("row"); }
    static PlistDictionary cell(std::string_view type)
    {
        return cellEntry(namesOf<Section>.technology, type);
    }
    void monitor(const PlistValue& root)
    {
        this->feed(propertyListPacket(SharedRecords::cellMonitor.logCode, root));
    }
    /// Trace and complaint, in the order in which they are written.
    static std::vector<Line> complaint()
    {
        return {{4, std::string(namesOf<Section>.trace)},
                {3, "Cell Info Array data could not be constructed"},
                {3, "Failed to get Cell Array\n"}};
    }
};

using NeighborLists = testing::Types<NeighboringCells, UMTSSet>;
TYPED_TEST_SUITE(NeighborListTest, NeighborLists);

} // namespace

TYPED_TEST(NeighborListTest, AnEmptyArrayEmptiesTheList)
{
    this->monitor(PlistArray());
    EXPECT_TRUE(this->rows.empty());
    EXPECT_TRUE(this->log.texts(3).empty());
}

TYPED_TEST(NeighborListTest, AnArrayWithoutNeighborsEmptiesTheList)
{
    this->monitor(PlistArray{this->cell(kQXCellMonitorCellTypeServing)});
    EXPECT_TRUE(this->rows.empty());
    EXPECT_TRUE(this->log.texts(3).empty());
}

TYPED_TEST(NeighborListTest, DataThatDoesNotParseEmptiesTheList)
{
    this->feed(PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x'));
    EXPECT_TRUE(this->rows.empty());
    EXPECT_EQ(this->log.lines(), this->complaint());
}

TYPED_TEST(NeighborListTest, ARootThatIsNoArrayEmptiesTheList)
{
    this->monitor(this->cell(kQXCellMonitorCellTypeNeighbor));
    EXPECT_TRUE(this->rows.empty());
    EXPECT_EQ(this->log.lines(), this->complaint());
}

} // namespace ventrik
