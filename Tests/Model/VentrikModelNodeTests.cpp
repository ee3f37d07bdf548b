#include "Model/TreePrinter.h"
#include "Model/VentrikModelNode.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

class TreeTest : public testing::Test
{
  protected:
    // The tree as printed text, without the root's line.
    std::string treeOf(const PlistValue& object)
    {
        root = VentrikModelNode::makeTreeFromObject(&object, index);
        const std::string text = printTree(*root);
        return text.substr(text.find('\n') + 1);
    }
    std::vector<std::string> paths()
    {
        std::vector<std::string> result;
        for (const auto& [path, node] : index)
            result.push_back(path);
        return result;
    }

    PathIndex index;
    ModelNodePointer root;
};

} // namespace

TEST_F(TreeTest, TheRootIsNamedVentrikAtTheRootPath)
{
    treeOf(PlistDictionary());
    EXPECT_EQ(root->displayName(), "Ventrik");
    EXPECT_EQ(index.at("/"), root);
}

TEST_F(TreeTest, AStringIsALeaf)
{
    treeOf(PlistDictionary{{"RSSI", "-70 dBm"}});
    const auto leaf = index.at("/RSSI");
    EXPECT_EQ(*leaf->value(), "-70 dBm");
    EXPECT_EQ(leaf->childNodes(), nullptr);
}

TEST_F(TreeTest, DictionariesNestWithTheirPathsJoined)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"Cell", PlistDictionary{{"RSSI", "-70"}}}}),
              "  Cell\n    RSSI: -70\n");
    EXPECT_THAT(paths(), testing::UnorderedElementsAre("/", "/Cell", "/Cell/RSSI"));
    EXPECT_EQ(index.at("/Cell")->value(), nullptr);
}

TEST_F(TreeTest, AnUnsortedDictionaryKeepsItsOwnOrderAndItsKeys)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"2;Z", "z"}, {"1;A", "a"}}), "  2;Z: z\n  1;A: a\n");
}

TEST_F(TreeTest, TheSortedMarkerOrdersByWholeKeysAndShowsLabels)
{
    EXPECT_EQ(treeOf(PlistDictionary{
                  {"9;A", "a"}, {"_sorted", "_sorted"}, {"10;B", "b"}, {"03;Serving Cell", "s"}}),
              "  Serving Cell: s\n  B: b\n  A: a\n");
}

TEST_F(TreeTest, TheSortedMarkersValueDoesNotMatter)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"b", "2"}, {"a", "1"}, {"_sorted", PlistArray()}}),
              "  a: 1\n  b: 2\n");
}

TEST_F(TreeTest, SortingIsCaseSensitive)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"a", "1"}, {"B", "2"}, {"_sorted", ""}}), "  B: 2\n  a: 1\n");
}

TEST_F(TreeTest, ASortedKeyWithTwoSeparatorsKeepsItsText)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"a;b;c", "1"}, {"_sorted", ""}}), "  a;b;c: 1\n");
}

TEST_F(TreeTest, OfTwoSortedKeysWithOneLabelTheIndexKeepsTheLater)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"2;X", "two"}, {"1;X", "one"}, {"_sorted", ""}}),
              "  X: one\n  X: two\n");
    EXPECT_EQ(*index.at("/X")->value(), "two");
}

TEST_F(TreeTest, EmptyContainersAreInnerNodesWithoutChildren)
{
    treeOf(PlistDictionary{
        {"D", PlistDictionary()}, {"A", PlistArray()}, {"S", PlistDictionary{{"_sorted", ""}}}});
    for (const char* path : {"/D", "/A", "/S"}) {
        ASSERT_NE(index.at(path)->childNodes(), nullptr) << path;
        EXPECT_TRUE(index.at(path)->childNodes()->empty()) << path;
    }
}

TEST_F(TreeTest, ArrayElementsAreNamedByTheirNumber)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"L", PlistArray{"a", PlistDictionary{{"k", "v"}}}}}),
              "  L\n    0: a\n    1\n      k: v\n");
    EXPECT_EQ(*index.at("/L/1/k")->value(), "v");
}

TEST_F(TreeTest, AnythingElseIsUnknown)
{
    EXPECT_EQ(treeOf(PlistDictionary{
                  {"n", 1}, {"r", 1.5}, {"b", true}, {"t", PlistDate{0}}, {"d", Bytes{1}}}),
              "  n: (unknown)\n  r: (unknown)\n  b: (unknown)\n  t: (unknown)\n"
              "  d: (unknown)\n");
}

TEST_F(TreeTest, NoObjectGivesARootLeafUnknown)
{
    root = VentrikModelNode::makeTreeFromObject(nullptr, index);
    EXPECT_EQ(root->displayName(), "Ventrik");
    EXPECT_EQ(*root->value(), "(unknown)");
    EXPECT_EQ(root->childNodes(), nullptr);
    EXPECT_THAT(paths(), testing::ElementsAre("/"));
}

TEST_F(TreeTest, ANameWithASlashIsJoinedAsItStands)
{
    treeOf(PlistDictionary{{"PS/LOCI", PlistDictionary{{"x", "1"}}}});
    EXPECT_TRUE(index.contains("/PS/LOCI/x"));
}

TEST_F(TreeTest, AnEmptyNameLeavesTheRootAtItsPath)
{
    treeOf(PlistDictionary{{"", "v"}});
    EXPECT_EQ(index.at("/"), root);
}

TEST(PathJoining, PutsExactlyOneSlashBetween)
{
    EXPECT_EQ(pathJoining("/", "Cell"), "/Cell");
    EXPECT_EQ(pathJoining("/Cell", "RSSI"), "/Cell/RSSI");
    EXPECT_EQ(pathJoining("/Cell/", "/RSSI"), "/Cell/RSSI");
    EXPECT_EQ(pathJoining("/Cell", ""), "/Cell");
}

} // namespace ventrik
