#include "PropertyList/PlistValue.h"

#include <cmath>
#include <limits>
#include <utility>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

std::vector<std::string> keysOf(const PlistDictionary& dictionary)
{
    std::vector<std::string> keys;
    for (const auto& entry : dictionary)
        keys.push_back(entry.key);
    return keys;
}

std::string numberedKey(int number)
{
    return "key" + std::to_string(number);
}

PlistDictionary numberedDictionary(int count)
{
    PlistDictionary dictionary;
    for (int i = 0; i < count; ++i)
        dictionary.set(numberedKey(i), i);
    return dictionary;
}

} // namespace

TEST(PlistValue, CopiesShareTheirContainer)
{
    PlistValue one = PlistArray{1, 2};
    const PlistValue other = one;
    one.array()->append(3);
    EXPECT_EQ(other.array()->size(), 3U);
    EXPECT_TRUE(one.array()->isSameContainer(*other.array()));
}

TEST(PlistValue, CopyMakesANewTopLevelAndSharesWhatIsNested)
{
    PlistValue inner = PlistDictionary{{"a", 1}};
    PlistValue outer = PlistDictionary{{"inner", inner}};
    PlistValue copy = outer.copy();
    copy.dictionary()->set("more", true);
    inner.dictionary()->set("a", 2);
    EXPECT_FALSE(outer.dictionary()->contains("more"));
    EXPECT_EQ(*copy.dictionary()->find("inner")->dictionary()->find("a"), PlistValue(2));
}

TEST(PlistValue, CopyOfAnArrayIsIndependent)
{
    PlistArray array{1};
    PlistArray copy = array.copy();
    copy.append(2);
    EXPECT_EQ(array.size(), 1U);
    EXPECT_FALSE(copy.isSameContainer(array));
}

TEST(PlistValue, BecomesAText)
{
    PlistValue value = PlistArray();
    value.setText("one");
    EXPECT_EQ(value, "one");
    const PlistValue before = value;
    value.setText("another");
    EXPECT_EQ(value, "another");
    EXPECT_EQ(before, "one");
}

TEST(PlistValue, BecomesANumber)
{
    PlistValue value = "text";
    value = 7;
    EXPECT_EQ(value, PlistValue(7));
    value = PlistInteger(std::uint64_t{1} << 63);
    EXPECT_EQ(value, PlistValue(std::uint64_t{1} << 63));
    value = 2.5;
    EXPECT_EQ(value, PlistValue(2.5));
    value = true;
    EXPECT_EQ(value.kind(), PlistValue::Kind::Boolean);
}

TEST(PlistValue, CountsWhoSharesAnArray)
{
    const PlistArray array;
    EXPECT_EQ(array.handleCount(), 1U);
    const PlistArray& other = PlistArray(array);
    EXPECT_EQ(other.handleCount(), 2U);
}

TEST(PlistValue, NamesItsKind)
{
    EXPECT_EQ(PlistValue("a").kindName(), "string");
    EXPECT_EQ(PlistValue(1).kindName(), "integer");
    EXPECT_EQ(PlistValue(1.0).kindName(), "real");
    EXPECT_EQ(PlistValue(true).kindName(), "boolean");
    EXPECT_EQ(PlistValue(PlistDate{}).kindName(), "date");
    EXPECT_EQ(PlistValue(Bytes{}).kindName(), "data");
    EXPECT_EQ(PlistValue(PlistArray()).kindName(), "array");
    EXPECT_EQ(PlistValue(PlistDictionary()).kindName(), "dictionary");
}

TEST(PlistValue, IsEqualDeeply)
{
    const auto make = [](int last) {
        return PlistValue(PlistArray{PlistDictionary{{"a", PlistArray{"x", last}}}, Bytes{1, 2}});
    };
    EXPECT_EQ(make(1), make(1));
    EXPECT_FALSE(make(1) == make(2));
}

TEST(PlistValue, IsNotEqualToAnotherKind)
{
    EXPECT_FALSE(PlistValue(1) == PlistValue(1.0));
    EXPECT_FALSE(PlistValue(1) == PlistValue(true));
    EXPECT_FALSE(PlistValue("1") == PlistValue(Bytes{'1'}));
}

TEST(PlistValue, NotANumberEqualsItself)
{
    EXPECT_EQ(PlistValue(std::nan("")), PlistValue(-std::nan("")));
    EXPECT_FALSE(PlistValue(std::nan("")) == PlistValue(0.0));
}

TEST(PlistInteger, TellsLargeFromNegative)
{
    EXPECT_FALSE(PlistInteger(std::uint64_t{0xffffffffffffffff}) == PlistInteger(-1));
    EXPECT_EQ(PlistInteger(std::uint64_t{0xffffffffffffffff}).decimal(), "18446744073709551615");
    EXPECT_EQ(PlistInteger(std::numeric_limits<std::int64_t>::min()).decimal(),
              "-9223372036854775808");
}

TEST(PlistArray, RemovesFromTheFront)
{
    PlistArray array{1, 2, 3};
    array.removeFirst(2);
    EXPECT_EQ(array, (PlistArray{3}));
    array.removeFirst(5);
    EXPECT_TRUE(array.empty());
}

TEST(PlistDictionary, KeepsTheOrderOfInsertionWhenAValueIsReplaced)
{
    PlistDictionary dictionary{{"b", 1}, {"a", 2}, {"c", 3}};
    dictionary.set("b", 4);
    EXPECT_THAT(keysOf(dictionary), testing::ElementsAre("b", "a", "c"));
    EXPECT_EQ(*dictionary.find("b"), PlistValue(4));
}

TEST(PlistDictionary, RemovesKeysAndAddsThemAgainAtTheEnd)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}};
    EXPECT_TRUE(dictionary.remove("a"));
    EXPECT_FALSE(dictionary.remove("a"));
    dictionary.set("a", 3);
    EXPECT_THAT(keysOf(dictionary), testing::ElementsAre("b", "a"));
}

TEST(PlistDictionary, FindsEveryOfManyKeys)
{
    const PlistDictionary dictionary = numberedDictionary(40);
    for (int i = 0; i < 40; ++i) {
        ASSERT_TRUE(dictionary.contains(numberedKey(i)));
        EXPECT_EQ(*dictionary.find(numberedKey(i)), PlistValue(i));
    }
    EXPECT_FALSE(dictionary.contains(numberedKey(40)));
}

TEST(PlistDictionary, FindsTheRestWhenManyKeysBecomeFew)
{
    PlistDictionary dictionary = numberedDictionary(18);
    for (int i = 0; i < 4; ++i)
        EXPECT_TRUE(dictionary.remove(numberedKey(i)));
    EXPECT_EQ(dictionary.size(), 14U);
    EXPECT_FALSE(dictionary.contains(numberedKey(3)));
    EXPECT_EQ(*dictionary.find(numberedKey(17)), PlistValue(17));
}

TEST(PlistDictionary, IsEmptyAndUsableAfterClear)
{
    PlistDictionary dictionary = numberedDictionary(20);
    dictionary.clear();
    EXPECT_TRUE(dictionary.empty());
    EXPECT_FALSE(dictionary.contains(numberedKey(1)));
    dictionary.set("new", 1);
    EXPECT_THAT(keysOf(dictionary), testing::ElementsAre("new"));
}

TEST(PlistDictionary, TellsThePlaceOfAKeyAmongFewAndAmongMany)
{
    for (const int count : {3, 40}) {
        const PlistDictionary dictionary = numberedDictionary(count);
        EXPECT_EQ(dictionary.placeOf(numberedKey(2)), 2U);
        EXPECT_EQ(dictionary.placeOf(numberedKey(count - 1)), static_cast<std::size_t>(count - 1));
        EXPECT_EQ(dictionary.placeOf(numberedKey(count)), std::nullopt);
    }
}

TEST(PlistDictionary, KeepsThePlaceOfAKeyWhileOthersAreSetAndRemovedAfterIt)
{
    PlistDictionary dictionary = numberedDictionary(20);
    const auto place = dictionary.placeOf(numberedKey(5));
    dictionary.set(numberedKey(0), "new");
    dictionary.set(numberedKey(20), "more");
    dictionary.remove(numberedKey(6));
    EXPECT_EQ(dictionary.placeOf(numberedKey(5)), place);
    dictionary.remove(numberedKey(4));
    EXPECT_EQ(dictionary.placeOf(numberedKey(5)), *place - 1);
}

TEST(PlistDictionary, GivesTheEntryAtAPlaceForChange)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}};
    PlistDictionary::Entry* entry = dictionary.entryAt(1);
    ASSERT_NE(entry, nullptr);
    EXPECT_EQ(entry->key, "b");
    entry->value = 3;
    EXPECT_EQ(*dictionary.find("b"), PlistValue(3));
}

TEST(PlistDictionary, FindsAKeyWhereItWasTheLastTime)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}, {"c", 3}};
    std::size_t place = 0;
    ASSERT_NE(dictionary.find("c", place), nullptr);
    EXPECT_EQ(*dictionary.find("c", place), PlistValue(3));
    EXPECT_EQ(place, 2U);
    dictionary.remove("a"); // the place is past the end now
    EXPECT_EQ(*dictionary.find("c", place), PlistValue(3));
    EXPECT_EQ(place, 1U);
    dictionary.set("d", 4);
    dictionary.remove("b"); // and another key's now
    EXPECT_EQ(*dictionary.find("c", place), PlistValue(3));
    EXPECT_EQ(place, 0U);
}

TEST(PlistDictionary, LeavesThePlaceOfAKeyThatItDoesNotHave)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}};
    std::size_t place = 1;
    EXPECT_EQ(dictionary.find("c", place), nullptr);
    EXPECT_EQ(place, 1U);
}

TEST(PlistDictionary, AnEntryIsUnderItsWholeKeyOnly)
{
    const PlistDictionary dictionary{{"Level", 1}, {"", 2}};
    const PlistDictionary::Entry& level = *dictionary.entryAt(0);
    EXPECT_TRUE(level.isUnder("Level"));
    for (const std::string_view other : {"Leve", "Levels", "Bevel", "LEVEL", ""})
        EXPECT_FALSE(level.isUnder(other)) << other;
    EXPECT_TRUE(dictionary.entryAt(1)->isUnder(""));
    EXPECT_FALSE(dictionary.entryAt(1)->isUnder("x"));
}

TEST(PlistDictionary, HasNoEntryPastTheEnd)
{
    PlistDictionary dictionary{{"a", 1}};
    EXPECT_EQ(dictionary.entryAt(1), nullptr);
    EXPECT_EQ(std::as_const(dictionary).entryAt(1), nullptr);
    EXPECT_EQ(PlistDictionary().entryAt(0), nullptr);
}

TEST(PlistDictionary, MovesNoEntryWhileReservedRoomIsFilled)
{
    PlistDictionary dictionary;
    dictionary.reserve(40);
    dictionary.set(numberedKey(0), 0);
    const PlistDictionary::Entry* first = dictionary.begin();
    for (int i = 1; i < 40; ++i)
        dictionary.set(numberedKey(i), i);
    EXPECT_EQ(dictionary.begin(), first);
    EXPECT_EQ(dictionary, numberedDictionary(40));
}

TEST(PlistDictionary, IsEqualInAnyOrder)
{
    EXPECT_EQ((PlistDictionary{{"a", 1}, {"b", 2}}), (PlistDictionary{{"b", 2}, {"a", 1}}));
    EXPECT_FALSE((PlistDictionary{{"a", 1}}) == (PlistDictionary{{"b", 1}}));
    EXPECT_FALSE((PlistDictionary{{"a", 1}}) == (PlistDictionary{{"a", 1}, {"b", 2}}));
}

TEST(WeakContainer, GivesTheContainerWhileSomebodyOwnsIt)
{
    std::optional<PlistValue> array = PlistArray{1};
    const WeakContainer weak(*array);
    ASSERT_TRUE(weak.array());
    EXPECT_TRUE(weak.array()->isSameContainer(*array->array()));
    EXPECT_FALSE(weak.dictionary());
    array.reset();
    EXPECT_FALSE(weak.array());
}

TEST(WeakContainer, KnowsItsDictionary)
{
    std::optional<PlistDictionary> dictionary = PlistDictionary();
    const WeakContainer weak{PlistValue(*dictionary)};
    EXPECT_TRUE(weak.refersTo(*dictionary));
    EXPECT_FALSE(weak.refersTo(PlistDictionary()));
    dictionary.reset();
    EXPECT_FALSE(weak.dictionary());
}

TEST(WeakContainer, RefersToNothingForOtherValues)
{
    const WeakContainer weak{PlistValue("text")};
    EXPECT_FALSE(weak.array());
    EXPECT_FALSE(weak.dictionary());
}

TEST(PlistDictionary, CountsHowOftenEntriesWereRemoved)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}, {"c", 3}};
    dictionary.set("b", 4);
    EXPECT_FALSE(dictionary.remove("d"));
    dictionary.truncate(3);
    EXPECT_EQ(dictionary.removalCount(), 0U);
    dictionary.remove("a");
    EXPECT_EQ(dictionary.removalCount(), 1U);
    dictionary.truncate(1);
    EXPECT_EQ(dictionary.removalCount(), 2U);
    dictionary.clear();
    EXPECT_EQ(dictionary.removalCount(), 3U);
}

TEST(PlistDictionary, CountsTheHandlesThatShareIt)
{
    const PlistDictionary dictionary;
    EXPECT_EQ(dictionary.handleCount(), 1U);
    const PlistArray holder{dictionary};
    EXPECT_EQ(dictionary.handleCount(), 2U);
    EXPECT_EQ(dictionary.copy().handleCount(), 1U);
}

TEST(PlistDictionary, TruncatingRemovesTheEntriesBehindTheFirstOnes)
{
    PlistDictionary dictionary{{"a", 1}, {"b", 2}, {"c", 3}};
    dictionary.truncate(1);
    EXPECT_EQ(dictionary, (PlistDictionary{{"a", 1}}));
    EXPECT_FALSE(dictionary.contains("b"));
}

TEST(PlistArray, TruncatingRemovesTheValuesBehindTheFirstOnes)
{
    PlistArray array{"a", "b", "c"};
    array.truncate(5);
    EXPECT_EQ(array.size(), 3U);
    array.truncate(1);
    EXPECT_EQ(array, PlistArray{"a"});
}

TEST(PlistArray, ReplacesAValueInItsPlace)
{
    PlistArray array{"a", "b"};
    array.replace(1, "c");
    EXPECT_EQ(array, (PlistArray{"a", "c"}));
}

} // namespace ventrik
