#include "PropertyList/Json.h"

#include <gtest/gtest.h>

#include <limits>

namespace ventrik
{

namespace
{

std::string json(const PlistValue& value)
{
    std::string text;
    appendJson(text, value);
    return text;
}

} // namespace

TEST(Json, WritesScalars)
{
    EXPECT_EQ(json("a"), "\"a\"");
    EXPECT_EQ(json(-5), "-5");
    EXPECT_EQ(json(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615");
    EXPECT_EQ(json(0.5), "0.5");
    EXPECT_EQ(json(true), "true");
    EXPECT_EQ(json(false), "false");
}

TEST(Json, WritesDataAndDatesAsObjects)
{
    EXPECT_EQ(json(Bytes{1, 2, 3}), "{\"data\": \"AQID\"}");
    EXPECT_EQ(json(PlistDate{1794809428}), "{\"date\": \"2026-11-16T06:10:28Z\"}");
}

TEST(Json, KeepsTheOrderOfKeysAndElements)
{
    EXPECT_EQ(json(PlistDictionary{{"b", "1"}, {"a", PlistArray{"x", 2}}}),
              "{\"b\": \"1\", \"a\": [\"x\", 2]}");
}

TEST(Json, WritesEmptyContainers)
{
    EXPECT_EQ(json(PlistDictionary()), "{}");
    EXPECT_EQ(json(PlistArray()), "[]");
}

TEST(Json, EscapesWhatJsonDemands)
{
    EXPECT_EQ(json("\"\\\n\t\r\x01/\x7f"), "\"\\\"\\\\\\n\\t\\u000d\\u0001/\x7f\"");
    EXPECT_EQ(json(PlistDictionary{{"a\"b", "\xe2\x82\xac"}}), "{\"a\\\"b\": \"\xe2\x82\xac\"}");
}

TEST(Json, EscapesACharacterWhereverItStands)
{
    for (std::size_t place = 0; place < 40; ++place) {
        const std::string before(place, 'a');
        const std::string after(39 - place, 'b');
        EXPECT_EQ(json(before + "\"" + after), "\"" + before + "\\\"" + after + "\"");
    }
}

TEST(Json, WritesNullForWhatItDoesNotHave)
{
    EXPECT_EQ(json(std::numeric_limits<double>::infinity()), "null");
    EXPECT_EQ(json(std::numeric_limits<double>::quiet_NaN()), "null");
    EXPECT_EQ(json(PlistDate{1e18}), "null");
}

} // namespace ventrik
