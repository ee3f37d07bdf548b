#include "Model/PathSelection.h"

#include <gmock/gmock.h>

namespace ventrik
{

TEST(PathSelection, TakesAllWhereNothingIsSaid)
{
    EXPECT_TRUE(PathSelection().selects("/a/b"));
    EXPECT_TRUE(PathSelection().reaches("/"));
}

TEST(PathSelection, TakesAPathAndWhatIsBelow)
{
    const PathSelection selection({"/a/b"});
    EXPECT_TRUE(selection.selects("/a/b"));
    EXPECT_TRUE(selection.selects("/a/b/0/c"));
    EXPECT_FALSE(selection.selects("/a"));
    EXPECT_FALSE(selection.selects("/a/bc"));
    EXPECT_FALSE(selection.selects("/b/a/b"));
}

TEST(PathSelection, TakesEachOfItsPatterns)
{
    const PathSelection selection({"/a", "/b/c"});
    EXPECT_TRUE(selection.selects("/a/x"));
    EXPECT_TRUE(selection.selects("/b/c"));
    EXPECT_FALSE(selection.selects("/b/d"));
}

TEST(PathSelection, HasAStarForCharactersWithinAPart)
{
    const PathSelection selection({"/Neighbors/*/RSR*"});
    EXPECT_TRUE(selection.selects("/Neighbors/0/RSRP"));
    EXPECT_TRUE(selection.selects("/Neighbors/12/RSRQ"));
    EXPECT_TRUE(selection.selects("/Neighbors/12/RSR"));
    EXPECT_FALSE(selection.selects("/Neighbors/0/PCI"));
    EXPECT_FALSE(selection.selects("/Neighbors/RSRP"));
    EXPECT_FALSE(selection.selects("/Neighbors/a/b/RSRP"));
}

TEST(PathSelection, GoesBackToAStarThatTookTooLittle)
{
    const PathSelection selection({"/*ab*c"});
    EXPECT_TRUE(selection.selects("/aabab-bc"));
    EXPECT_TRUE(selection.selects("/ab-c-c"));
    EXPECT_FALSE(selection.selects("/ab-c-d"));
}

TEST(PathSelection, HasAQuestionMarkForOneCharacter)
{
    const PathSelection selection({"/a?c"});
    EXPECT_TRUE(selection.selects("/abc"));
    EXPECT_FALSE(selection.selects("/ac"));
    EXPECT_FALSE(selection.selects("/abbc"));
}

TEST(PathSelection, HasTwoStarsForAnyParts)
{
    const PathSelection selection({"/**/RSRP"});
    EXPECT_TRUE(selection.selects("/RSRP"));
    EXPECT_TRUE(selection.selects("/a/b/c/RSRP"));
    EXPECT_FALSE(selection.selects("/a/b/c/RSRQ"));
}

TEST(PathSelection, ReachesWhatIsOnTheWayToAPattern)
{
    const PathSelection selection({"/a/*/c"});
    EXPECT_TRUE(selection.reaches("/a"));
    EXPECT_TRUE(selection.reaches("/a/b"));
    EXPECT_TRUE(selection.reaches("/a/b/c/d"));
    EXPECT_FALSE(selection.reaches("/b"));
    EXPECT_FALSE(selection.reaches("/a/b/d"));
}

TEST(PathSelection, TakesNoLongerForManyStars)
{
    std::string stars;
    for (int i = 0; i < 200; ++i)
        stars += "/**/*a*a*a*a";
    const PathSelection selection({stars});
    EXPECT_FALSE(selection.selects("/" + std::string(10000, 'a') + "/b"));
}

} // namespace ventrik
