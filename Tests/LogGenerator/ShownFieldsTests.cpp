#include "LogGenerator/Orbel/ShownFields.h"
#include "Packets/PacketBuilder.h"
#include "Packets/ShownNumbers.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

constexpr std::array<Field, 2> levels{{{"Cell", u8(13)}, {"Level", u8(14), {.none = 0}}}};
constexpr std::array<Field, 1> otherLevels{{{"Level", u8(15)}}};
constexpr std::array<Field, 2> sameKey{{{"Level", u8(13)}, {"Level", u8(14), {.none = 0}}}};
constexpr Record record{0x1234, "Levels", 14};

constexpr std::size_t manyFields = 2 * FieldBytes::maximumFields + 1;
constexpr std::array<Field, manyFields> many = [] {
    std::array<Field, manyFields> fields{};
    constexpr std::string_view keys = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ"
                                      "0123456789!?+-*/=<>()[]{}.,:;&%$#@~^|_'` "
                                      "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ";
    for (std::size_t i = 0; i < fields.size(); ++i)
        fields[i] = {keys.substr(i, 2 + i / 64), u8(static_cast<std::uint16_t>(13 + i))};
    return fields;
}();

class ShownFieldsTest : public testing::Test
{
  protected:
    void show(std::span<const Field> fields, const Bytes& payload)
    {
        const Bytes packet = PacketBuilder(0x1234).bytes(13, payload).build();
        shown.begin(dictionary, &record);
        shown.show(dictionary, fields, LogPacket(packet));
    }
    void show(const Field& field, std::int64_t raw)
    {
        shown.begin(dictionary, &record);
        shown.show(dictionary, field, raw);
    }

    PlistDictionary dictionary;
    ShownFields shown;
};

} // namespace

TEST_F(ShownFieldsTest, ShowsTheFieldsWhoseBytesChanged)
{
    show(levels, {1, 2});
    show(levels, {1, 3});
    EXPECT_EQ(dictionary, (PlistDictionary{{"Cell", "1"}, {"Level", "3"}}));
}

// Whoever changes a value behind its back sees what it stores.
TEST_F(ShownFieldsTest, AnUnchangedFieldIsNotStoredAgain)
{
    show(levels, {1, 2});
    dictionary.set("Cell", "mine");
    show(levels, {1, 3});
    EXPECT_EQ(dictionary, (PlistDictionary{{"Cell", "mine"}, {"Level", "3"}}));
}

TEST_F(ShownFieldsTest, TheTableThatCameLastShows)
{
    for (int i = 0; i < 2; ++i) {
        show(levels, {1, 2, 3});
        EXPECT_EQ(*dictionary.find("Level"), "2");
        show(otherLevels, {1, 2, 3});
        EXPECT_EQ(*dictionary.find("Level"), "3");
    }
}

TEST_F(ShownFieldsTest, ATableThatOthersWereShownBesideShowsAgain)
{
    show(levels, {1, 2, 3});
    show(otherLevels, {1, 2, 3});
    show(otherLevels, {1, 2, 4});
    show(levels, {1, 2, 3});
    EXPECT_EQ(*dictionary.find("Level"), "2");
}

// The second table finds the first one's number there already, and has shown it nonetheless.
TEST_F(ShownFieldsTest, TablesThatShareAFieldShowInTurn)
{
    const auto level = std::span(levels).last(1);
    show(levels, {1, 2});
    show(level, {1, 2});
    show(levels, {1, 3});
    show(level, {1, 2});
    EXPECT_EQ(dictionary, (PlistDictionary{{"Cell", "1"}, {"Level", "2"}}));
}

TEST_F(ShownFieldsTest, ATableShowsAgainAfterASingleField)
{
    show(levels, {1, 2});
    show(levels[1], 7);
    EXPECT_EQ(*dictionary.find("Level"), "7");
    show(levels, {1, 2});
    EXPECT_EQ(*dictionary.find("Level"), "2");
}

TEST_F(ShownFieldsTest, ATableShowsAgainAfterANumberThatWasWorkedOut)
{
    show(levels, {1, 2});
    shown.showNumber(dictionary, levels[1], 7);
    show(levels, {1, 2});
    EXPECT_EQ(*dictionary.find("Level"), "2");
}

TEST_F(ShownFieldsTest, ATableShowsAgainAfterAnotherValue)
{
    show(levels, {1, 2});
    shown.showValue(dictionary, "Level", "high");
    EXPECT_EQ(*dictionary.find("Level"), "high");
    show(levels, {1, 2});
    EXPECT_EQ(*dictionary.find("Level"), "2");
}

TEST_F(ShownFieldsTest, ATableShowsAgainWhereAKeyWasRemoved)
{
    show(levels, {1, 2});
    dictionary.remove("Cell");
    show(levels, {1, 2});
    EXPECT_EQ(dictionary, (PlistDictionary{{"Cell", "1"}, {"Level", "2"}}));
}

TEST_F(ShownFieldsTest, ATableShowsAgainInADictionaryOfWhichNothingIsKnown)
{
    show(levels, {1, 2});
    dictionary = PlistDictionary();
    shown.forgetAll();
    show(levels, {1, 2});
    EXPECT_EQ(dictionary, (PlistDictionary{{"Cell", "1"}, {"Level", "2"}}));
}

TEST_F(ShownFieldsTest, OfTwoFieldsUnderOneKeyTheLastOneThatShowsCounts)
{
    show(sameKey, {1, 2});
    EXPECT_EQ(*dictionary.find("Level"), "2");
    show(sameKey, {3, 2});
    EXPECT_EQ(*dictionary.find("Level"), "2");
    show(sameKey, {3, 0});
    EXPECT_EQ(*dictionary.find("Level"), "3");
}

TEST_F(ShownFieldsTest, ATableMayHaveAnyNumberOfFields)
{
    Bytes payload(manyFields, 1);
    show(many, payload);
    ASSERT_EQ(dictionary.size(), manyFields);
    payload.back() = 2;
    show(many, payload);
    EXPECT_EQ(*dictionary.find(many.back().key), "2");
    payload.front() = 3;
    show(many, payload);
    EXPECT_EQ(*dictionary.find(many.front().key), "3");
}

} // namespace ventrik
