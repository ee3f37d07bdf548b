#include "Tests/PropertyList/PlistText.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::HasSubstr;

// Expects no value and one line that holds the given text.
void expectError(std::string_view document, std::string_view part)
{
    const PropertyListReading reading = readXml(document);
    EXPECT_FALSE(reading) << document.substr(0, 200);
    EXPECT_THAT(reading.error, HasSubstr(std::string(part))) << document.substr(0, 200);
    EXPECT_EQ(reading.error.find('\n'), std::string::npos);
}

void expectElementError(std::string_view element, std::string_view part)
{
    expectError("<plist>" + std::string(element) + "</plist>", part);
}

} // namespace

TEST(XmlReaderDamage, EveryPrefixOfADocumentIsAnError)
{
    const std::string document =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<!DOCTYPE plist [<!ENTITY a 'b'>]>\n"
        "<plist version=\"1.0\"><!-- c -->\n<dict><key>a&amp;</key><array><string>\xc3\xa9</string>"
        "<integer>12</integer><data>AQI=</data><true/></array></dict></plist>";
    ASSERT_TRUE(readXml(document));
    for (std::size_t length = 0; length < document.size(); ++length)
        expectError(std::string_view(document).substr(0, length), "XML property list: ");
}

TEST(XmlReaderDamage, RootMustHoldOneValue)
{
    expectError("", "no value in the document");
    expectError("<html><true/></html>", "<html> at byte 0 is no property-list value");
    expectError("<plist/>", "no value in the <plist> element");
    expectError("<plist><true/><false/></plist>", "<false> at byte 14 is a second value");
    expectError("<plist><true/></plist><dict/>", "<dict> at byte 22 is a second value");
    expectError("<plist><plist><true/></plist></plist>", "<plist> at byte 7 is no");
}

TEST(XmlReaderDamage, TextBetweenElementsIsAnError)
{
    expectError("x<plist><true/></plist>", "at byte 0");
    expectError("<plist><true/></plist>x", "text between elements at byte 22");
    expectElementError("<true/>x", "text between elements");
    expectElementError("<array>x<true/></array>", "text between elements at byte 14");
    expectElementError("<dict><key>a</key>x<true/></dict>", "text between elements");
    expectElementError("<array><![CDATA[ ]]></array>", "text between elements");
}

TEST(XmlReaderDamage, KeysAndValuesMustAlternate)
{
    expectElementError("<dict><key>a</key></dict>", "<key> at byte 13 has no value");
    expectElementError("<dict><key>a</key><key>b</key><true/></dict>", "has no value");
    expectElementError("<dict><true/></dict>", "<true> at byte 13 stands without a key");
    expectElementError("<dict><key>a</key><true/><false/></dict>", "<false> at byte 32 stands");
    expectElementError("<key>a</key>", "<key> at byte 7 is no property-list value");
}

TEST(XmlReaderDamage, UnknownElementsAreErrors)
{
    expectElementError("<array><null/></array>", "<null> at byte 14");
    expectElementError("<string>a<b/></string>", "<b> at byte 16 inside <string> at byte 7");
    expectElementError("<true>yes</true>", "<true> at byte 7 holds text");
}

TEST(XmlReaderDamage, MalformedContentIsQuoted)
{
    expectElementError("<integer>1x</integer>", "<integer> at byte 7 holds \"1x\"");
    expectElementError("<integer/>", "<integer> at byte 7 holds \"\"");
    expectElementError("<integer>18446744073709551616</integer>", "18446744073709551616");
    expectElementError("<real>1,5</real>", "\"1,5\"");
    expectElementError("<date>2023-02-29T00:00:00Z</date>", "<date> at byte 7");
    expectElementError("<data>AQI</data>", "<data> at byte 7");
    expectElementError("<data>A\n*==</data>", "\"A\\x0a*==\"");
}

TEST(XmlReaderDamage, UnknownEntitiesAreNamed)
{
    expectElementError("<string>a&lol;</string>", "unknown entity \"lol\" at byte 16");
    expectElementError("<dict><key>&nbsp;</key><true/></dict>", "unknown entity \"nbsp\"");
    expectError("<plist version=\"&v;\"><true/></plist>", "unknown entity \"v\" at byte 16");
    expectElementError("<string>a & b</string>", "\"&\" at byte 17 starts no reference");
    expectElementError("<string>&;</string>", "starts no reference");
}

TEST(XmlReaderDamage, ReferencesToCharactersThatXmlCannotCarryAreErrors)
{
    for (const char* reference : {"&#0;", "&#x1;", "&#11;", "&#xD800;", "&#xFFFE;", "&#x110000;",
                                  "&#99999999999999999999;", "&#;", "&#x;", "&#-1;", "&#X41;"})
        expectElementError("<string>" + std::string(reference) + "</string>",
                           "refers to no character that XML can carry");
}

TEST(XmlReaderDamage, OnlyUtf8IsRead)
{
    expectElementError("<string>\xe9</string>", "byte 15 is not UTF-8");
    expectElementError("<string>\xed\xa0\x80</string>", "byte 15 is not UTF-8");
    expectElementError(std::string_view("<string>\0</string>", 18), "U+0000 at byte 15");
    expectElementError("<string>\x01</string>", "U+0001 at byte 15");
    expectError("\xff\xfe<\0p\0", "byte 0 is not UTF-8");
    expectError("<?xml version=\"1.0\" encoding=\"UTF-16\"?><plist><true/></plist>",
                "the encoding \"UTF-16\" declared at byte 0 is not UTF-8");
    expectError("<?xml version='1.0' encoding='ISO-8859-1'?><plist><true/></plist>", "ISO-8859-1");
    expectError("<plist><?xml encoding='UTF-16'?><true/></plist>", "is not at the start");
}

TEST(XmlReaderDamage, MarkupMustBeClosed)
{
    expectError("<plist><array><true/></plist>", "at byte");
    expectError("<plist><true/><!-- x</plist>", "the comment at byte 14 has no end");
    expectError("<plist><string><![CDATA[x</string></plist>", "the CDATA section at byte 15");
    expectError("<?xml version='1.0'", "the processing instruction at byte 0 has no end");
    expectError("<plist><true a='></plist>", "the quoted text at byte 15 has no end");
    expectError("<!DOCTYPE plist [<!ENTITY a 'b'>", "the document type line at byte 0");
    expectError("</plist>", "at byte");
}

TEST(XmlReaderDamage, TagsMustPair)
{
    expectError("<plist><array></plist>", "</plist> at byte 14 does not end <array> at byte 7");
    expectError("<plist><array>", "<array> at byte 7 has no end");
    expectError("<true/></true>", "</true> at byte 7 ends nothing");
    expectError("<true></truer>", "</truer> at byte 6 does not end <true> at byte 0");
}

TEST(XmlReaderDamage, TagsMustBeWellFormed)
{
    for (const char* tag : {"< true/>", "<true/ >", "<1a>", "<true a/>", "<true a=1/>",
                            "<true a=''b=''/>", "<true '/>", "<true \xc2\xa0/>", "<>", "</>",
                            "<!true/>", "<true></true a=''>", "<tr<ue/>"})
        expectError(tag, "is malformed");
    expectError("<plist><true a", "the tag at byte 7 has no end");
    expectError("<plist><true", "the tag at byte 7 has no end");
    expectError("<plist><?1?></plist>", "the processing instruction at byte 7 has no name");
}

TEST(XmlReaderDamage, MalformedMarkupIsToldBeforeWhatIsWrongWithTheValues)
{
    expectError("<plist><null/>x<true></plist>", "</plist> at byte 21 does not end <true>");
    expectError("<plist><true/></plist><false/><!--", "the comment at byte 30 has no end");
}

TEST(XmlReaderDamage, ACharacterIsFoundWhereverItStands)
{
    for (std::size_t place = 0; place < 70; ++place) {
        std::string text(70, 'a');
        text[place] = '\x1f';
        expectError("<string>" + text + "</string>", "U+001F at byte " + std::to_string(8 + place));
        text[place] = '\xff';
        expectError("<string>" + text + "</string>",
                    "byte " + std::to_string(8 + place) + " is not UTF-8");
    }
}

TEST(XmlReaderDamage, DocumentTypeStandsOnceAndBeforeTheRoot)
{
    expectError("<plist><!DOCTYPE plist><true/></plist>", "document type line at byte 7");
    expectError("<!DOCTYPE a><!DOCTYPE b><plist><true/></plist>", "document type line at byte 12");
}

} // namespace ventrik
