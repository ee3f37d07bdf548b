#include "Tools/Watch/TextCells.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <clocale>

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class TextCells : public testing::Test
{
  protected:
    TextCells() { EXPECT_TRUE(std::setlocale(LC_CTYPE, "C.UTF-8")); }
};

} // namespace

TEST_F(TextCells, ATextThatFitsStaysWhole)
{
    EXPECT_EQ(cutToWidth("Band 3", 6), "Band 3");
    EXPECT_EQ(cutFrontToWidth("Band 3", 6), "Band 3");
    EXPECT_EQ(cutToWidth("", 5), "");
}

TEST_F(TextCells, WhatIsCutOffBecomesAnEllipsis)
{
    EXPECT_EQ(cutToWidth("Band 3", 5), "Band…");
    EXPECT_EQ(cutFrontToWidth("Band 3", 5), "…nd 3");
    EXPECT_EQ(cutToWidth("Band 3", 1), "…");
    EXPECT_EQ(cutToWidth("Band 3", 0), "");
}

TEST_F(TextCells, WideCharactersTakeTwoColumnsAndAreNeverHalved)
{
    EXPECT_EQ(widthOf("東京", 10), 4);
    EXPECT_EQ(cutToWidth("東京都", 5), "東京…");
    EXPECT_EQ(cutToWidth("東京都", 4), "東…");
    EXPECT_EQ(cutFrontToWidth("東京都", 4), "…都");
}

TEST_F(TextCells, CombiningMarksStayWithTheirCharacter)
{
    EXPECT_EQ(widthOf("e\u0301a", 10), 2);
    EXPECT_EQ(cutToWidth("e\u0301abc", 3), "e\u0301a…");
}

TEST_F(TextCells, OfManyMarksFourStay)
{
    std::string marks;
    for (int count = 0; count < 50; ++count)
        marks += "\u0301";
    EXPECT_EQ(cutToWidth("e" + marks + "a", 5), "e\u0301\u0301\u0301\u0301a");
}

TEST_F(TextCells, AMarkOnNothingStandsOnABlank)
{
    EXPECT_EQ(cutToWidth("\u0301a", 5), " \u0301a");
}

TEST_F(TextCells, ATerminalObeysNothing)
{
    EXPECT_EQ(cutToWidth("a\x1b[2J\tb\u009b", 20), "a [2J b ");
    EXPECT_EQ(cutToWidth("a\u202eb\xffz", 20), "a b\ufffdz");
}

TEST_F(TextCells, WhatJoinsCharactersIsLeftOut)
{
    EXPECT_EQ(cutToWidth("a\u200db\ufe0fc\u00adend", 20), "abcend");
}

TEST_F(TextCells, OfALongTextOnlyTheStartIsLookedAt)
{
    const std::string text(std::size_t{100} << 20, 'x');
    EXPECT_EQ(widthOf(text, 80), 81);
    EXPECT_EQ(cutToWidth(text, 3), "xx…");
    EXPECT_EQ(cutFrontToWidth(text, 3), "…xx");
}

TEST_F(TextCells, ATextIsWrappedAtBlanks)
{
    EXPECT_THAT(wrapToWidth("one two three", 8), ElementsAre("one two ", "three"));
    EXPECT_THAT(wrapToWidth("", 8), ElementsAre(""));
}

TEST_F(TextCells, ALongWordIsBrokenWhereTheLineEnds)
{
    EXPECT_THAT(wrapToWidth("abcdefghij", 4), ElementsAre("abcd", "efgh", "ij"));
    EXPECT_THAT(wrapToWidth("東京都庁", 5), ElementsAre("東京", "都庁"));
}

TEST_F(TextCells, LineBreaksOfATextAreKept)
{
    EXPECT_THAT(wrapToWidth("a\nb\n", 8), ElementsAre("a", "b", ""));
}

} // namespace ventrik
