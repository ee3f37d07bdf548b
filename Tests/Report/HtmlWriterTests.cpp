#include "Report/HtmlWriter.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::EndsWith;
using testing::HasSubstr;

} // namespace

TEST(HtmlWriter, EscapesWhatWouldBeMarkup)
{
    HtmlWriter html;
    html.element("td", R"(<b>&"x"</b>)", R"(class="number")");
    EXPECT_THAT(html.written(), HasSubstr("<td class=\"number\">&lt;b&gt;&amp;"));
    EXPECT_THAT(html.written(), EndsWith("&lt;/b&gt;</td>\n"));
}

TEST(HtmlWriter, EndsElementsInsideOut)
{
    HtmlWriter html;
    {
        const auto table = html.inside("table");
        const auto row = html.inside("tr");
        html.text("x");
    }
    EXPECT_EQ(html.written(), "<table><tr>x</tr>\n</table>\n");
}

TEST(HtmlWriter, ReplacesWhatNoDocumentCarries)
{
    HtmlWriter html;
    html.text("a\x01"
              "b\xFF");
    EXPECT_EQ(html.written(), "a\uFFFDb\uFFFD");
}

TEST(HtmlWriter, CutsLongTextsBetweenCharactersAndSaysHowLongTheyWere)
{
    HtmlWriter html;
    html.text(std::string(HtmlWriter::longestText - 1, 'x') + "é and more");
    EXPECT_EQ(html.written(), std::string(HtmlWriter::longestText - 1, 'x') + "… (310 bytes)");
}

} // namespace ventrik
