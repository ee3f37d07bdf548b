#include "PropertyList/TerminalText.h"

#include "PropertyList/Utf8.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

std::string shown(std::string_view text)
{
    std::string result;
    appendTerminalText(result, text);
    return result;
}

std::string shown(char32_t code)
{
    std::string text = "a";
    appendUtf8(text, code);
    return shown(text + "b");
}

} // namespace

TEST(TerminalText, ShowsControlCharactersOfBothSetsAsABlankEach)
{
    for (char32_t code = 0; code < 0x20; ++code)
        EXPECT_EQ(shown(code), "a b") << std::uint32_t{code};
    for (char32_t code = 0x7f; code <= 0x9f; ++code)
        EXPECT_EQ(shown(code), "a b") << std::uint32_t{code};
    EXPECT_EQ(shown("\x1b[2J\r\n"), " [2J  ");
}

TEST(TerminalText, ShowsMarksThatTurnTheDirectionAsABlankEach)
{
    for (const char32_t code : {0x61c, 0x200e, 0x200f, 0x202a, 0x202b, 0x202c, 0x202d, 0x202e,
                                0x2066, 0x2067, 0x2068, 0x2069})
        EXPECT_EQ(shown(code), "a b") << std::uint32_t{code};
}

TEST(TerminalText, ShowsTheReplacementCharacterForAByteThatIsNotUtf8)
{
    EXPECT_EQ(shown("a\xff\xc3"), "a\xef\xbf\xbd\xef\xbf\xbd");
    EXPECT_EQ(shown("\x9b"
                    "2J"),
              "\xef\xbf\xbd"
              "2J");
}

TEST(TerminalText, KeepsEverythingElse)
{
    EXPECT_EQ(shown(" ~"), " ~");
    for (const char32_t code : {0xa0, 0xe9, 0x61b, 0x200d, 0x2010, 0x2029, 0x202f, 0x2065, 0x206a,
                                0x20ac, 0xfffd, 0x1f4f1}) {
        std::string text;
        appendUtf8(text, code);
        EXPECT_EQ(shown(text), text) << std::uint32_t{code};
    }
}

TEST(TerminalText, AsALineShowsBreaksInsideAndDropsThoseAtTheEnd)
{
    EXPECT_EQ(terminalLine("one\ntwo\r\n\n"), "one\\ntwo");
    EXPECT_EQ(terminalLine("\n"), "");
    EXPECT_EQ(terminalLine("a\rb\tc"), "a b c");
}

} // namespace ventrik
