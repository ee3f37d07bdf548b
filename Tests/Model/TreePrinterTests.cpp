#include "Model/TreePrinter.h"

#include <gtest/gtest.h>

namespace ventrik
{

TEST(TreePrinter, IndentsEachLevelByTwoBlanks)
{
    const PlistValue object = PlistDictionary{{"A", PlistDictionary{{"k", "v"}}}, {"B", "w"}};
    PathIndex index;
    EXPECT_EQ(printTree(*VentrikModelNode::makeTreeFromObject(&object, index)),
              "Ventrik\n  A\n    k: v\n  B: w\n");
}

TEST(TreePrinter, ShowsControlCharactersAsBlanks)
{
    const PlistValue object =
        PlistDictionary{{"a\nb", "c\x1b[2Jd\x7f"}, {"\xc3\xa9", "\xe2\x82\xac"}};
    PathIndex index;
    EXPECT_EQ(printTree(*VentrikModelNode::makeTreeFromObject(&object, index)),
              "Ventrik\n  a b: c [2Jd \n  \xc3\xa9: \xe2\x82\xac\n");
}

TEST(TreePrinter, LetsNothingFromOutsideReachTheTerminalUncleaned)
{
    const PlistValue object = PlistDictionary{{"a\xc2\x9b"
                                               "2J",
                                               "b\xe2\x80\xae"
                                               "c\xff"}};
    PathIndex index;
    EXPECT_EQ(printTree(*VentrikModelNode::makeTreeFromObject(&object, index)),
              "Ventrik\n  a 2J: b c\xef\xbf\xbd\n");
}

} // namespace ventrik
