#include "Tools/Watch/WatchFrame.h"

#include "Tests/Tools/WatchTree.h"
#include "Tools/Watch/TextCells.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <clocale>

namespace ventrik
{

namespace
{

using Key = KeyPress::Key;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

class Frame : public testing::Test
{
  protected:
    Frame()
    {
        EXPECT_TRUE(std::setlocale(LC_CTYPE, "C.UTF-8"));
        show(radioDisplay());
    }
    void show(const PlistValue& display)
    {
        tree.show(display);
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
    WatchFrame frame(ScreenSize size = {40, 8}) { return composeFrame(panes, status, size); }

    /// What a line shows, without the blanks at its end.
    static std::string textOf(const FrameLine& line)
    {
        std::vector<std::string> cells;
        for (const FramePart& part : line) {
            std::size_t column = static_cast<std::size_t>(part.column);
            for (const TextCell& cell : cellsOf(part.text, 500)) {
                const auto width = static_cast<std::size_t>(cell.width);
                if (cells.size() < column + width)
                    cells.resize(column + width, " ");
                cells[column] = cell.text;
                if (width == 2)
                    cells[column + 1] = "";
                column += width;
            }
        }
        std::string text;
        for (const std::string& cell : cells)
            text += cell;
        return text.substr(0, text.find_last_not_of(' ') + 1);
    }
    std::vector<std::string> lines(ScreenSize size = {40, 8})
    {
        std::vector<std::string> texts;
        for (const FrameLine& line : frame(size).lines)
            texts.push_back(textOf(line));
        return texts;
    }
    /// The parts that show this text.
    std::vector<FramePart> partsWith(const std::string& text, ScreenSize size = {40, 8})
    {
        std::vector<FramePart> parts;
        for (const FrameLine& line : frame(size).lines)
            for (const FramePart& part : line)
                if (part.text == text)
                    parts.push_back(part);
        return parts;
    }

    WatchTree tree;
    WatchPanes panes{tree};
    WatchStatus status{"LTE", "connected", "06:10:28", "", "No data yet"};
};

} // namespace

TEST_F(Frame, ShowsThePaneBetweenItsTitleAndTheStatus)
{
    EXPECT_THAT(lines({60, 6}),
                ElementsAre(" Ventrik", //
                            " Serving Cell                                             ›",
                            " Neighbors                                                ›",
                            " State                                               Idle", "",
                            " LTE · connected · updated 06:10:28  ? keys  / find  q quit"));
}

TEST_F(Frame, TitlesAreThePanesFromTheRootOn)
{
    press({Key::Down, Key::Enter, Key::Enter});
    EXPECT_EQ(lines()[0], " Ventrik › Neighbors › 0");
    EXPECT_EQ(lines({20, 5})[0], " …k › Neighbors › 0");
}

TEST_F(Frame, WhereNotAllRowsShowTheirNumbersStandBesideTheTitle)
{
    PlistArray list;
    for (int row = 0; row < 100; ++row)
        list.append("x");
    show(list);
    press({Key::Down});
    EXPECT_EQ(lines()[0], " Ventrik" + std::string(26, ' ') + "2/100");
    type(U"/9");
    EXPECT_EQ(lines()[0], " Ventrik" + std::string(27, ' ') + "1/19");
    EXPECT_EQ(lines({40, 30})[0], " Ventrik");
}

TEST_F(Frame, TheSelectedRowIsSelectedAllAlong)
{
    press({Key::Down});
    const WatchFrame shown = frame();
    for (const FramePart& part : shown.lines[2])
        EXPECT_TRUE(part.isSelected) << part.text;
    for (const FramePart& part : shown.lines[1])
        EXPECT_FALSE(part.isSelected) << part.text;
}

TEST_F(Frame, ALongValueIsCutBehindItsName)
{
    show(PlistDictionary{{"Name", std::string(100, 'x')}, {std::string(100, 'n'), "value"}});
    EXPECT_EQ(lines()[1], " Name  " + std::string(29, 'x') + "…");
    EXPECT_EQ(lines()[2], " " + std::string(28, 'n') + "…  value");
}

TEST_F(Frame, WideAndCombiningCharactersKeepTheColumns)
{
    show(PlistDictionary{{"東京", "1"}, {"e\u0301", "2"}, {"plain", "東"}});
    for (const std::size_t line : {1, 2, 3})
        EXPECT_EQ(widthOf(lines()[line], 80), 37) << lines()[line];
}

TEST_F(Frame, ATerminalObeysNothingInNamesAndValues)
{
    show(PlistDictionary{{"a\x1b[2J", "b\r\nc\u009b"}});
    press({Key::Enter});
    tree.warnings["/"] = {"w\x1bx"};
    for (const FrameLine& line : frame().lines)
        for (const FramePart& part : line)
            for (const char byte : part.text)
                EXPECT_FALSE(static_cast<unsigned char>(byte) < 0x20 || byte == 0x7f) << part.text;
}

TEST_F(Frame, AChangedValueIsMarked)
{
    press({Key::Enter});
    EXPECT_EQ(partsWith("301").at(0).ink, Ink::Plain);
    show(radioDisplay("302"));
    EXPECT_EQ(partsWith("302").at(0).ink, Ink::Changed);
    EXPECT_EQ(partsWith("3").at(0).ink, Ink::Plain);
}

TEST_F(Frame, ADoubtfulValueHasASignAndTheReasonWhenItIsSelected)
{
    tree.doubts["/Serving Cell/Cell ID"] = "Cell ID is above 503";
    press({Key::Enter});
    EXPECT_THAT(lines({80, 8})[1], testing::EndsWith("301 !"));
    EXPECT_THAT(lines({80, 8})[7], StartsWith(" LTE · connected"));
    EXPECT_THAT(lines({80, 8})[7], HasSubstr("! Cell ID is above 503"));
    EXPECT_EQ(lines()[7], " ! Cell ID is above 503");
    press({Key::Down});
    EXPECT_THAT(lines({80, 8})[7], Not(HasSubstr("503")));
}

TEST_F(Frame, RecordsOfNoKnownLayoutAreNamedBelowTheTitle)
{
    tree.warnings["/"] = {"0xB17F version 7: layout not known"};
    EXPECT_EQ(lines()[1], " 0xB17F version 7: layout not known");
    EXPECT_EQ(lines()[2], " Serving Cell                         ›");
}

TEST_F(Frame, LinesAboveTheRowsLeaveRoomForOne)
{
    tree.warnings["/"] = {"one", "two", "and 3 more"};
    EXPECT_THAT(lines({40, 5}), ElementsAre(" Ventrik" + std::string(28, ' ') + "1/3", " one",
                                            " two", " Serving Cell                         ›",
                                            " LTE · connected · updated 06:10:28"));
}

TEST_F(Frame, AnEmptyPaneSaysWhy)
{
    show(PlistDictionary{{"List", PlistArray{}}});
    press({Key::Enter});
    EXPECT_EQ(lines()[1], " This list is empty");
    show("text");
    EXPECT_EQ(lines()[1], " No data yet");
}

TEST_F(Frame, FromAHundredColumnsTheParentStandsBesideThePane)
{
    press({Key::Down, Key::Enter});
    EXPECT_EQ(lines({99, 8})[1].substr(0, 3), " 0 ");
    const auto wide = lines({100, 8});
    EXPECT_EQ(wide[1], " Serving Cell                         › │ 0" + std::string(55, ' ') + "›");
    EXPECT_EQ(wide[3], " State                           Idle   │ 2" + std::string(55, ' ') + "›");
    EXPECT_EQ(partsWith("Neighbors", {100, 8}).at(0).ink, Ink::Lead);
}

TEST_F(Frame, BesideTheRootStandsWhatItsRowLeadsTo)
{
    EXPECT_THAT(lines({100, 8})[1], HasSubstr("› │ Cell ID"));
    press({Key::End});
    EXPECT_THAT(lines({100, 8})[1], testing::EndsWith("› │"));
}

TEST_F(Frame, OnlyRowsThatShowAreAskedFor)
{
    PlistArray list;
    for (int row = 0; row < 10'000; ++row)
        list.append(std::to_string(row));
    show(list);
    press({Key::End});
    tree.questions = 0;
    EXPECT_EQ(lines()[6], " 9999                            9999");
    EXPECT_LE(tree.questions, 7);
}

TEST_F(Frame, ScreensBelowTheSmallestSaySo)
{
    EXPECT_EQ(lines({19, 5})[0], "too small");
    EXPECT_EQ(lines({20, 4})[0], "too small");
    EXPECT_EQ(lines({3, 1})[0], "to…");
    EXPECT_TRUE(frame({0, 0}).lines.empty());
    EXPECT_EQ(lines({20, 5})[0], " Ventrik");
}

TEST_F(Frame, TheLessRoomTheLessIsSaidOfTheChannel)
{
    EXPECT_EQ(lines({36, 5})[4], " LTE · connected · updated 06:10:28");
    EXPECT_EQ(lines({30, 5})[4], " LTE · connected · 06:10:28");
    EXPECT_EQ(lines({20, 5})[4], " LTE · connected");
}

TEST_F(Frame, AWholeValueStandsWrappedInABox)
{
    show(PlistDictionary{{"Name", "one two three four five six seven eight"}});
    press({Key::Enter});
    EXPECT_THAT(lines({24, 8}),
                ElementsAre(" Ventrik", " Name  one two three…", "┌─ Name ───────────────┐",
                            "│ one two three four   │", "│ five six seven eight │",
                            "└──────────────────────┘", "", " LTE · connected"));
}

TEST_F(Frame, ABoxOfManyLinesCountsWhatIsBelow)
{
    show(PlistDictionary{{"Name", "a\nb\nc\nd\ne\nf"}});
    press({Key::Enter});
    EXPECT_THAT(lines({24, 6}), ElementsAre(" Ventrik", testing::_, testing::_, testing::_,
                                            HasSubstr(" 4 more "), " LTE · connected"));
    press({Key::End});
    EXPECT_THAT(lines({24, 6})[3], HasSubstr("│ f "));
}

TEST_F(Frame, AWholeValueTellsItsDoubt)
{
    tree.doubts["/State"] = "never so";
    press({Key::End, Key::Enter});
    EXPECT_THAT(lines()[4], HasSubstr("│ ! never so │"));
}

TEST_F(Frame, OfAHugeValueTheBoxShowsTheStart)
{
    show(PlistDictionary{{"Name", std::string(std::size_t{1} << 20, 'x')}});
    press({Key::Enter, Key::End});
    EXPECT_THAT(lines()[5], HasSubstr("… (1048576 bytes in all)"));
}

TEST_F(Frame, TheKeysAreTold)
{
    type(U"?");
    const auto wide = lines({80, 24});
    EXPECT_EQ(
        std::ranges::count_if(wide, [](const auto& it) { return it.find("quit") != it.npos; }), 2);
    press({Key::End});
    EXPECT_THAT(lines({20, 8})[5], HasSubstr("quit"));
}

TEST_F(Frame, ASearchShowsItsRowsAndAPromptWithTheCursor)
{
    type(U"/PCI");
    EXPECT_THAT(lines({40, 6}), ElementsAre(" Ventrik", " Neighbors › 0 › PCI               10",
                                            " Neighbors › 1 › PCI               11",
                                            " Neighbors › 2 › PCI               12", "",
                                            "/PCI                             3 rows"));
    EXPECT_EQ(frame({40, 6}).cursorColumn, 4);
    type(U"x");
    EXPECT_EQ(lines()[1], " Nothing found");
}

TEST_F(Frame, OutsideOfASearchNoCursorShows)
{
    EXPECT_EQ(frame().cursorColumn, std::nullopt);
}

} // namespace ventrik
