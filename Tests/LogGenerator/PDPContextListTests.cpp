#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/UnparsableDataException.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

constexpr std::uint32_t pdpContextsCode = 0xFF0002;

class PDPContextListTest : public ListSectionFixture<PDPContextList>
{
  protected:
    void contexts(const PlistValue& root) { feed(propertyListPacket(pdpContextsCode, root)); }
};

} // namespace

TEST_F(PDPContextListTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "PDP Context Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xFF0002));
}

TEST_F(PDPContextListTest, ShowsTheContextsAsTheyAre)
{
    const PlistArray root{PlistDictionary{{"APN", "internet"}, {"CID", 5}}, "text"};
    contexts(root);
    EXPECT_EQ(rows, root);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "PDPContextList"}));
}

TEST_F(PDPContextListTest, EachPacketReplacesTheWholeList)
{
    contexts(PlistArray{PlistDictionary{{"APN", "internet"}}, PlistDictionary{{"APN", "ims"}}});
    contexts(PlistArray{PlistDictionary{{"APN", "ims"}}});
    EXPECT_EQ(rows, PlistArray{PlistDictionary({{"APN", "ims"}})});
}

TEST_F(PDPContextListTest, AnEmptyArrayEmptiesTheList)
{
    rows.append("row");
    contexts(PlistArray());
    EXPECT_TRUE(rows.empty());
}

TEST_F(PDPContextListTest, ARootThatIsNoArrayChangesNothingSilently)
{
    rows.append("row");
    contexts(PlistDictionary());
    contexts("text");
    EXPECT_EQ(rows, PlistArray{"row"});
    EXPECT_TRUE(log.texts(LogPriority::error).empty());
}

TEST_F(PDPContextListTest, DataThatDoesNotParseIsReportedAndRaised)
{
    rows.append("row");
    EXPECT_THROW(feed(PacketBuilder(pdpContextsCode)), UnparsableDataException);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "PDPContextList"},
                                         Line{3, "PDP context data could not be constructed"}));
    EXPECT_EQ(rows, PlistArray{"row"});
}

} // namespace ventrik
