#include "Report/ReportValues.h"
#include "Tests/Report/ReportFixture.h"

namespace ventrik
{

namespace
{

using testing::HasSubstr;
using testing::Not;

class ReportValuesTest : public ReportFixture
{
  protected:
    std::string page(std::size_t mostBytes = 100000) const
    {
        HtmlWriter html;
        DisplayMoment end = store.at(store.present());
        writeValues(html, end, mostBytes);
        return html.written();
    }
};

PlistDictionary tree()
{
    const PlistDictionary cell{{"Level", "-90 dBm"}};
    return {{"Note", "<&\">"},
            {"Cells", PlistDictionary{{"Count", "2"}, {"List", PlistArray{cell, cell}}}},
            {"None", PlistDictionary()}};
}

} // namespace

TEST_F(ReportValuesTest, HasTheTreeWithItsLists)
{
    show(tree());
    EXPECT_THAT(page(), HasSubstr("<h3>Cells</h3>\n<table class=\"values\"><tbody><tr>"
                                  "<th scope=\"row\">Count</th>\n<td>2</td>\n</tr>"));
    EXPECT_THAT(page(), HasSubstr("<summary>List</summary>\n"
                                  "<details open=\"open\"><summary>0</summary>\n"));
    EXPECT_THAT(page(), HasSubstr("<h3>None</h3>\n<p class=\"note\">Empty.</p>"));
}

TEST_F(ReportValuesTest, EscapesValues)
{
    show(tree());
    EXPECT_THAT(page(), HasSubstr("<td>&lt;&amp;"));
    EXPECT_THAT(page(), Not(HasSubstr("<&")));
}

TEST_F(ReportValuesTest, CountsTheValuesThatHaveNoRoom)
{
    show(tree());
    EXPECT_THAT(page(), Not(HasSubstr("left out")));
    EXPECT_THAT(page(0), HasSubstr("4 more values are left out."));
}

TEST_F(ReportValuesTest, SaysWhereThereIsNothing)
{
    EXPECT_THAT(page(), HasSubstr("None."));
}

} // namespace ventrik
