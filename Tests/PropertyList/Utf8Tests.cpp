#include "PropertyList/Utf8.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

void expectCharacter(const char* text, char32_t code, std::size_t length)
{
    const Utf8Character character = decodeUtf8(text);
    EXPECT_EQ(character.code, code) << text;
    EXPECT_EQ(character.length, length) << text;
    std::string written;
    appendUtf8(written, code);
    EXPECT_EQ(written, std::string(text).substr(0, length));
}

} // namespace

TEST(Utf8, ReadsAndWritesCharactersOfEveryLength)
{
    expectCharacter("Ab", 'A', 1);
    expectCharacter("\x7f", 0x7f, 1);
    expectCharacter("\xc2\x80", 0x80, 2);
    expectCharacter("\xc3\xa9x", 0xe9, 2);
    expectCharacter("\xdf\xbf", 0x7ff, 2);
    expectCharacter("\xe0\xa0\x80", 0x800, 3);
    expectCharacter("\xe2\x82\xac", 0x20ac, 3);
    expectCharacter("\xf0\x90\x80\x80", 0x10000, 4);
    expectCharacter("\xf4\x8f\xbf\xbf", 0x10ffff, 4);
}

TEST(Utf8, RefusesEverythingElse)
{
    const char* const wrong[] = {
        "\x80",
        "\xc3",
        "\xc3(",
        "\xe2\x82",
        "\xe2(\xac",
        "\xf0\x9f\x98",
        "\xfe",
        "\xff",
        "\xc0\x80",
        "\xc1\xbf",
        "\xe0\x9f\xbf",
        "\xf0\x8f\xbf\xbf", // overlong
        "\xed\xa0\x80",
        "\xed\xbf\xbf", // surrogates
        "\xf4\x90\x80\x80",
        "\xf5\x80\x80\x80", // beyond the last character
    };
    for (const char* text : wrong)
        EXPECT_EQ(decodeUtf8(text).length, 0U) << text;
    EXPECT_EQ(decodeUtf8("").length, 0U);
}

} // namespace ventrik
