#include "Model/TreePrinter.h"

#include <gtest/gtest.h>

#include <set>

namespace ventrik
{

namespace
{

/// Doubts what stands at some paths, and warns twice of what stands at others.
class FakeNotes : public NodeNotes
{
  public:
    using Paths = std::set<std::string>;

    FakeNotes(Paths doubtful, Paths unknown)
        : _doubtful(std::move(doubtful)), _unknown(std::move(unknown))
    {
    }
    std::string_view doubtAt(const std::string& path) const override
    {
        return _doubtful.contains(path) ? "doubt" : "";
    }
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override
    {
        return _unknown.contains(path) ? std::vector<std::string>{path + ": one", "two"}
                                       : std::vector<std::string>{};
    }

  private:
    Paths _doubtful;
    Paths _unknown;
};

std::string printed(const PlistValue& object, const NodeNotes& notes)
{
    PathIndex index;
    return printTree(*VentrikModelNode::makeTreeFromObject(&object, index), notes);
}

} // namespace

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

TEST(TreePrinter, ADoubtfulValueHasASignBehindIt)
{
    const PlistValue object =
        PlistDictionary{{"A", PlistDictionary{{"k/l", "-200"}, {"m", "-100"}}}};
    EXPECT_EQ(printed(object, FakeNotes({"/A/k/l"}, {})),
              "Ventrik\n  A\n    k/l: -200 ⚠\n    m: -100\n");
}

TEST(TreePrinter, WarningsStandBelowTheirSectionAndNotBelowItsRows)
{
    const PlistValue row = PlistDictionary{{"k", "v"}};
    const PlistValue object = PlistDictionary{{"A", PlistArray{row}}, {"B", row}, {"C", row}};
    EXPECT_EQ(printed(object, FakeNotes({}, {"/A", "/A/0", "/C"})),
              "Ventrik\n"
              "  A\n    /A: one\n    two\n    0\n      k: v\n"
              "  B\n    k: v\n"
              "  C\n    /C: one\n    two\n    k: v\n");
}

TEST(TreePrinter, OfWhatStandsBelowVeryLongNamesNothingIsAsked)
{
    const std::string name(1023, 'n');
    const PlistValue object = PlistDictionary{{name, PlistDictionary{{"k", "v"}}}};
    const FakeNotes notes({"/" + name + "/k"}, {"/" + name});
    EXPECT_EQ(printed(object, notes),
              "Ventrik\n  " + name + "\n    /" + name + ": one\n    two\n    k: v\n");
}

} // namespace ventrik
