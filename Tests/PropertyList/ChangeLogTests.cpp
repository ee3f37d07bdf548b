#include "PropertyList/PlistValue.h"

#include <functional>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pointee;

class ChangeLogTest : public testing::Test
{
  protected:
    ChangeLogTest()
    {
        dictionary.watch().add(log, 1);
        array.watch().add(log, 2);
    }

    const std::shared_ptr<ChangeLog> log = std::make_shared<ChangeLog>();
    PlistDictionary dictionary{{"a", "1"}, {"b", "2"}};
    PlistArray array{"x", "y"};
};

} // namespace

TEST_F(ChangeLogTest, IsEmptyWhileNothingChanges)
{
    EXPECT_EQ(std::as_const(dictionary).find("a")->string()->front(), '1');
    EXPECT_EQ(array.size(), 2U);
    EXPECT_TRUE(log->empty());
}

TEST_F(ChangeLogTest, HasWhatChangedOnceInTheOrderOfItsFirstChange)
{
    array.append("z");
    dictionary.set("a", "3");
    array.clear();
    EXPECT_THAT(log->take(), ElementsAre(2, 1));
    EXPECT_THAT(log->take(), IsEmpty());
}

TEST_F(ChangeLogTest, HasEachWayToChangeADictionary)
{
    const auto changes = [&](const std::function<void()>& change) {
        dictionary.watch().add(log, 1);
        change();
        return log->take().size();
    };
    EXPECT_EQ(changes([&] { dictionary.set("a", "3"); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.set("c", "4"); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.find("a")->setText("5"); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.entryAt(0)->value.setText("6"); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.remove("b"); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.truncate(1); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.clear(); }), 1U);
    EXPECT_EQ(changes([&] { dictionary.remove("none"); }), 0U);
}

TEST_F(ChangeLogTest, HasEachWayToChangeAnArray)
{
    const auto changes = [&](const std::function<void()>& change) {
        array.watch().add(log, 2);
        change();
        return log->take().size();
    };
    EXPECT_EQ(changes([&] { array.append("z"); }), 1U);
    EXPECT_EQ(changes([&] { array.replace(0, "w"); }), 1U);
    EXPECT_EQ(changes([&] { array.removeFirst(1); }), 1U);
    EXPECT_EQ(changes([&] { array.truncate(1); }), 1U);
    EXPECT_EQ(changes([&] { array.truncate(1); }), 0U);
    EXPECT_EQ(changes([&] { array.clear(); }), 1U);
}

TEST_F(ChangeLogTest, KnowsWhichValuesChangedWhereNothingElseDid)
{
    dictionary.set("b", "3");
    dictionary.entryAt(0)->value.setText("4");
    std::size_t place = 0;
    dictionary.find("b", place)->setText("5");
    EXPECT_THAT(dictionary.watch().changedValues(), Pointee(ElementsAre(1, 0, 1)));
    array.replace(1, "z");
    EXPECT_THAT(array.watch().changedValues(), Pointee(ElementsAre(1)));
}

TEST_F(ChangeLogTest, TellsOnlyValuesThatChangedSinceItWasAdded)
{
    dictionary.set("b", "3");
    dictionary.watch().add(log, 1);
    dictionary.set("a", "4");
    EXPECT_THAT(dictionary.watch().changedValues(), Pointee(ElementsAre(0)));
}

TEST_F(ChangeLogTest, KnowsThatMoreThanValuesChanged)
{
    dictionary.set("b", "3");
    dictionary.set("c", "4");
    EXPECT_EQ(dictionary.watch().changedValues(), nullptr);
    array.append("z");
    array.replace(0, "w");
    EXPECT_EQ(array.watch().changedValues(), nullptr);
}

TEST_F(ChangeLogTest, DoesNotTellTheValuesOfWhatStandsAtTwoPlaces)
{
    dictionary.watch().add(log, 7);
    dictionary.set("b", "3");
    EXPECT_EQ(dictionary.watch().changedValues(), nullptr);
}

TEST_F(ChangeLogTest, KeepsNoMoreValuesThanAFew)
{
    for (int i = 0; i < 1000; ++i)
        dictionary.set("a", "3");
    EXPECT_EQ(dictionary.watch().changedValues(), nullptr);
}

TEST_F(ChangeLogTest, SeesAChangeByAnotherHandle)
{
    PlistDictionary other = dictionary;
    other.set("a", "3");
    EXPECT_THAT(log->take(), ElementsAre(1));
}

TEST_F(ChangeLogTest, DoesNotSeeACopyChange)
{
    dictionary.copy().set("a", "3");
    array.copy().append("z");
    EXPECT_TRUE(log->empty());
}

TEST_F(ChangeLogTest, HasEachPlaceOfAContainer)
{
    dictionary.watch().add(log, 7);
    dictionary.set("a", "3");
    EXPECT_THAT(log->take(), ElementsAre(1, 7));
}

TEST_F(ChangeLogTest, HasNothingMoreOfWhatIsWatchedNoLonger)
{
    dictionary.watch().remove(log, 1);
    dictionary.set("a", "3");
    EXPECT_TRUE(log->empty());
}

TEST_F(ChangeLogTest, GivesWayToALaterOne)
{
    const auto later = std::make_shared<ChangeLog>();
    dictionary.watch().add(later, 5);
    dictionary.set("a", "3");
    EXPECT_TRUE(log->empty());
    EXPECT_THAT(later->take(), ElementsAre(5));
}

} // namespace ventrik
