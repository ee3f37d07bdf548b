#include "Tools/Watch/TreeSearch.h"

#include "Tests/Tools/WatchTree.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <clocale>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

class Search : public testing::Test
{
  protected:
    Search()
    {
        EXPECT_TRUE(std::setlocale(LC_CTYPE, "C.UTF-8"));
        tree.show(radioDisplay());
    }
    TreeSearch search(std::string_view text) { return {tree.topLevelNodes(), text}; }
    std::vector<std::string> find(std::string_view text)
    {
        const TreeSearch found = search(text);
        std::vector<std::string> names;
        for (std::size_t match = 0; match < found.count(); ++match)
            names.push_back(found.names(match));
        return names;
    }

    WatchTree tree;
};

} // namespace

TEST_F(Search, FindsNamesAndValuesInAnyCase)
{
    EXPECT_THAT(find("BAND"), ElementsAre("Serving Cell › Band"));
    EXPECT_THAT(find("idle"), ElementsAre("State"));
    EXPECT_THAT(find("quarz"), IsEmpty());
}

TEST_F(Search, FindsLettersOfOtherAlphabetsInAnyCase)
{
    tree.show(PlistDictionary{{"Größe", "ÄÖ"}, {"Ё", "1"}});
    EXPECT_THAT(find("GRÖSSE"), IsEmpty());
    EXPECT_THAT(find("GRÖ"), ElementsAre("Größe"));
    EXPECT_THAT(find("äö"), ElementsAre("Größe"));
    EXPECT_THAT(find("ё"), ElementsAre("Ё"));
}

TEST_F(Search, FindsAllBelowAMatchingName)
{
    EXPECT_THAT(find("serving"),
                ElementsAre("Serving Cell", "Serving Cell › Cell ID", "Serving Cell › Band"));
}

TEST_F(Search, FindsAPathAcrossItsParts)
{
    EXPECT_THAT(find("rs/1"), ElementsAre("Neighbors › 1", "Neighbors › 1 › PCI"));
    EXPECT_THAT(find("neighbors/2/pci"), ElementsAre("Neighbors › 2 › PCI"));
}

TEST_F(Search, ForNothingFindsAll)
{
    EXPECT_EQ(find("").size(), 11U);
}

TEST_F(Search, InNoTreeFindsNothing)
{
    EXPECT_EQ(TreeSearch(nullptr, "").count(), 0U);
    tree.show("text");
    EXPECT_THAT(find(""), IsEmpty());
}

TEST_F(Search, KnowsWhereAMatchStands)
{
    const TreeSearch found = search("12");
    ASSERT_EQ(found.count(), 1U);
    EXPECT_THAT(found.trail(0), ElementsAre(1, 2, 0));
    EXPECT_EQ(*found.node(0).value(), "12");
}

TEST_F(Search, GoesFromAPlaceToTheNextAndThePreviousMatch)
{
    const TreeSearch found = search("pci"); // 1 0 0, 1 1 0, 1 2 0
    EXPECT_EQ(found.firstBehind({0, 1}), 0U);
    EXPECT_EQ(found.firstBehind({1, 0, 0}), 1U);
    EXPECT_EQ(found.firstBehind({2}), 3U);
    EXPECT_EQ(found.lastBefore({2}), 2U);
    EXPECT_EQ(found.lastBefore({1, 1, 0}), 0U);
    EXPECT_EQ(found.lastBefore({0}), found.count());
}

TEST_F(Search, TakesNoTimeAgainForALongNameAboveManyRows)
{
    PlistArray rows;
    for (int row = 0; row < 100'000; ++row)
        rows.append("value");
    tree.show(PlistDictionary{{std::string(std::size_t{1} << 20, 'x'), rows}});
    EXPECT_EQ(search("VALUE").count(), 100'000U);
}

} // namespace ventrik
