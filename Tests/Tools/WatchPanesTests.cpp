#include "Tools/Watch/WatchPanes.h"

#include "Tests/Tools/WatchTree.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using Key = KeyPress::Key;
using Mode = WatchPanes::Mode;
using Outcome = WatchPanes::Outcome;

class Panes : public testing::Test
{
  protected:
    Panes()
    {
        tree.show(radioDisplay());
        panes.reload();
    }
    void press(std::initializer_list<Key> keys)
    {
        for (const Key key : keys)
            panes.handle({key});
    }
    void type(std::u32string_view text)
    {
        for (const char32_t character : text)
            panes.handle({Key::Character, character});
    }
    void refresh(const PlistValue& display)
    {
        tree.show(display);
        panes.reload();
    }
    std::string path() const { return panes.pane().path; }
    std::string row() const
    {
        const VentrikModelNode* node = panes.pane().selectedRow();
        return node ? node->displayName() : "none";
    }
    int place() const { return panes.pane().place.selected; }

    WatchTree tree;
    WatchPanes panes{tree};
};

PlistArray listOf(int rows)
{
    PlistArray list;
    for (int row = 0; row < rows; ++row)
        list.append(std::to_string(row));
    return list;
}

} // namespace

TEST_F(Panes, BeginAtTheRootAlsoWithoutATree)
{
    WatchTree none;
    WatchPanes empty(none);
    EXPECT_EQ(empty.pane().path, "/");
    EXPECT_EQ(empty.pane().title(), "Ventrik");
    EXPECT_EQ(empty.pane().rowCount(), 0);
    EXPECT_EQ(empty.handle({Key::Enter}), Outcome::Stays);
    EXPECT_EQ(empty.handle({Key::Down}), Outcome::Stays);
    EXPECT_EQ(empty.panes().size(), 1U);
}

TEST_F(Panes, ArrowsMoveTheSelectionAndStopAtTheEnds)
{
    press({Key::Up});
    EXPECT_EQ(row(), "Serving Cell");
    press({Key::Down});
    EXPECT_EQ(row(), "Neighbors");
    press({Key::Down, Key::Down, Key::Down});
    EXPECT_EQ(row(), "State");
}

TEST_F(Panes, LettersMoveTheSelectionToo)
{
    type(U"jjk");
    EXPECT_EQ(row(), "Neighbors");
}

TEST_F(Panes, PageKeysMoveByWhatShowsLessOneRow)
{
    refresh(listOf(100));
    panes.fitPane(0, 10);
    press({Key::PageDown});
    EXPECT_EQ(place(), 9);
    press({Key::PageDown});
    EXPECT_EQ(place(), 18);
    EXPECT_EQ(panes.pane().place.first, 9);
    press({Key::PageUp});
    EXPECT_EQ(place(), 9);
    press({Key::End});
    EXPECT_EQ(place(), 99);
    EXPECT_EQ(panes.pane().place.first, 90);
    press({Key::Home});
    EXPECT_EQ(place(), 0);
    EXPECT_EQ(panes.pane().place.first, 0);
}

TEST_F(Panes, ALowerScreenKeepsTheSelectedRowInSight)
{
    refresh(listOf(100));
    panes.fitPane(0, 20);
    press({Key::PageDown});
    panes.fitPane(0, 5);
    EXPECT_EQ(panes.pane().place.first, 15);
}

TEST_F(Panes, EnterAndRightOpenARowThatLeadsOn)
{
    press({Key::Down, Key::Enter, Key::Down, Key::Right});
    EXPECT_EQ(path(), "/Neighbors/1");
    EXPECT_EQ(panes.pane().title(), "1");
    EXPECT_EQ(panes.panes().size(), 3U);
}

TEST_F(Panes, LeftBackspaceAndEscapeGoBackToTheRowThatWasOpened)
{
    for (const Key key : {Key::Left, Key::Backspace, Key::Escape}) {
        press({Key::Home, Key::Down, Key::Enter, Key::Down, key});
        EXPECT_EQ(path(), "/");
        EXPECT_EQ(row(), "Neighbors");
    }
    press({Key::Escape});
    EXPECT_EQ(path(), "/");
}

TEST_F(Panes, EnterOrSpaceOnAValueShowsItWholeAndAnyKeyGoesBack)
{
    press({Key::Enter, Key::Enter});
    EXPECT_EQ(panes.mode(), Mode::WholeText);
    press({Key::Escape});
    EXPECT_EQ(panes.mode(), Mode::Rows);
    EXPECT_EQ(path(), "/Serving Cell");
    type(U" ");
    EXPECT_EQ(panes.mode(), Mode::WholeText);
    press({Key::Enter});
    EXPECT_EQ(panes.mode(), Mode::Rows);
}

TEST_F(Panes, RightOnAValueDoesNothing)
{
    press({Key::Enter, Key::Right});
    EXPECT_EQ(panes.mode(), Mode::Rows);
    EXPECT_EQ(path(), "/Serving Cell");
}

TEST_F(Panes, ABoxScrollsWithinItsLines)
{
    press({Key::Enter, Key::Enter, Key::Down, Key::Down, Key::Down});
    panes.fitBox(3, 5);
    EXPECT_EQ(panes.boxScroll(), 2);
    press({Key::Up});
    EXPECT_EQ(panes.boxScroll(), 1);
    press({Key::Home});
    EXPECT_EQ(panes.boxScroll(), 0);
}

TEST_F(Panes, QuitOnTheKeyEverywhereButInASearch)
{
    const KeyPress q{Key::Character, 'q'};
    EXPECT_EQ(panes.handle(q), Outcome::Quits);
    type(U"?");
    EXPECT_EQ(panes.mode(), Mode::Keys);
    EXPECT_EQ(panes.handle(q), Outcome::Quits);
    press({Key::Escape});
    type(U"/");
    EXPECT_EQ(panes.handle(q), Outcome::Stays);
    EXPECT_EQ(panes.sought(), "q");
}

TEST_F(Panes, AValueHasChangedUntilTheNextRefresh)
{
    press({Key::Enter});
    EXPECT_FALSE(panes.pane().isChanged(0));
    refresh(radioDisplay("302"));
    EXPECT_TRUE(panes.pane().isChanged(0));
    EXPECT_FALSE(panes.pane().isChanged(1));
    refresh(radioDisplay("302"));
    EXPECT_FALSE(panes.pane().isChanged(0));
}

TEST_F(Panes, TheSelectionFollowsItsRow)
{
    press({Key::Down, Key::Down});
    refresh(PlistDictionary{{"New", "1"}, {"Serving Cell", "2"}, {"Other", "3"}, {"State", "4"}});
    EXPECT_EQ(row(), "State");
}

TEST_F(Panes, TheSelectionStaysInTheListWhereItsRowHasGone)
{
    press({Key::Down, Key::Down});
    refresh(PlistDictionary{{"Serving Cell", "2"}, {"Other", "3"}});
    EXPECT_EQ(row(), "Other");
}

TEST_F(Panes, RowsStayWhereTheyAreOnTheScreenWhenOthersComeAboveThem)
{
    refresh(listOf(100));
    panes.fitPane(0, 10);
    press({Key::End});
    PlistDictionary more{{"a", "1"}, {"b", "2"}};
    for (int row = 0; row < 100; ++row)
        more.set(std::to_string(row), "x");
    refresh(more);
    EXPECT_EQ(row(), "99");
    EXPECT_EQ(panes.pane().place.first, 92);
}

TEST_F(Panes, APaneThatHasGoneGoesWithThoseBehindIt)
{
    press({Key::Down, Key::Enter, Key::End, Key::Enter});
    ASSERT_EQ(path(), "/Neighbors/2");
    refresh(radioDisplay("301", 2));
    EXPECT_EQ(path(), "/Neighbors");
    EXPECT_EQ(row(), "1");
    refresh(PlistDictionary{{"State", "Idle"}});
    EXPECT_EQ(path(), "/");
}

TEST_F(Panes, ARootThatHasGoneLeavesAnEmptyPane)
{
    press({Key::Enter});
    refresh("text");
    EXPECT_EQ(panes.panes().size(), 1U);
    EXPECT_EQ(panes.pane().rowCount(), 0);
}

TEST_F(Panes, AWholeTextIsNeverAnotherRows)
{
    press({Key::Down, Key::Down, Key::Enter});
    ASSERT_EQ(panes.mode(), Mode::WholeText);
    refresh(radioDisplay("302"));
    EXPECT_EQ(panes.mode(), Mode::WholeText);
    refresh(PlistDictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}});
    EXPECT_EQ(panes.mode(), Mode::Rows);
}

TEST_F(Panes, OnlyValuesAreAskedForDoubts)
{
    tree.doubts["/Serving Cell"] = "of a section";
    tree.doubts["/Serving Cell/Cell ID"] = "out of range";
    EXPECT_EQ(panes.doubtOfSelected(), "");
    press({Key::Enter});
    EXPECT_EQ(panes.doubtOfSelected(), "out of range");
    press({Key::Down});
    EXPECT_EQ(panes.doubtOfSelected(), "");
}

TEST_F(Panes, ASearchNarrowsWhileItIsTyped)
{
    type(U"/");
    EXPECT_EQ(panes.mode(), Mode::Finding);
    EXPECT_EQ(panes.found().count(), 11U);
    type(U"pci");
    EXPECT_EQ(panes.found().count(), 3U);
    press({Key::Backspace, Key::Backspace, Key::Backspace});
    EXPECT_EQ(panes.found().count(), 11U);
    EXPECT_EQ(panes.mode(), Mode::Finding);
    press({Key::Backspace});
    EXPECT_EQ(panes.mode(), Mode::Rows);
}

TEST_F(Panes, BackspaceTakesAWholeCharacter)
{
    type(U"/aé");
    press({Key::Backspace});
    EXPECT_EQ(panes.sought(), "a");
}

TEST_F(Panes, ASearchTakesNoControlCharactersAndNoMoreThanALine)
{
    type(U"/a\u0004\u009b");
    EXPECT_EQ(panes.sought(), "a");
    type(std::u32string(1000, 'x'));
    EXPECT_EQ(panes.sought().size(), 200U);
}

TEST_F(Panes, EnterOpensThePaneOfTheRowFound)
{
    press({Key::Enter});
    type(U"/pci");
    press({Key::Down, Key::Enter});
    EXPECT_EQ(panes.mode(), Mode::Rows);
    EXPECT_EQ(path(), "/Neighbors/1");
    EXPECT_EQ(row(), "PCI");
    press({Key::Left});
    EXPECT_EQ(row(), "1");
    press({Key::Left});
    EXPECT_EQ(row(), "Neighbors");
}

TEST_F(Panes, EscapeGivesASearchUp)
{
    press({Key::Down, Key::Enter});
    type(U"/band");
    press({Key::Escape});
    EXPECT_EQ(panes.mode(), Mode::Rows);
    EXPECT_EQ(path(), "/Neighbors");
}

TEST_F(Panes, NextAndPreviousGoRoundTheTree)
{
    type(U"/pci");
    press({Key::Enter});
    EXPECT_EQ(path(), "/Neighbors/0");
    type(U"n");
    EXPECT_EQ(path(), "/Neighbors/1");
    EXPECT_EQ(panes.remark(), "2 of 3: pci");
    type(U"nn");
    EXPECT_EQ(path(), "/Neighbors/0");
    type(U"N");
    EXPECT_EQ(path(), "/Neighbors/2");
    press({Key::Up});
    EXPECT_EQ(panes.remark(), "");
}

TEST_F(Panes, NextWithoutASearchStays)
{
    type(U"nN");
    EXPECT_EQ(path(), "/");
    EXPECT_EQ(panes.remark(), "");
}

TEST_F(Panes, NothingFoundIsSaid)
{
    type(U"/quarz");
    press({Key::Enter});
    EXPECT_EQ(panes.mode(), Mode::Rows);
    EXPECT_EQ(panes.remark(), "nothing found: quarz");
}

TEST_F(Panes, AskForTheChannelByAKeyButNotInASearch)
{
    const KeyPress c{Key::Character, 'c'};
    EXPECT_EQ(panes.handle(c), Outcome::TogglesChannel);
    type(U"/");
    EXPECT_EQ(panes.handle(c), Outcome::Stays);
    EXPECT_EQ(panes.sought(), "c");
}

TEST_F(Panes, GoToTheLastRowOfTheRootFromAnywhere)
{
    panes.handle({Key::Enter});
    tree.show(PlistDictionary{{"Serving Cell", PlistDictionary()}, {"Last", PlistDictionary()}});
    panes.reload();
    panes.goToLastOfRoot();
    EXPECT_EQ(path(), "/Last");
    EXPECT_EQ(panes.panes().size(), 2U);
    panes.goToRoot();
    EXPECT_EQ(path(), "/");
    EXPECT_EQ(row(), "Last");
}

TEST_F(Panes, WhatIsFoundFollowsTheTree)
{
    type(U"/pci");
    press({Key::Down});
    refresh(radioDisplay("301", 2));
    EXPECT_EQ(panes.found().count(), 2U);
    EXPECT_EQ(panes.foundPlace().selected, 1);
    refresh(radioDisplay("301", 1));
    EXPECT_EQ(panes.foundPlace().selected, 0);
    press({Key::Enter});
    EXPECT_EQ(path(), "/Neighbors/0");
}

} // namespace ventrik
