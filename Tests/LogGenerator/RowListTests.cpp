#include "LogGenerator/Orbel/RowList.h"
#include "Packets/PacketBuilder.h"
#include "Packets/ShownNumbers.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ArrayLockHolder.h"

namespace ventrik
{

namespace
{

constexpr std::array<Field, 2> cellFields{{{"Cell", u8(0)}, {"Level", i8(1), wholeDbm()}}};
constexpr List cells{
    .key = "", .offset = 14, .stride = 2, .needed = 2, .count = {u8(13)}, .fields = cellFields};
constexpr std::array<Field, 1> textFields{{{"", u8(0)}}};
constexpr List texts{
    .key = "", .offset = 14, .stride = 1, .needed = 1, .count = {u8(13)}, .fields = textFields};
constexpr Record record{0x1234, "Cells", 14, {}, {&cells, &texts}};
constexpr Field extra{"Extra", u8(0)};

class RowListTest : public testing::Test
{
  protected:
    void showCells(std::initializer_list<std::uint8_t> numbers)
    {
        const Bytes packet = PacketBuilder(0x1234)
                                 .u8(13, static_cast<std::uint8_t>(numbers.size() / 2))
                                 .bytes(14, Bytes(numbers))
                                 .build();
        RowList::Rewrite(list, rows, record).showElements(cells, LogPacket(packet));
    }
    void showTexts(std::initializer_list<std::uint8_t> numbers)
    {
        const Bytes packet = PacketBuilder(0x1234)
                                 .u8(13, static_cast<std::uint8_t>(numbers.size()))
                                 .bytes(14, Bytes(numbers))
                                 .build();
        RowList::Rewrite(list, rows, record).showElements(texts, LogPacket(packet));
    }
    static PlistValue row(std::string_view cell, std::string_view level)
    {
        return PlistDictionary{{"Cell", cell}, {"Level", level}};
    }

    RowList list;
    PlistArray rows;
};

} // namespace

TEST_F(RowListTest, ShowsARowForEachElement)
{
    showCells({7, 0xBA, 8, 0xB0}); // -70, -80
    EXPECT_EQ(rows, (PlistArray{row("7", "-70 dBm"), row("8", "-80 dBm")}));
}

TEST_F(RowListTest, FindsWhatAKeyShowsAlsoWhereItStoodElsewhereBefore)
{
    const std::string name = "Level";
    std::string_view key = name;
    std::size_t slot = 0;
    showCells({7, 0xBA});
    ASSERT_TRUE(list.cellOf(0, key, slot));
    EXPECT_EQ(list.cellOf(0, key, slot)->raw, -70);
    {
        RowList::Rewrite rewrite(list, rows, record);
        rewrite.nextRow();
        rewrite.show(cellFields[1], -80);
        rewrite.show(cellFields[0], 7);
    }
    ASSERT_TRUE(list.cellOf(0, key, slot));
    EXPECT_EQ(list.cellOf(0, key, slot)->raw, -80);
    std::string_view other = "Loss";
    EXPECT_FALSE(list.cellOf(0, other, slot));
}

TEST_F(RowListTest, RowsThatAreNotWrittenAnewGo)
{
    showCells({7, 1, 8, 2, 9, 3});
    showCells({8, 2});
    EXPECT_EQ(rows, PlistArray{row("8", "2 dBm")});
    showCells({});
    EXPECT_TRUE(rows.empty());
}

TEST_F(RowListTest, RowsComeAgainAfterAnEmptyList)
{
    showCells({7, 1});
    showCells({});
    showCells({7, 1, 8, 2});
    EXPECT_EQ(rows, (PlistArray{row("7", "1 dBm"), row("8", "2 dBm")}));
}

// Whoever changes a row behind the list's back sees what it stores.
TEST_F(RowListTest, AnUnchangedNumberIsNotStoredAgain)
{
    showCells({7, 1});
    PlistDictionary(*rows[0].dictionary()).set("Cell", "mine");
    showCells({7, 2});
    EXPECT_EQ(rows, PlistArray{row("mine", "2 dBm")});
}

// The level of 0 shows nothing.
TEST_F(RowListTest, AValueThatShowsNothingLeavesItsRowUntilItShowsAgain)
{
    constexpr std::array<Field, 2> fields{{{"Level", u8(0), {.none = 0}}, {"Cell", u8(1)}}};
    const auto rowOf = [&](std::uint8_t level) {
        const Bytes element{level, 7};
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(fields, LogPacket(element));
        return rows[0];
    };
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ(rowOf(5), (PlistDictionary{{"Level", "5"}, {"Cell", "7"}}));
        EXPECT_EQ(rowOf(0), (PlistDictionary{{"Cell", "7"}}));
        EXPECT_EQ(rowOf(0), (PlistDictionary{{"Cell", "7"}}));
        EXPECT_EQ(rowOf(6), (PlistDictionary{{"Level", "6"}, {"Cell", "7"}}));
    }
}

TEST_F(RowListTest, ARowWhoseKeysSomebodyElseChangedIsWrittenWholeFromThereOn)
{
    showCells({7, 1});
    PlistDictionary(*rows[0].dictionary()).remove("Level");
    showCells({8, 1});
    EXPECT_EQ(rows, PlistArray{row("8", "1 dBm")});
}

TEST_F(RowListTest, ATableShowsAgainAfterSingleFields)
{
    showCells({7, 1});
    {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(cellFields[0], 8);
        writing.show(cellFields[1], 1);
    }
    EXPECT_EQ(rows, PlistArray{row("8", "1 dBm")});
    showCells({7, 1});
    EXPECT_EQ(rows, PlistArray{row("7", "1 dBm")});
}

TEST_F(RowListTest, ATableShowsAgainAfterAnotherOne)
{
    constexpr std::array<Field, 2> swapped{{{"Cell", u8(1)}, {"Level", i8(0), wholeDbm()}}};
    for (int i = 0; i < 2; ++i) {
        showCells({7, 1});
        EXPECT_EQ(rows, PlistArray{row("7", "1 dBm")});
        const Bytes element{7, 1};
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(swapped, LogPacket(element));
        EXPECT_EQ(rows, PlistArray{row("1", "7 dBm")});
    }
}

TEST_F(RowListTest, ARowMayHoldTwoTables)
{
    const std::span<const Field> both(cellFields);
    for (const auto& element : {Bytes{7, 1}, Bytes{7, 2}, Bytes{8, 2}}) {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(both.first(1), LogPacket(element));
        writing.show(both.last(1), LogPacket(element));
        EXPECT_EQ(rows,
                  PlistArray{row(std::to_string(element[0]), std::to_string(element[1]) + " dBm")});
    }
}

TEST_F(RowListTest, ATableShowsAgainAfterTheRowLostValues)
{
    showCells({7, 1});
    {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(cellFields[0], 7);
    }
    EXPECT_EQ(rows, (PlistArray{PlistDictionary{{"Cell", "7"}}}));
    showCells({7, 1});
    EXPECT_EQ(rows, PlistArray{row("7", "1 dBm")});
}

TEST_F(RowListTest, ATableMayHaveAnyNumberOfFields)
{
    constexpr std::string_view keys = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ"
                                      "0123456789!?+-*/=<>()[]{}.,:;&%$#@~^|_'` ";
    std::vector<Field> fields;
    for (std::size_t i = 0; i < keys.size(); ++i)
        fields.push_back({keys.substr(i, 1), u8(static_cast<std::uint16_t>(i))});
    ASSERT_GT(fields.size(), FieldBytes::maximumFields);
    Bytes element(fields.size(), 1);
    for (const int last : {1, 2}) {
        element.back() = static_cast<std::uint8_t>(last);
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(fields, LogPacket(element));
    }
    EXPECT_EQ(*rows[0].dictionary()->find(" "), "2");
    EXPECT_EQ(rows[0].dictionary()->size(), fields.size());
}

TEST_F(RowListTest, AListThatSomebodyElseEmptiedIsWrittenWhole)
{
    showCells({7, 1, 8, 2});
    rows.clear();
    showCells({7, 1, 8, 2});
    EXPECT_EQ(rows, (PlistArray{row("7", "1 dBm"), row("8", "2 dBm")}));
}

TEST_F(RowListTest, AListOfUnknownContentIsWrittenWhole)
{
    rows.append("old");
    rows.append("older");
    showCells({7, 1});
    EXPECT_EQ(rows, PlistArray{row("7", "1 dBm")});
}

TEST_F(RowListTest, AValueThatARowNoLongerHasGoes)
{
    for (const bool hasExtra : {true, false}) {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(cellFields[0], 7);
        if (hasExtra)
            writing.showWorkedOut(extra, 3);
    }
    EXPECT_EQ(rows, (PlistArray{PlistDictionary{{"Cell", "7"}}}));
}

TEST_F(RowListTest, ARowMayBecomeOneOfOtherKeys)
{
    for (const Field* second : {&cellFields[1], &extra}) {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.show(*second, 5);
        writing.show(cellFields[0], 7);
    }
    EXPECT_EQ(rows, (PlistArray{PlistDictionary{{"Extra", "5"}, {"Cell", "7"}}}));
    EXPECT_EQ(rows[0].dictionary()->begin()->key, "Extra");
}

TEST_F(RowListTest, AFieldWithoutAKeyShowsTexts)
{
    showTexts({5, 6, 7});
    EXPECT_EQ(rows, (PlistArray{"5", "6", "7"}));
    showTexts({5, 9});
    EXPECT_EQ(rows, (PlistArray{"5", "9"}));
}

TEST_F(RowListTest, OfAListOfTextsOnlyThoseThatChangedAreStored)
{
    constexpr Field levels{"Levels", u16(0)};
    const auto show = [&](std::int64_t raw) {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.showTexts(levels, raw, textFields[0]);
        return *rows[0].dictionary()->find("Levels")->array();
    };
    PlistArray(show(0x0201)).replace(0, "mine");
    EXPECT_EQ(show(0x0301), (PlistArray{"mine", "3"}));
}

TEST_F(RowListTest, AListOfTextsThatSomebodyHoldsStaysAsItIs)
{
    constexpr Field levels{"Levels", u16(0)};
    const auto show = [&](std::int64_t raw) {
        RowList::Rewrite writing(list, rows, record);
        writing.nextRow();
        writing.showTexts(levels, raw, textFields[0]);
        return *rows[0].dictionary()->find("Levels")->array();
    };
    const PlistArray held = show(0x0201);
    EXPECT_EQ(show(0x0302), (PlistArray{"2", "3"}));
    EXPECT_EQ(held, (PlistArray{"1", "2"}));
}

TEST_F(RowListTest, CopiedContainersStayAsTheyWereForWhoeverHoldsThem)
{
    const auto show = [&](std::uint8_t cell, std::uint8_t level) {
        const Bytes packet =
            PacketBuilder(0x1234).u8(13, 2).bytes(14, Bytes{1, 1, cell, level}).build();
        rows = RowList::Rewrite(list, rows, record, RowList::Containers::Copied)
                   .showElements(cells, LogPacket(packet));
    };
    show(7, 1);
    const PlistArray before = rows;
    show(7, 1);
    EXPECT_TRUE(rows.isSameContainer(before));
    show(7, 2);
    EXPECT_EQ(before, (PlistArray{row("1", "1 dBm"), row("7", "1 dBm")}));
    EXPECT_EQ(rows, (PlistArray{row("1", "1 dBm"), row("7", "2 dBm")}));
}

TEST_F(RowListTest, WithoutAnArrayTheRowsGoNowhere)
{
    {
        RowList::Rewrite writing(list, std::nullopt, record);
        writing.nextRow();
        writing.show(cellFields[0], 7);
    }
    showCells({7, 1});
    EXPECT_EQ(rows, PlistArray{row("7", "1 dBm")});
}

TEST_F(RowListTest, TellsWhereAValueOfARowComesFrom)
{
    showCells({7, 1, 8, 2});
    const auto origin = list.originOf(1, "Level");
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->record, &record);
    EXPECT_EQ(origin->firstByte(), 17U); // 14 + 2 + 1
    EXPECT_EQ(origin->raw, 2);
    EXPECT_FALSE(list.originOf(1, "Other"));
    EXPECT_FALSE(list.originOf(2, "Level"));
}

TEST_F(RowListTest, IsWrittenUnderTheArrayLock)
{
    EXPECT_TRUE(waitsForArrayLock([&] { showCells({7, 1}); }));
}

} // namespace ventrik
