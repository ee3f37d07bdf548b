#include "Tests/PropertyList/PlistText.h"

#include <gmock/gmock.h>

namespace ventrik
{

using testing::HasSubstr;

namespace
{

std::string nestedArrays(std::size_t depth)
{
    return "<plist>" + repeated("<array>", depth) + repeated("</array>", depth) + "</plist>";
}

} // namespace

TEST(XmlReaderLimits, NestingEndsAt512)
{
    EXPECT_TRUE(readXml(nestedArrays(512)));
    EXPECT_THAT(readXml(nestedArrays(513)).error, HasSubstr("nesting deeper than 512 at byte"));
    EXPECT_THAT(readXml(nestedArrays(600)).error, HasSubstr("nested deeper than"));
}

TEST(XmlReaderLimits, AValueMayStandInTheInnermostContainer)
{
    const std::string document =
        "<plist>" + repeated("<array>", 512) + "<true/>" + repeated("</array>", 512) + "</plist>";
    EXPECT_TRUE(readXml(document));
}

TEST(XmlReaderLimits, TenMillionNestedArraysAreTooLarge)
{
    EXPECT_THAT(readXml(repeated("<array>", 10'000'000)).error,
                HasSubstr("70000000 bytes are more than the 67108864 allowed"));
}

TEST(XmlReaderLimits, NineMillionNestedArraysAreTooDeep)
{
    EXPECT_THAT(readXml(repeated("<array>", 9'000'000)).error, HasSubstr("nested deeper than"));
}

TEST(XmlReaderLimits, NestingCannotHideBehindAttributesOrUnknownNames)
{
    EXPECT_THAT(readXml(repeated("<a b=\"/>\">", 600)).error, HasSubstr("nested deeper than"));
    EXPECT_THAT(readXml(repeated("<a b='/'>", 600)).error, HasSubstr("nested deeper than"));
}

TEST(XmlReaderLimits, ManySiblingsAreNotDeep)
{
    const std::string document =
        "<plist><array>" + repeated("<array/><true/><string>a</string>", 2000) + "</array></plist>";
    const PropertyListReading reading = readXml(document);
    ASSERT_TRUE(reading) << reading.error;
    EXPECT_EQ(reading.value->array()->size(), 6000U);
}

TEST(XmlReaderLimits, ElementsEndAtTwoMillion)
{
    // With <plist> and <array> these are 2,000,000 elements, and one more.
    const std::string open = "<plist><array>" + repeated("<true/>", 1'999'998);
    EXPECT_TRUE(readXml(open + "</array></plist>"));
    EXPECT_THAT(readXml(open + "<true/></array></plist>").error,
                HasSubstr("more than 2000000 elements at byte"));
}

TEST(XmlReaderLimits, AnEntityBombIsNeverExpanded)
{
    std::string document = "<!DOCTYPE plist [<!ENTITY lol0 \"lol\">";
    for (int i = 1; i < 30; ++i)
        document += "<!ENTITY lol" + std::to_string(i) + " \"" +
                    repeated("&lol" + std::to_string(i - 1) + ";", 10) + "\">";
    document += "]><plist><string>&lol29;</string></plist>";
    EXPECT_THAT(readXml(document).error, HasSubstr("unknown entity \"lol29\""));
}

TEST(XmlReaderLimits, ErrorsStayShort)
{
    const std::string name = repeated("x", 100'000);
    EXPECT_LT(readXml("<" + name + "/>").error.size(), 300U);
    EXPECT_LT(readXmlElement("<string>&" + name + ";</string>").error.size(), 300U);
    EXPECT_LT(readXmlElement("<integer>" + name + "</integer>").error.size(), 300U);
}

} // namespace ventrik
