#include "PropertyList/Base64.h"

#include "Tests/PropertyList/PlistText.h"

#include <gtest/gtest.h>

namespace ventrik
{

TEST(Base64, WritesEachLengthOfTheLastGroup)
{
    EXPECT_EQ(encodeBase64({}), "");
    EXPECT_EQ(encodeBase64(bytesOf("f")), "Zg==");
    EXPECT_EQ(encodeBase64(bytesOf("fo")), "Zm8=");
    EXPECT_EQ(encodeBase64(bytesOf("foo")), "Zm9v");
    EXPECT_EQ(encodeBase64(Bytes{0xfb, 0xff, 0xbf}), "+/+/");
}

TEST(Base64, ReadsEachLengthOfTheLastGroup)
{
    EXPECT_EQ(decodeBase64(""), Bytes{});
    EXPECT_EQ(decodeBase64("Zg=="), bytesOf("f"));
    EXPECT_EQ(decodeBase64("Zm8="), bytesOf("fo"));
    EXPECT_EQ(decodeBase64("Zm9v"), bytesOf("foo"));
}

TEST(Base64, IgnoresWhiteSpaceAnywhere)
{
    EXPECT_EQ(decodeBase64("\n\tZ m\r\n8\t= \n"), bytesOf("fo"));
}

TEST(Base64, RefusesWrongCharacters)
{
    EXPECT_FALSE(decodeBase64("Zm9*"));
    EXPECT_FALSE(decodeBase64("Zm9\x80"));
    EXPECT_FALSE(decodeBase64("Zm9-"));
}

TEST(Base64, RefusesWrongPadding)
{
    EXPECT_FALSE(decodeBase64("Zg"));
    EXPECT_FALSE(decodeBase64("Zg="));
    EXPECT_FALSE(decodeBase64("Z==="));
    EXPECT_FALSE(decodeBase64("Zg==Zg=="));
    EXPECT_FALSE(decodeBase64("===="));
    EXPECT_FALSE(decodeBase64("Z"));
}

} // namespace ventrik
