#include "Tests/PropertyList/PlistText.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

// The value of one element; a failed expectation and an empty string when it does not read.
PlistValue valueOf(std::string_view element)
{
    const PropertyListReading reading = readXmlElement(element);
    EXPECT_EQ(reading.error, "") << element;
    return reading.value.value_or("");
}

} // namespace

TEST(XmlReader, ReadsEveryKind)
{
    EXPECT_EQ(valueOf("<string>text</string>"), PlistValue("text"));
    EXPECT_EQ(valueOf("<integer>-12</integer>"), PlistValue(-12));
    EXPECT_EQ(valueOf("<integer>0x1F</integer>"), PlistValue(31));
    EXPECT_EQ(valueOf("<real>1.5e3</real>"), PlistValue(1500.0));
    EXPECT_EQ(valueOf("<true/>"), PlistValue(true));
    EXPECT_EQ(valueOf("<false></false>"), PlistValue(false));
    EXPECT_EQ(valueOf("<date>2001-01-01T00:00:01Z</date>"), PlistValue(PlistDate{978307201}));
    EXPECT_EQ(valueOf("<data>\n\tAQI=\n</data>"), PlistValue(Bytes{1, 2}));
}

TEST(XmlReader, ReadsContainersInOrder)
{
    const PlistValue value = valueOf("<dict>\n\t<key>b</key><array><true/><array/></array>\n"
                                     "<key>a</key><dict/></dict>");
    EXPECT_EQ(value, PlistValue(PlistDictionary{{"a", PlistDictionary()},
                                                {"b", PlistArray{true, PlistArray()}}}));
    EXPECT_EQ(value.dictionary()->begin()->key, "b");
}

TEST(XmlReader, LetsTheLaterOfTwoEqualKeysReplaceTheEarlierInItsPlace)
{
    const PlistValue value = valueOf("<dict><key>a</key><string>old</string><key>b</key><true/>"
                                     "<key>a</key><string>new</string></dict>");
    ASSERT_EQ(value.dictionary()->size(), 2U);
    EXPECT_EQ(value.dictionary()->begin()->key, "a");
    EXPECT_EQ(value.dictionary()->begin()->value, PlistValue("new"));
}

TEST(XmlReader, KeepsWhiteSpaceOfStringsAndKeys)
{
    EXPECT_EQ(valueOf("<string> \t\n </string>"), PlistValue(" \t\n "));
    EXPECT_EQ(valueOf("<string>  a  </string>"), PlistValue("  a  "));
    EXPECT_EQ(valueOf("<dict><key> </key><string></string></dict>"),
              PlistValue(PlistDictionary{{" ", ""}}));
}

TEST(XmlReader, TakesRawLineEndsAsNewlines)
{
    EXPECT_EQ(valueOf("<string>a\r\nb\rc\r\r\nd&#13;\n</string>"), PlistValue("a\nb\nc\n\nd\r\n"));
    EXPECT_EQ(valueOf("<string><![CDATA[a\r\nb\r]]></string>"), PlistValue("a\nb\n"));
}

TEST(XmlReader, ResolvesPredefinedAndNumericReferencesOnce)
{
    EXPECT_EQ(valueOf("<string>&lt;&gt;&amp;&quot;&apos;</string>"), PlistValue("<>&\"'"));
    EXPECT_EQ(valueOf("<string>&#65;&#x42;&#x20ac;&#x1F600;</string>"),
              PlistValue("AB\xe2\x82\xac\xf0\x9f\x98\x80"));
    EXPECT_EQ(valueOf("<string>&amp;lol;</string>"), PlistValue("&lol;"));
}

TEST(XmlReader, TakesCdataAsItStands)
{
    EXPECT_EQ(valueOf("<string>a<![CDATA[<b>&lol;]]>c</string>"), PlistValue("a<b>&lol;c"));
}

TEST(XmlReader, SkipsCommentsAnywhere)
{
    EXPECT_EQ(readXml("<!-- <a> --><plist><!-- ' --><array><!-- > --><string>a<!-- b -->c</string>"
                      "</array></plist><!-- end -->")
                  .value,
              PlistValue(PlistArray{"ac"}));
}

TEST(XmlReader, SkipsTheDocumentType)
{
    EXPECT_EQ(
        readXml("<!DOCTYPE plist PUBLIC \"-//X//DTD\" \"http://x/>\"><plist><true/></plist>").value,
        PlistValue(true));
    EXPECT_EQ(readXml("<!DOCTYPE plist [<!ELEMENT a (b)><!ENTITY c \"]>\"><!-- ]> ' --><?p ]>'?>]>"
                      "<plist><true/></plist>")
                  .value,
              PlistValue(true));
}

TEST(XmlReader, PassesOverAttributesAndInstructions)
{
    EXPECT_EQ(
        readXml("<plist version=\"1.0\" a = '>' >\n<?a <b>?><true b=\"/>\"/></plist ><?c?>").value,
        PlistValue(true));
    EXPECT_EQ(readXml("<string a.1-b='&lt;&#65;'>x<?a?>y</string>").value, PlistValue("xy"));
}

TEST(XmlReader, AcceptsAByteOrderMarkAndTheNamesOfItsEncoding)
{
    EXPECT_EQ(
        readXml("\xef\xbb\xbf<?xml version='1.0' encoding='utf-8'?><plist><true/></plist>").value,
        PlistValue(true));
    EXPECT_EQ(readXml("<?xml version=\"1.0\" encoding=\"US-ASCII\"?><plist><true/></plist>").value,
              PlistValue(true));
    EXPECT_EQ(readXml("<?xml version=\"1.0\"?><plist><true/></plist>").value, PlistValue(true));
}

TEST(XmlReader, AcceptsAValueWithoutThePlistElement)
{
    EXPECT_EQ(readXml("<dict><key>a</key><true/></dict>\n").value,
              PlistValue(PlistDictionary{{"a", true}}));
}

TEST(XmlReader, ReadsNumbersOfTheWholeRange)
{
    EXPECT_EQ(valueOf("<integer>18446744073709551615</integer>"),
              PlistValue(std::numeric_limits<std::uint64_t>::max()));
    EXPECT_EQ(valueOf("<integer> -9223372036854775808 </integer>"),
              PlistValue(std::numeric_limits<std::int64_t>::min()));
    EXPECT_EQ(valueOf("<real>-Infinity</real>"),
              PlistValue(-std::numeric_limits<double>::infinity()));
    EXPECT_EQ(valueOf("<real>NaN</real>"), PlistValue(std::nan("")));
}

TEST(XmlReader, ReadsTextBeyondAscii)
{
    EXPECT_EQ(valueOf("<string>\xc3\xa9\xe2\x82\xac</string>"), PlistValue("\xc3\xa9\xe2\x82\xac"));
}

} // namespace ventrik
