#include "PropertyList/PropertyListWriter.h"

#include "Tests/PropertyList/PlistText.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::HasSubstr;

// What is written between the <plist> tags.
std::string bodyOf(const PlistValue& value)
{
    const std::string text = writeXmlPropertyList(value).text.value_or("nothing was written");
    const std::size_t start = text.find("<plist version=\"1.0\">\n") + 22;
    return text.substr(start, text.find("</plist>") - start);
}

void expectUnchanged(const PlistValue& value)
{
    const PropertyListWriting writing = writeXmlPropertyList(value);
    ASSERT_TRUE(writing) << writing.error;
    const PropertyListReading back = readXml(*writing.text);
    ASSERT_TRUE(back) << back.error;
    EXPECT_EQ(*back.value, value) << *writing.text;
}

void expectRefused(const PlistValue& value, std::string_view part)
{
    const PropertyListWriting writing = writeXmlPropertyList(value);
    EXPECT_FALSE(writing);
    EXPECT_THAT(writing.error, HasSubstr(std::string(part)));
    EXPECT_EQ(writing.error.find('\n'), std::string::npos);
}

PlistValue nestedArrays(std::size_t depth)
{
    PlistValue value = PlistArray();
    for (std::size_t i = 1; i < depth; ++i)
        value = PlistArray{value};
    return value;
}

} // namespace

TEST(XmlWriter, WritesAWholeDocument)
{
    const PlistValue value =
        PlistDictionary{{"Name", "cell"}, {"List", PlistArray{1, PlistDictionary()}}, {"On", true}};
    EXPECT_EQ(writeXmlPropertyList(value).text, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                                "<plist version=\"1.0\">\n"
                                                "<dict>\n"
                                                "\t<key>Name</key>\n"
                                                "\t<string>cell</string>\n"
                                                "\t<key>List</key>\n"
                                                "\t<array>\n"
                                                "\t\t<integer>1</integer>\n"
                                                "\t\t<dict/>\n"
                                                "\t</array>\n"
                                                "\t<key>On</key>\n"
                                                "\t<true/>\n"
                                                "</dict>\n"
                                                "</plist>\n");
}

TEST(XmlWriter, WritesEveryKind)
{
    EXPECT_EQ(bodyOf(""), "<string></string>\n");
    EXPECT_EQ(bodyOf(-3), "<integer>-3</integer>\n");
    EXPECT_EQ(bodyOf(0.5), "<real>0.5</real>\n");
    EXPECT_EQ(bodyOf(false), "<false/>\n");
    EXPECT_EQ(bodyOf(PlistDate{978307200.9}), "<date>2001-01-01T00:00:00Z</date>\n");
    EXPECT_EQ(bodyOf(Bytes{1, 2}), "<data>\nAQI=\n</data>\n");
    EXPECT_EQ(bodyOf(PlistArray()), "<array/>\n");
}

TEST(XmlWriter, EscapesMarkup)
{
    EXPECT_EQ(bodyOf("a<b>&\"'"), "<string>a&lt;b&gt;&amp;\"'</string>\n");
    EXPECT_EQ(bodyOf(PlistDictionary{{"<&", 1}}),
              "<dict>\n\t<key>&lt;&amp;</key>\n\t<integer>1</integer>\n</dict>\n");
}

TEST(XmlWriter, EscapesCarriageReturns)
{
    EXPECT_EQ(bodyOf("a\r\nb"), "<string>a&#13;\nb</string>\n");
}

TEST(XmlWriter, WritesDataInLinesOf76Characters)
{
    // 57 bytes make 76 characters.
    EXPECT_EQ(bodyOf(Bytes(58, 0)), "<data>\n" + repeated("A", 76) + "\nAA==\n</data>\n");
    EXPECT_EQ(bodyOf(Bytes(57, 0)), "<data>\n" + repeated("A", 76) + "\n</data>\n");
    EXPECT_EQ(bodyOf(Bytes{}), "<data>\n</data>\n");
}

TEST(XmlWriter, WhatIsWrittenReadsBackUnchanged)
{
    const double infinity = std::numeric_limits<double>::infinity();
    expectUnchanged(PlistDictionary{
        {" a\tb\r\n", " \r\n\t"},
        {"", Bytes{0, 1, 0xff}},
        {"\xc3\xa9", PlistArray{0.1, -0.0, std::nan(""), infinity, -infinity, 1e300}},
        {"&amp;", PlistArray{std::numeric_limits<std::uint64_t>::max(),
                             std::numeric_limits<std::int64_t>::min(), 0}},
        {"]]>", PlistArray{PlistDate{-1}, PlistDate{0}, true, false, PlistDictionary(), Bytes()}}});
}

TEST(XmlWriter, NamesThePathOfTextThatXmlCannotCarry)
{
    const PlistValue bad = PlistDictionary{
        {"Data", PlistArray{PlistDictionary{{"Display", PlistDictionary{{"Name", "a\x01"}}}}}}};
    expectRefused(bad, "/Data/0/Display/Name: in the string, XML cannot carry the character "
                       "U+0001 at byte 1");
    expectRefused("\xef\xbf\xbe", "/: in the string, XML cannot carry the character U+FFFE");
    expectRefused("\xef\xbf\xbf", "U+FFFF");
    expectRefused(std::string(1, '\0'), "U+0000");
}

TEST(XmlWriter, RefusesTextThatIsNotUtf8)
{
    expectRefused("ab\xff", "byte 2 is not UTF-8");
    expectRefused(PlistDictionary{{"\xe9\n", 1}}, "/\\xe9\\x0a: in the key, byte 0 is not UTF-8");
}

TEST(XmlWriter, RefusesDatesOutsideTheCalendar)
{
    expectRefused(PlistArray{PlistDate{1e15}}, "/0: the date is outside the years 1 to 9999");
    expectRefused(PlistDate{std::nan("")}, "the date is outside");
}

TEST(XmlWriter, NestingEndsAt512)
{
    expectUnchanged(nestedArrays(512));
    expectRefused(nestedArrays(513), "nesting deeper than 512");
}

TEST(XmlWriter, RefusesAContainerThatHoldsItself)
{
    PlistArray array;
    array.append(array);
    array.append(array);
    expectRefused(array, "nesting deeper than 512");
    array.clear(); // breaks the loop, which would keep itself alive
}

TEST(XmlWriter, EscapesACharacterWhereverItStands)
{
    for (std::size_t place = 0; place < 40; ++place) {
        const std::string before(place, 'a');
        const std::string after(39 - place, 'b');
        EXPECT_THAT(writeXmlPropertyList(before + "&" + after).text.value(),
                    testing::HasSubstr("<string>" + before + "&amp;" + after + "</string>"));
    }
}

TEST(XmlWriter, GivesTheBytesOfAMessage)
{
    const PlistValue value = PlistDictionary{{"a", "b"}};
    const std::string text = writeXmlPropertyList(value).text.value();
    EXPECT_EQ(propertyListBytes(value), Bytes(text.begin(), text.end()));
}

TEST(XmlWriter, GivesNoBytesOfWhatCannotBeWritten)
{
    EXPECT_EQ(propertyListBytes("\x01"), std::nullopt);
}

// What is replaced is counted.
TEST(ReplacingXmlWriter, PutsAReplacementInThePlaceOfWhatXmlCannotCarry)
{
    const auto writing = writeXmlPropertyListReplacing(
        PlistDictionary{{"a\x01", "b\xff\xff"}, {"date", PlistDate{1e15}}, {"good", "c"}});
    ASSERT_TRUE(writing) << writing.error;
    EXPECT_EQ(writing.replaced, 4U);
    EXPECT_EQ(*readPropertyList(Bytes(writing.text->begin(), writing.text->end())).value,
              PlistValue(PlistDictionary{
                  {"a\uFFFD", "b\uFFFD\uFFFD"}, {"date", "\uFFFD"}, {"good", "c"}}));
}

TEST(ReplacingXmlWriter, EndsNestingThatIsTooDeep)
{
    const auto writing = writeXmlPropertyListReplacing(nestedArrays(513));
    ASSERT_TRUE(writing) << writing.error;
    EXPECT_EQ(writing.replaced, 1U);
    EXPECT_TRUE(readPropertyList(Bytes(writing.text->begin(), writing.text->end())));
}

TEST(ReplacingXmlWriter, WritesTheRestAsTheOtherOneDoes)
{
    const PlistDictionary value{{"a", PlistArray{1, "b"}}, {"c", PlistDate{0}}};
    const auto writing = writeXmlPropertyListReplacing(value);
    EXPECT_EQ(writing.text, writeXmlPropertyList(value).text);
    EXPECT_EQ(writing.replaced, 0U);
}

} // namespace ventrik
