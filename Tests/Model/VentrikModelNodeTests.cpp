#include "LogGenerator/Orbel/ArrayLock.h"
#include "Model/TreePrinter.h"
#include "Model/VentrikModelNode.h"
#include "Tests/Support/ArrayLockHolder.h"

#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <malloc.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

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
    std::string nameAt(std::string_view path) const
    {
        const auto node = index.find(path);
        return node ? node->displayName() : "none";
    }

    PathIndex index;
    ModelNodePointer root;
};

} // namespace

TEST_F(TreeTest, TheRootIsNamedVentrikAtTheRootPath)
{
    treeOf(PlistDictionary());
    EXPECT_EQ(root->displayName(), "Ventrik");
    EXPECT_EQ(index.find("/"), root);
}

TEST_F(TreeTest, AStringIsALeaf)
{
    treeOf(PlistDictionary{{"RSSI", "-70 dBm"}});
    const auto leaf = index.find("/RSSI");
    EXPECT_EQ(*leaf->value(), "-70 dBm");
    EXPECT_EQ(leaf->childNodes(), nullptr);
}

TEST_F(TreeTest, DictionariesNestWithTheirPathsJoined)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"Cell", PlistDictionary{{"RSSI", "-70"}}}}),
              "  Cell\n    RSSI: -70\n");
    EXPECT_EQ(nameAt("/Cell"), "Cell");
    EXPECT_EQ(nameAt("/Cell/RSSI"), "RSSI");
    EXPECT_EQ(index.find("/Cell")->value(), nullptr);
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
    EXPECT_EQ(treeOf(PlistDictionary{{"a;;c", "1"}, {"_sorted", ""}}), "  a;;c: 1\n");
}

TEST_F(TreeTest, OfTwoSortedKeysWithOneLabelTheIndexKeepsTheLater)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"2;X", "two"}, {"1;X", "one"}, {"_sorted", ""}}),
              "  X: one\n  X: two\n");
    EXPECT_EQ(*index.find("/X")->value(), "two");
}

TEST_F(TreeTest, EmptyContainersAreInnerNodesWithoutChildren)
{
    treeOf(PlistDictionary{
        {"D", PlistDictionary()}, {"A", PlistArray()}, {"S", PlistDictionary{{"_sorted", ""}}}});
    for (const char* path : {"/D", "/A", "/S"}) {
        ASSERT_NE(index.find(path)->childNodes(), nullptr) << path;
        EXPECT_TRUE(index.find(path)->childNodes()->empty()) << path;
    }
}

TEST_F(TreeTest, ArrayElementsAreNamedByTheirNumber)
{
    EXPECT_EQ(treeOf(PlistDictionary{{"L", PlistArray{"a", PlistDictionary{{"k", "v"}}}}}),
              "  L\n    0: a\n    1\n      k: v\n");
    EXPECT_EQ(*index.find("/L/1/k")->value(), "v");
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
    EXPECT_EQ(index.find("/"), root);
}

TEST_F(TreeTest, ANameWithASlashIsJoinedAsItStands)
{
    treeOf(PlistDictionary{{"PS/LOCI", PlistDictionary{{"x", "1"}}}});
    EXPECT_TRUE(index.find("/PS/LOCI/x"));
}

TEST_F(TreeTest, AnEmptyNameLeavesTheRootAtItsPath)
{
    treeOf(PlistDictionary{{"", "v"}});
    EXPECT_EQ(index.find("/"), root);
}

TEST(PathJoining, PutsExactlyOneSlashBetween)
{
    EXPECT_EQ(pathJoining("/", "Cell"), "/Cell");
    EXPECT_EQ(pathJoining("/Cell", "RSSI"), "/Cell/RSSI");
    EXPECT_EQ(pathJoining("/Cell/", "/RSSI"), "/Cell/RSSI");
    EXPECT_EQ(pathJoining("/Cell", ""), "/Cell");
}

// The path of a child has exactly one "/" between the two, whatever slashes the names hold.
TEST_F(TreeTest, NodesAreFoundByTheirJoinedPathsWhateverSlashesTheNamesHold)
{
    struct Case {
        std::string outer;
        std::string inner;
        std::string path;
    };
    const std::vector<Case> cases{
        {"a", "b", "/a/b"},       {"a/", "b", "/a/b"},      {"a//", "/b", "/a/b"},
        {"a", "b/", "/a/b/"},     {"a", "b//c", "/a/b//c"}, {"a//b", "c", "/a//b/c"},
        {"/", "b", "/b"},         {"", "b", "/b"},          {"a/b", "c", "/a/b/c"},
        {"a", "b///", "/a/b///"},
    };
    for (const Case& test : cases) {
        PathIndex fresh;
        const PlistValue object = PlistDictionary{{test.outer, PlistDictionary{{test.inner, "v"}}}};
        VentrikModelNode::makeTreeFromObject(&object, fresh);
        const auto node = fresh.find(test.path);
        ASSERT_TRUE(node) << test.path;
        EXPECT_EQ(node->displayName(), test.inner) << test.path;
        EXPECT_EQ(pathJoining(pathJoining("/", test.outer), test.inner), test.path);
    }
}

TEST_F(TreeTest, ANodeWithoutANameLeavesItsParentAtTheirPath)
{
    treeOf(PlistDictionary{{"a", PlistDictionary{{"", "inner"}, {"/", "inner"}}}});
    EXPECT_EQ(nameAt("/a"), "a");
    EXPECT_EQ(index.find("/a/"), nullptr);
}

TEST_F(TreeTest, ADeeperLookingNameAndADeeperNodeAreAtOnePathWhereTheLaterStays)
{
    treeOf(PlistDictionary{{"a", PlistDictionary{{"b", "first"}}}, {"a/b", "second"}});
    EXPECT_EQ(*index.find("/a/b")->value(), "second");
}

TEST_F(TreeTest, NothingIsFoundWhereThereIsNoNode)
{
    treeOf(PlistDictionary{{"a/b", PlistDictionary{{"c", "v"}}}});
    for (const char* path : {"", "a", "/a", "/a/b/", "/a/b/c/", "//a/b", "/a/b/d", "/b", "xa/b"})
        EXPECT_EQ(index.find(path), nullptr) << path;
}

TEST_F(TreeTest, APathGivesTheKeysOfTheDisplayAndTheNumbersOfRows)
{
    treeOf(PlistDictionary{
        {"3;Cells", PlistArray{"a", PlistDictionary{{"E-C/N", "v"}, {"2;x", "w"}}}},
        {"_sorted", ""},
    });
    EXPECT_THAT(index.keysOf("/Cells"), ElementsAre("3;Cells"));
    EXPECT_THAT(index.keysOf("/Cells/1/E-C/N"), ElementsAre("3;Cells", "1", "E-C/N"));
    EXPECT_THAT(index.keysOf("/Cells/1/2;x"), ElementsAre("3;Cells", "1", "2;x"));
    EXPECT_THAT(index.keysOf("/"), IsEmpty());
    EXPECT_THAT(index.keysOf("/Cells/1/E-C"), IsEmpty());
    EXPECT_THAT(index.keysOf("/3;Cells"), IsEmpty());
}

TEST_F(TreeTest, KeysAreThoseOfTheNodeThatIsFound)
{
    treeOf(PlistDictionary{
        {"1;a", PlistDictionary{{"b", "first"}}}, {"2;a/b", "second"}, {"_sorted", ""}});
    EXPECT_THAT(index.keysOf("/a/b"), ElementsAre("2;a/b"));
    PathIndex other;
    const PlistValue turned = PlistDictionary{
        {"1;a/b", "first"}, {"2;a", PlistDictionary{{"b", "second"}}}, {"_sorted", ""}};
    VentrikModelNode::makeTreeFromObject(&turned, other);
    EXPECT_THAT(other.keysOf("/a/b"), ElementsAre("2;a", "b"));
}

TEST_F(TreeTest, KeysComeToAnEndWhateverSlashesTheNamesHold)
{
    const std::vector<std::string> names{"", "/", "a", "a/", "//a", "a//", "/a/", "a/a", "a//a"};
    PlistValue object = "v";
    for (int level = 0; level < 4; ++level) {
        PlistDictionary outer;
        for (const std::string& name : names)
            outer.set(name, object);
        object = outer;
    }
    treeOf(object);
    for (const char* path : {"/a", "/a/", "/a//", "/a/a", "/a/a/a/a", "/a//a/", "/a/a/a/"})
        EXPECT_LE(index.keysOf(path).size(), 4U) << path;
}

// Each of the children's paths is 100,000 characters long.
TEST_F(TreeTest, ALongNameIsKeptOnceForAllItsChildren)
{
    PlistArray rows;
    for (int i = 0; i < 2000; ++i)
        rows.append("v");
    const std::string name(100'000, 'n');
    const auto before = mallinfo2().uordblks;
    treeOf(PlistDictionary{{name, rows}});
    const auto grown = mallinfo2().uordblks - before;
    EXPECT_LT(grown, std::size_t{2} << 20);
    EXPECT_EQ(*index.find("/" + name + "/1999")->value(), "v");
}

// Another thread gets the lock only when no level of it is left behind.
TEST_F(TreeTest, ArraysInArraysLeaveNoLevelOfTheLockBehind)
{
    const auto isFree = [] {
        bool result = false;
        std::thread([&] {
            result = ArrayLock::lock().try_lock();
            if (result)
                ArrayLock::lock().unlock();
        }).join();
        return result;
    };
    ASSERT_TRUE(isFree());
    treeOf(PlistArray{PlistArray{PlistArray{"a"}, "b"}, PlistArray{"c"}});
    EXPECT_TRUE(isFree());
}

TEST_F(TreeTest, AnArrayIsWalkedUnderItsLock)
{
    const PlistValue list = PlistArray{"a"};
    const PlistValue dictionary = PlistDictionary{{"a", "b"}};
    EXPECT_TRUE(waitsForArrayLock([&] { VentrikModelNode::makeTreeFromObject(&list, index); }));
    PathIndex other;
    EXPECT_FALSE(
        waitsForArrayLock([&] { VentrikModelNode::makeTreeFromObject(&dictionary, other); }));
}

} // namespace ventrik
