#include "Tests/LogGenerator/C2KFixture.h"
#include "Tests/LogGenerator/TemplateFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class C2KTemplateTest : public TemplateFixture
{
  protected:
    C2KTemplateTest() : TemplateFixture("C2KTemplate.plist")
    {
        C2KLogGenerator::processTemplate(root, display, lookup, log);
    }

    CapturingSystemLog log;
    PlistDictionary display;
    PlistDictionary lookup;
};

void expectSortedGroups(const PlistDictionary& group)
{
    EXPECT_EQ(textAt(group, {"_sorted"}), "_sorted");
    for (const auto& [label, value] : group) {
        if (label != "_sorted") {
            EXPECT_EQ(label.find(';'), 1U)
                << label; // one digit, so that text order is number order
            EXPECT_EQ(std::count(label.begin(), label.end(), ';'), 1) << label;
            EXPECT_EQ(label.find('/'), std::string::npos) << label;
        }
        if (value.dictionary())
            expectSortedGroups(*value.dictionary());
    }
}

} // namespace

TEST_F(C2KTemplateTest, OffersEveryKeyThatIsPublished)
{
    EXPECT_THAT(keysOf(lookup), testing::UnorderedElementsAreArray(c2kLookupKeys()));
}

TEST_F(C2KTemplateTest, OrdersEveryGroup)
{
    expectSortedGroups(root);
}

TEST_F(C2KTemplateTest, ShowsTheTwoSystemsOneByOne)
{
    EXPECT_THAT(keysOf(display), ElementsAre("_sorted", "1;1x", "2;EV-DO"));
}

} // namespace ventrik
