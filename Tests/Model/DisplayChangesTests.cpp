#include "LogGenerator/Core/StateKeys.h"
#include "Model/DisplayChanges.h"
#include "Tests/Support/IdleGenerator.h"

#include <map>
#include <set>

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

/// Knows what its test says of values and sections, by the keys with ">" between them.
class KnowingGenerator : public IdleGenerator
{
  public:
    std::optional<CellPlace> cellPlaceAt(const PlistDictionary&,
                                         std::span<const std::string_view> path) const override
    {
        ++lookups;
        const std::string keys = fmt::format("{}", fmt::join(path, ">"));
        if (noFields.contains(keys))
            return CellPlace{};
        const auto known = cells.find(keys);
        return known == cells.end()
                   ? std::nullopt
                   : std::optional(CellPlace{.section = &known->second, .key = path.back()});
    }
    std::optional<ShownCell> cellAt(CellPlace& place) const override
    {
        const auto* cell = static_cast<const ShownCell*>(place.section);
        return cell ? std::optional(*cell) : std::nullopt;
    }
    std::string_view sectionAt(const PlistDictionary&,
                               std::span<const std::string_view> path) const override
    {
        return path.front() == "Known" ? "Known" : "";
    }

    std::map<std::string, ShownCell> cells;
    std::set<std::string> noFields; // places that never have one
    mutable int lookups = 0;
};

class DisplayChangesTest : public testing::Test
{
  protected:
    void show(const PlistValue& display) { state.set(StateKey::display, display); }

    std::string lineOf(const DisplayChange& change)
    {
        const std::string path = changes.describe(*change.place, state).path;
        switch (change.kind) {
        case DisplayChange::Kind::Shown:
            return path + "=" + change.place->text;
        case DisplayChange::Kind::Empty:
            return path + " empty";
        case DisplayChange::Kind::Gone:
            return path + " gone";
        }
        return {};
    }

    std::vector<std::string> take()
    {
        std::vector<std::string> lines;
        for (const DisplayChange& change : changes.take(state))
            lines.push_back(lineOf(change));
        return lines;
    }

    /// The place of the one value that has changed.
    const DisplayPlace& takeOne()
    {
        const auto taken = changes.take(state);
        EXPECT_EQ(taken.size(), 1U);
        return *taken.front().place;
    }

    KnowingGenerator generator;
    PlistDictionary state;
    DisplayChanges changes{generator};
};

} // namespace

TEST_F(DisplayChangesTest, AreNoneWithoutADisplay)
{
    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(DisplayChangesTest, AreAllOfTheFirstDisplayInItsOrder)
{
    show(PlistDictionary{{"b", PlistDictionary{{"y", "1"}, {"x", "2"}}},
                         {"a", PlistArray{"p", PlistDictionary{{"q", "3"}}}}});
    EXPECT_THAT(take(), ElementsAre("/b/y=1", "/b/x=2", "/a/0=p", "/a/1/q=3"));
}

TEST_F(DisplayChangesTest, AreNoneWhenNothingHasChanged)
{
    show(PlistDictionary{{"a", "1"}});
    take();
    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(DisplayChangesTest, AreTheValuesThatChanged)
{
    PlistDictionary group{{"x", "1"}, {"y", "2"}};
    show(PlistDictionary{{"a", group}, {"b", PlistDictionary{{"z", "3"}}}});
    take();
    group.find("y")->setText("4");
    EXPECT_THAT(take(), ElementsAre("/a/y=4"));
}

TEST_F(DisplayChangesTest, AreNoneForAValueThatIsWrittenAnewAsItWas)
{
    PlistDictionary group{{"x", "1"}};
    show(PlistDictionary{{"a", group}});
    take();
    group.set("x", "1");
    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(DisplayChangesTest, HaveWhatCameAndWent)
{
    PlistDictionary group{{"x", "1"}, {"y", "2"}};
    show(PlistDictionary{{"a", group}});
    take();
    group.remove("x");
    group.set("z", "3");
    EXPECT_THAT(take(), ElementsAre("/a/x gone", "/a/z=3"));
}

TEST_F(DisplayChangesTest, TellThatKeysHaveChangedTheirOrder)
{
    show(PlistDictionary{{"a", "1"}, {"b", "2"}});
    take();
    EXPECT_FALSE(changes.takeReordered());
    show(PlistDictionary{{"b", "2"}, {"a", "1"}});
    take();
    EXPECT_TRUE(changes.takeReordered());
    EXPECT_FALSE(changes.takeReordered());
}

TEST_F(DisplayChangesTest, TellThatAKeyHasComeBetweenOthers)
{
    show(PlistDictionary{{"a", "1"}, {"c", "3"}});
    take();
    show(PlistDictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}});
    take();
    EXPECT_TRUE(changes.takeReordered());
}

TEST_F(DisplayChangesTest, TellAnotherOrderWhereAValueBecomesAGroupAndBack)
{
    const PlistDictionary values{{"a", "1"}, {"b", "2"}};
    show(values);
    take();
    EXPECT_FALSE(changes.takeReordered());
    show(PlistDictionary{{"a", PlistDictionary{{"x", "1"}}}, {"b", "2"}});
    take();
    EXPECT_TRUE(changes.takeReordered());
    show(values);
    take();
    EXPECT_TRUE(changes.takeReordered());
}

TEST_F(DisplayChangesTest, TellNoOtherOrderWhereAGroupComesAtTheEnd)
{
    show(PlistDictionary{{"a", "1"}});
    take();
    show(PlistDictionary{{"a", "1"}, {"b", PlistDictionary{{"x", "1"}}}});
    take();
    EXPECT_FALSE(changes.takeReordered());
}

TEST_F(DisplayChangesTest, KeepTheOrderWhereKeysComeAtTheEndAndOthersGo)
{
    show(PlistDictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}});
    take();
    show(PlistDictionary{{"a", "1"}, {"c", "3"}, {"d", "4"}});
    take();
    EXPECT_FALSE(changes.takeReordered());
}

TEST_F(DisplayChangesTest, OfAListThatGetsShorterTellTheElementsThatGo)
{
    PlistArray list{PlistDictionary{{"x", "1"}}, PlistDictionary{{"x", "2"}}, "3"};
    show(PlistDictionary{{"a", list}});
    take();
    list.truncate(1);
    EXPECT_THAT(take(), ElementsAre("/a/2 gone", "/a/1 gone"));
}

TEST_F(DisplayChangesTest, OfAListThatIsWrittenAnewTellWhatIsDifferent)
{
    PlistArray list{PlistDictionary{{"x", "1"}, {"y", "2"}}};
    show(PlistDictionary{{"a", list}});
    take();
    list.clear();
    list.append(PlistDictionary{{"x", "1"}, {"y", "5"}});
    list.append("6");
    EXPECT_THAT(take(), ElementsAre("/a/0/y=5", "/a/1=6"));
}

TEST_F(DisplayChangesTest, FollowAContainerThatTookAnothersPlace)
{
    PlistDictionary display{{"a", PlistDictionary{{"x", "1"}}}};
    show(display);
    take();
    PlistDictionary other{{"x", "2"}};
    display.set("a", other);
    EXPECT_THAT(take(), ElementsAre("/a/x=2"));
    other.set("x", "3");
    EXPECT_THAT(take(), ElementsAre("/a/x=3"));
}

TEST_F(DisplayChangesTest, ForgetAContainerThatLeft)
{
    PlistDictionary group{{"x", "1"}};
    PlistDictionary display{{"a", group}};
    show(display);
    take();
    display.remove("a");
    EXPECT_THAT(take(), ElementsAre("/a gone"));
    group.set("x", "2");
    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(DisplayChangesTest, TellEachPlaceOfAContainerThatStandsAtTwo)
{
    PlistDictionary group{{"x", "1"}};
    show(PlistDictionary{{"a", group}, {"b", group}});
    take();
    group.set("x", "2");
    EXPECT_THAT(take(), ElementsAre("/a/x=2", "/b/x=2"));
}

TEST_F(DisplayChangesTest, OfADisplayThatIsMadeAnewTellWhatIsDifferent)
{
    show(PlistDictionary{{"a", PlistDictionary{{"x", "1"}, {"y", "2"}}}});
    take();
    show(PlistDictionary{{"a", PlistDictionary{{"x", "1"}, {"y", "3"}}}});
    EXPECT_THAT(take(), ElementsAre("/a/y=3"));
}

TEST_F(DisplayChangesTest, HaveAGroupThatCameEmpty)
{
    PlistArray list;
    show(PlistDictionary{{"a", list}});
    EXPECT_THAT(take(), ElementsAre("/a empty"));
    list.append("1");
    EXPECT_THAT(take(), ElementsAre("/a/0=1"));
    list.clear();
    EXPECT_THAT(take(), ElementsAre("/a/0 gone"));
}

TEST_F(DisplayChangesTest, ReplaceAValueByAGroupAndBack)
{
    PlistDictionary display{{"a", "1"}};
    show(display);
    take();
    display.set("a", PlistDictionary{{"x", "2"}});
    EXPECT_THAT(take(), ElementsAre("/a gone", "/a/x=2"));
    display.set("a", PlistArray{"3"});
    EXPECT_THAT(take(), ElementsAre("/a gone", "/a/0=3"));
    display.set("a", "4");
    EXPECT_THAT(take(), ElementsAre("/a gone", "/a=4"));
}

TEST_F(DisplayChangesTest, ShowWhatIsNoTextAsTheScreensDo)
{
    show(PlistDictionary{{"a", 5}});
    EXPECT_THAT(take(), ElementsAre("/a=(unknown)"));
}

TEST_F(DisplayChangesTest, ShowKeysInOrderByTheirLabels)
{
    show(PlistDictionary{{"2;b", "1"}, {"_sorted", ""}, {"1;a;c", "2"}});
    EXPECT_THAT(take(), ElementsAre("/b=1", "/1;a;c=2"));
}

TEST_F(DisplayChangesTest, TellTheValuesThatChangedAmongKeysInOrder)
{
    PlistDictionary display{{"2;b", "1"}, {"_sorted", ""}, {"1;a", "2"}, {"3;c", "3"}};
    show(display);
    take();
    display.set("2;b", "4");
    EXPECT_THAT(take(), ElementsAre("/b=4"));
    display.set("3;c", "5");
    display.set("_sorted", "x");
    EXPECT_THAT(take(), ElementsAre("/c=5"));
}

TEST_F(DisplayChangesTest, DoNotLookAgainForWhatIsNoField)
{
    generator.noFields.insert("a>x");
    PlistDictionary group{{"x", "5"}};
    show(PlistDictionary{{"a", group}});
    const auto taken = changes.take(state);
    ASSERT_EQ(taken.size(), 1U);
    EXPECT_FALSE(changes.cellAt(*taken[0].place, state));
    EXPECT_FALSE(changes.cellAt(*taken[0].place, state));
    EXPECT_EQ(generator.lookups, 1);
}

// The panes know one node for a path: the last one in order.
TEST_F(DisplayChangesTest, LeaveTheLastOfTwoKeysWithOneLabelAtTheirPath)
{
    PlistDictionary display{{"2;a", "second"}, {"_sorted", ""}, {"1;a", "first"}};
    show(display);
    EXPECT_THAT(take(), ElementsAre("/a=second", "/a=first", "/a=second"));
    display.set("1;a", "other");
    EXPECT_THAT(take(), ElementsAre("/a=other", "/a=second"));
    display.remove("2;a");
    EXPECT_THAT(take(), ElementsAre("/a gone", "/a=other"));
}

TEST_F(DisplayChangesTest, DescribeAPlace)
{
    show(PlistDictionary{{"a", PlistArray{PlistDictionary{{"x", "1"}}}}});
    const auto description = changes.describe(takeOne(), state);
    EXPECT_EQ(description.path, "/a/0/x");
    EXPECT_EQ(description.name, "x");
    EXPECT_EQ(description.index, 0U);
    EXPECT_EQ(description.section, "a"); // the innermost group that is no element of a list
}

TEST_F(DisplayChangesTest, DescribeAPlaceOfASection)
{
    show(PlistDictionary{{"Known", PlistDictionary{{"b", PlistDictionary{{"x", "1"}}}}}});
    const auto description = changes.describe(takeOne(), state);
    EXPECT_EQ(description.section, "Known");
    EXPECT_EQ(description.index, std::nullopt);
}

TEST_F(DisplayChangesTest, KnowTheFieldOfAValueAndLookForItOnce)
{
    static constexpr Field field{"x", {}};
    generator.cells["a>x"] = {&field, 5};
    PlistDictionary group{{"x", "5"}, {"y", "6"}};
    show(PlistDictionary{{"a", group}});
    const auto taken = changes.take(state);
    ASSERT_EQ(taken.size(), 2U);
    ASSERT_TRUE(changes.cellAt(*taken[0].place, state));
    EXPECT_EQ(changes.cellAt(*taken[0].place, state)->raw, 5);
    EXPECT_EQ(generator.lookups, 1);
    EXPECT_FALSE(changes.cellAt(*taken[1].place, state));
}

TEST(PlainNumber, IsTheNumberOfATextThatIsNothingElse)
{
    const std::map<std::string_view, std::optional<double>> numbers{
        {"12", 12},
        {"-8.5", -8.5},
        {"0", 0},
        {"0.25", 0.25},
        {"", std::nullopt},
        {"-", std::nullopt},
        {"07", std::nullopt}, // a code
        {"1.2.3", std::nullopt},
        {"5 dB", std::nullopt},
        {"1.", std::nullopt},
        {"1234567890123456", std::nullopt}, // an identity
    };
    for (const auto& [text, number] : numbers)
        EXPECT_EQ(plainNumber(text), number) << text;
}

TEST_F(DisplayChangesTest, GiveTheNumberOfAPlaceThatIsGoneToAnotherWithAnotherSerial)
{
    PlistDictionary display{{"a", "1"}};
    show(display);
    const DisplayPlace first = takeOne();
    display.remove("a");
    takeOne();
    display.set("b", "2");
    const DisplayPlace& second = takeOne();
    EXPECT_EQ(second.number, first.number);
    EXPECT_NE(second.serial, first.serial);
}

TEST_F(DisplayChangesTest, KnowAllValuesAsTheyStand)
{
    PlistDictionary group{{"x", "1"}, {"y", "2"}};
    show(PlistDictionary{{"a", group}, {"b", PlistArray{"3"}}});
    take();
    group.set("x", "4");
    take();
    std::vector<std::string> texts;
    for (const DisplayPlace* place : changes.values())
        texts.push_back(place->text);
    EXPECT_THAT(texts, ElementsAre("4", "2", "3"));
}

} // namespace ventrik
