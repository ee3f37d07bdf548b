#include "Model/NodeRows.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

VentrikModelNode::Children
leaves(std::initializer_list<std::pair<const char*, const char*>> entries)
{
    VentrikModelNode::Children rows;
    for (const auto& [name, value] : entries)
        rows.push_back(VentrikModelLeafNode::initWithName(name, value));
    return rows;
}

} // namespace

TEST(NodeRows, OfALeafAndOfNoNodeAreNone)
{
    EXPECT_TRUE(rowsOf(nullptr).empty());
    EXPECT_TRUE(rowsOf(VentrikModelLeafNode::initWithName("Band", "3")).empty());
}

TEST(NodeRows, OfOneNameTheNearestIsFound)
{
    const auto rows = leaves({{"0", ""}, {"Band", ""}, {"1", ""}, {"2", ""}, {"Band", ""}});
    EXPECT_EQ(nearestNamed(rows, "Band", 0), 1);
    EXPECT_EQ(nearestNamed(rows, "Band", 3), 4);
    EXPECT_EQ(nearestNamed(rows, "Band", 100), 4);
    EXPECT_EQ(nearestNamed(rows, "Cell", 2), std::nullopt);
}

TEST(NodeRows, AValueHasChangedWhereItsRowShowedAnother)
{
    const auto before = leaves({{"Band", "3"}, {"Cell", "301"}});
    const VentrikModelLeafNode same("Cell", "301");
    const VentrikModelLeafNode other("Cell", "302");
    const VentrikModelLeafNode added("RSRP", "-90");
    EXPECT_FALSE(hasChanged(before, same, 0));
    EXPECT_TRUE(hasChanged(before, other, 0));
    EXPECT_FALSE(hasChanged(before, added, 2));
}

} // namespace ventrik
