#include "LogGenerator/Core/StateKeys.h"
#include "Model/ChangeStore.h"
#include "Model/DisplayMoment.h"
#include "Model/TreePrinter.h"
#include "Packets/PacketBuilder.h"
#include "Platform/Technology.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tests/Support/ResourceFiles.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

const Clock::TimePoint start = FixedClock().now();

/// The tree of a display as the panes show it.
std::string treeOf(DisplayTree& tree)
{
    const ModelNodePointer root = tree.topLevelNodes();
    return root ? printTree(*root) : "none";
}

std::string treeOf(const PlistValue* display)
{
    PathIndex index;
    return printTree(*VentrikModelNode::makeTreeFromObject(display, index));
}

/// Notes changes as lines.
class Lines : public StoreVisitor
{
  public:
    explicit Lines(const ChangeStore& store) : _store(store) {}

    void changed(const StoredChange& change) override
    {
        std::string line = _store.places().pathOf(change.place);
        if (change.kind == DisplayChange::Kind::Gone)
            line += " gone";
        else if (change.kind == DisplayChange::Kind::Empty)
            line += " empty";
        else
            line += "=" + std::string(change.value.text);
        lines.push_back(line);
    }
    void heard(Clock::TimePoint time, std::uint32_t) override { times.push_back(time - start); }

    std::vector<std::string> lines;
    std::vector<std::chrono::nanoseconds> times;

  private:
    const ChangeStore& _store;
};

/// A store that is shown displays made by hand, one a second.
class ChangeStoreTest : public testing::Test
{
  protected:
    ChangeStoreTest() { store.useGenerator(&generator, "lte"); }

    void show(const PlistValue& display)
    {
        state.set(StateKey::display, display);
        take();
    }
    /// A message that has changed the display in place.
    void take()
    {
        store.messageTaken(time, message, state);
        time += 1s;
    }
    std::string treeAt(std::uint64_t moment)
    {
        DisplayMoment then = store.at(moment);
        return treeOf(then);
    }
    std::string treeAt(std::chrono::seconds second)
    {
        return treeAt(store.momentAt(start + second));
    }
    std::vector<std::string> linesFrom(std::uint64_t moment)
    {
        Lines lines(store);
        store.visit(moment, lines);
        return lines.lines;
    }

    IdleGenerator generator;
    PlistDictionary state;
    Bytes message{1, 2, 3};
    Clock::TimePoint time = start;
    ChangeStore store{RecordsMode::Newer};
};

// For a few thousand changes.
constexpr ChangeStore::Limits smallLimits{.bytes = 256 << 10};

} // namespace

TEST_F(ChangeStoreTest, IsEmptyAtFirst)
{
    EXPECT_TRUE(store.isEmpty());
    EXPECT_EQ(store.present(), 0U);
    EXPECT_EQ(treeAt(0), "Ventrik: (unknown)\n");
}

TEST_F(ChangeStoreTest, ShowsTheDisplayAsItStoodAtEachMoment)
{
    PlistDictionary group{{"x", "1"}, {"y", "2"}};
    show(PlistDictionary{{"a", group}});
    group.find("y")->setText("3");
    take();
    EXPECT_EQ(treeAt(0s), "Ventrik\n  a\n    x: 1\n    y: 2\n");
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a\n    x: 1\n    y: 3\n");
}

TEST_F(ChangeStoreTest, ShowsBetweenTwoMessagesWhatTheFirstOneMade)
{
    show(PlistDictionary{{"a", "1"}});
    show(PlistDictionary{{"a", "2"}});
    EXPECT_EQ(treeAt(store.momentAt(start + 999ms)), "Ventrik\n  a: 1\n");
    EXPECT_EQ(treeAt(store.momentAt(start + 1h)), "Ventrik\n  a: 2\n");
}

TEST_F(ChangeStoreTest, ShowsNothingBeforeTheFirstChange)
{
    show(PlistDictionary{{"a", "1"}});
    EXPECT_EQ(treeAt(store.momentAt(start - 1s)), "Ventrik: (unknown)\n");
}

TEST_F(ChangeStoreTest, ShowsWhatHasGoneSince)
{
    show(PlistDictionary{{"a", PlistArray{PlistDictionary{{"x", "1"}}, "2"}}, {"b", "3"}});
    show(PlistDictionary{{"a", PlistArray()}, {"b", "3"}});
    EXPECT_EQ(treeAt(0s), "Ventrik\n  a\n    0\n      x: 1\n    1: 2\n  b: 3\n");
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a\n  b: 3\n");
}

TEST_F(ChangeStoreTest, KeepsTheOrderOfKeysThatComeBetweenOthers)
{
    show(PlistDictionary{{"a", "1"}, {"c", "3"}});
    show(PlistDictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}});
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a: 1\n  b: 2\n  c: 3\n");
}

TEST_F(ChangeStoreTest, ShowsSortedKeysInTheirOrderByTheirLabels)
{
    show(PlistDictionary{{"_sorted", "1"}, {"2;b", "1"}});
    show(PlistDictionary{{"_sorted", "1"}, {"2;b", "1"}, {"1;a", "2"}});
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a: 2\n  b: 1\n");
}

TEST_F(ChangeStoreTest, ShowsAValueThatBecameAGroupAndBack)
{
    show(PlistDictionary{{"a", "1"}});
    show(PlistDictionary{{"a", PlistDictionary{{"x", "2"}}}});
    show(PlistDictionary{{"a", "3"}});
    EXPECT_EQ(treeAt(0s), "Ventrik\n  a: 1\n");
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a\n    x: 2\n");
    EXPECT_EQ(treeAt(2s), "Ventrik\n  a: 3\n");
}

TEST_F(ChangeStoreTest, KeepsAKeysPlaceWhereItsValueBecomesAGroupAndBack)
{
    show(PlistDictionary{{"a", "1"}, {"b", "2"}});
    show(PlistDictionary{{"a", PlistDictionary{{"x", "3"}}}, {"b", "2"}});
    show(PlistDictionary{{"a", "1"}, {"b", "2"}});
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a\n    x: 3\n  b: 2\n");
    EXPECT_EQ(treeAt(2s), "Ventrik\n  a: 1\n  b: 2\n");
}

TEST_F(ChangeStoreTest, KeepsAnElementsPlaceWhereItBecomesAGroupAndBack)
{
    const PlistDictionary cell{{"ARFCN", "66"}};
    show(PlistDictionary{{"l", PlistArray{"66", "79"}}});
    show(PlistDictionary{{"l", PlistArray{cell, "79"}}});
    show(PlistDictionary{{"l", PlistArray{"66", "79"}}});
    EXPECT_EQ(treeAt(1s), "Ventrik\n  l\n    0\n      ARFCN: 66\n    1: 79\n");
    EXPECT_EQ(treeAt(2s), "Ventrik\n  l\n    0: 66\n    1: 79\n");
}

TEST_F(ChangeStoreTest, TellsTheChangesInTheirOrder)
{
    show(PlistDictionary{{"a", "1"}, {"b", PlistArray()}});
    show(PlistDictionary{{"a", "2"}});
    EXPECT_THAT(linesFrom(0), ElementsAre("/a=1", "/b empty", "/b gone", "/a=2"));
    EXPECT_THAT(linesFrom(3), ElementsAre("/a=2"));
    EXPECT_THAT(linesFrom(4), IsEmpty());
}

TEST_F(ChangeStoreTest, TakesNoChangeWhereTheNextGeneratorShowsTheSame)
{
    show(PlistDictionary{{"a", "1"}, {"b", "2"}});
    IdleGenerator next;
    store.useGenerator(&next, "lte");
    take();
    EXPECT_EQ(store.present(), 2U);
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a: 1\n  b: 2\n");
}

TEST_F(ChangeStoreTest, TellsWhatTheNextGeneratorDoesNotShow)
{
    show(PlistDictionary{{"a", "1"}, {"b", PlistDictionary{{"x", "2"}}}});
    IdleGenerator next;
    store.useGenerator(&next, "gsm");
    show(PlistDictionary{{"a", "1"}, {"c", "3"}});
    EXPECT_THAT(linesFrom(2), ElementsAre("/b gone", "/c=3"));
    EXPECT_EQ(treeAt(1s), "Ventrik\n  a: 1\n  c: 3\n");
    EXPECT_EQ(store.technologyAt(2), "lte");
    EXPECT_EQ(store.technologyAt(3), "gsm");
}

TEST_F(ChangeStoreTest, TakesNothingWithoutAGenerator)
{
    store.useGenerator(nullptr, {});
    show(PlistDictionary{{"a", "1"}});
    EXPECT_TRUE(store.isEmpty());
}

TEST_F(ChangeStoreTest, TakesWhatIsOlderThanTheLastAsIfItCameThen)
{
    time = start + 10s;
    show(PlistDictionary{{"a", "1"}});
    time = start;
    show(PlistDictionary{{"a", "2"}});
    EXPECT_EQ(store.timeOf(store.present()), start + 10s);
    EXPECT_EQ(treeAt(10s), "Ventrik\n  a: 2\n");
}

TEST_F(ChangeStoreTest, CountsWhatIsOlderThanTheLastByMoreThanASecond)
{
    for (const auto second : {0s, 100s, 101s, 100s, 99s, 50s, 102s}) {
        time = start + second;
        take();
    }
    EXPECT_EQ(store.lateCount(), 2U);
}

TEST_F(ChangeStoreTest, KeepsTheMessageOfAChange)
{
    show(PlistDictionary{{"a", "1"}});
    message = {4, 5};
    show(PlistDictionary{{"a", "2"}});
    EXPECT_THAT(store.messageOf(0), ElementsAre(1, 2, 3));
    EXPECT_THAT(store.messageOf(1), ElementsAre(4, 5));
    EXPECT_THAT(store.messageOf(2), IsEmpty());
}

TEST_F(ChangeStoreTest, TellsNumbersOfPlainTexts)
{
    show(PlistDictionary{{"a", "-12.5"}, {"b", "none"}});
    const DisplayMoment now = store.at(store.present());
    EXPECT_EQ(now.valueAt("/a")->shown.number, -12.5);
    EXPECT_EQ(now.valueAt("/b")->shown.number, std::nullopt);
    EXPECT_EQ(now.valueAt("/c"), nullptr);
}

TEST_F(ChangeStoreTest, TellsSinceWhenAValueStands)
{
    show(PlistDictionary{{"a", "1"}, {"b", "1"}});
    show(PlistDictionary{{"a", "1"}, {"b", "2"}});
    const DisplayMoment now = store.at(store.present());
    EXPECT_EQ(now.valueAt("/a")->changed, start);
    EXPECT_EQ(now.valueAt("/b")->changed, start + 1s);
}

TEST_F(ChangeStoreTest, TakesAFirstDisplayOfManyValues)
{
    IdleGenerator asksForNothing;
    PlistDictionary display;
    for (int i = 0; i < 5000; ++i)
        display.set(std::to_string(i), "1");
    ChangeStore many(RecordsMode::Base);
    many.useGenerator(&asksForNothing, "ifx");
    state.set(StateKey::display, display);
    many.messageTaken(start, {}, state);
    EXPECT_EQ(many.places().size(), 5001u);
    DisplayMoment now = many.at(many.present());
    EXPECT_EQ(treeOf(now), treeOf(state.find(StateKey::display)));
}

TEST_F(ChangeStoreTest, NotesTheChannelsLossAndReturnOnce)
{
    store.channelChanged(start, true, "");
    store.channelChanged(start + 1s, false, "no service");
    store.channelChanged(start + 2s, false, "no service");
    ASSERT_EQ(store.channelEvents().size(), 2U);
    EXPECT_EQ(store.channelEvents()[1].kind, ChannelEvent::Kind::Lost);
    EXPECT_EQ(store.channelEvents()[1].text, "no service");
    EXPECT_EQ(store.channelEvents()[1].time, start + 1s);
}

namespace
{

/// Many values of ever new texts, in a small store.
class SmallChangeStoreTest : public ChangeStoreTest
{
  protected:
    SmallChangeStoreTest()
    {
        small.useGenerator(&generator, "lte");
        state.set(StateKey::display, PlistDictionary{{"steady", "0"}, {"a", counter}});
    }
    void count(int messages)
    {
        for (int i = 0; i < messages; ++i) {
            counter.set("n", std::to_string(++last));
            small.messageTaken(start + last * 1s, message, state);
        }
    }

    PlistDictionary counter;
    int last = 0;
    ChangeStore small{RecordsMode::Newer, smallLimits};
};

} // namespace

TEST_F(SmallChangeStoreTest, DropsTheOldestWhenItIsFull)
{
    count(20000);
    EXPECT_GT(small.firstMoment(), 0U);
    EXPECT_LE(small.bytes(), smallLimits.bytes);
    EXPECT_GT(small.changeCount(), 1000U);
}

TEST_F(SmallChangeStoreTest, StillKnowsWhatHasStoodForLong)
{
    count(20000);
    DisplayMoment first = small.at(small.firstMoment() + 1);
    EXPECT_EQ(first.valueAt("/steady")->shown.text, "0");
    EXPECT_EQ(first.valueAt("/steady")->changed, start + 1s);
    const std::string text = std::to_string((first.time() - start) / 1s);
    EXPECT_EQ(treeOf(first), "Ventrik\n  steady: 0\n  a\n    n: " + text + "\n");
}

TEST_F(SmallChangeStoreTest, DropsWhatIsTooOld)
{
    ChangeStore daily(RecordsMode::Newer, {.bytes = std::size_t{1} << 20, .age = 1h});
    daily.useGenerator(&generator, "lte");
    for (; last < 7200; ++last) {
        counter.set("n", std::to_string(last));
        daily.messageTaken(start + last * 1s, message, state);
    }
    const auto kept = daily.lastTime() - daily.firstTime();
    EXPECT_GE(kept, 1h);
    EXPECT_LE(kept, 80min); // what is oldest goes a piece at a time
}

TEST_F(SmallChangeStoreTest, DropsWhatIsTooOldWhereThereIsRoomForAll)
{
    ChangeStore roomy(RecordsMode::Newer, {.age = 1h});
    roomy.useGenerator(&generator, "lte");
    for (; last < 7200; ++last) {
        counter.set("n", std::to_string(last));
        roomy.messageTaken(start + last * 1s, message, state);
    }
    const auto kept = roomy.lastTime() - roomy.firstTime();
    EXPECT_GE(kept, 1h);
    EXPECT_LE(kept, 65min);
    DisplayMoment first = roomy.at(roomy.firstMoment() + 1);
    const std::string text = std::to_string((first.time() - start) / 1s);
    EXPECT_EQ(treeOf(first), "Ventrik\n  steady: 0\n  a\n    n: " + text + "\n");
}

TEST_F(SmallChangeStoreTest, DropsTheOldestPacketsBeforeTheChanges)
{
    message.resize(500);
    count(200);
    EXPECT_EQ(small.firstMoment(), 0U);
    EXPECT_THAT(small.messageOf(0), IsEmpty());
    EXPECT_EQ(small.messageOf(small.present() - 1).size(), 500U);
}

TEST_F(SmallChangeStoreTest, BeginsAnewWhereTheNamesAreEverNewOnes)
{
    for (; last < 5000; ++last) {
        state.set(StateKey::display, PlistDictionary{{std::to_string(last), "1"}});
        small.messageTaken(start + last * 1s, message, state);
    }
    EXPECT_GT(small.generation(), 0U);
    EXPECT_LE(small.bytes(), smallLimits.bytes);
    DisplayMoment now = small.at(small.present());
    EXPECT_EQ(treeOf(now), "Ventrik\n  4999: 1\n");
}

namespace
{

/// Says how the records of its one section were read.
class ReadingGenerator : public IdleGenerator
{
  public:
    const ReadLayout* lastRead() const override { return &read; }
    std::vector<std::string_view> sectionsOfCode(std::uint32_t) const override
    {
        return {"Section"};
    }
    std::string_view sectionAt(const PlistDictionary&,
                               std::span<const std::string_view> path) const override
    {
        return path.front() == "Section" ? "Section" : "";
    }

    ReadLayout read{0xB0C2, 7, 40, LayoutKind::Base};
};

class ChangeStoreNotesTest : public ChangeStoreTest
{
  protected:
    ChangeStoreNotesTest() { store.useGenerator(&reading, "lte"); }
    void show(std::string_view value)
    {
        state.set(StateKey::display,
                  PlistDictionary{{"Section", PlistDictionary{{"a", value}}}, {"Other", value}});
        take();
    }
    std::vector<std::string> warningsAt(std::uint64_t moment, const std::string& path)
    {
        return store.at(moment).layoutWarningsAt(path);
    }

    ReadingGenerator reading;
};

} // namespace

TEST_F(ChangeStoreNotesTest, TellsWhichRecordsOfASectionWereReadWithoutTheirLayoutBeingKnown)
{
    show("1");
    reading.read.kind = LayoutKind::NotKnown;
    show("2");
    reading.read.kind = LayoutKind::Base;
    show("3");
    const std::string warning = "0xB0C2 version 7: layout not known, values may be wrong";
    EXPECT_THAT(warningsAt(2, "/Section"), IsEmpty());
    EXPECT_THAT(warningsAt(4, "/Section"), ElementsAre(warning));
    EXPECT_THAT(warningsAt(4, "/Section/a"), ElementsAre(warning));
    EXPECT_THAT(warningsAt(4, "/Other"), IsEmpty());
    EXPECT_THAT(warningsAt(4, "/"), IsEmpty());
    EXPECT_THAT(warningsAt(6, "/Section"), IsEmpty());
}

TEST_F(ChangeStoreNotesTest, TellsItOfThePresentAsWell)
{
    show("1");
    reading.read.kind = LayoutKind::NotKnown;
    take(); // which changes nothing
    EXPECT_EQ(warningsAt(store.present(), "/Section").size(), 1U);
}

TEST_F(ChangeStoreNotesTest, TellsOfThePastWhatItToldWhileThatWasThePresent)
{
    show("1");
    reading.read.kind = LayoutKind::NotKnown;
    take(); // which changes nothing
    const auto moment = store.present();
    const auto then = warningsAt(moment, "/Section");
    show("2");
    EXPECT_EQ(warningsAt(moment, "/Section"), then);
    EXPECT_EQ(then.size(), 1U);
}

TEST_F(ChangeStoreNotesTest, TellsItOfThePastAlsoAtTheEdgeOfItsParts)
{
    ChangeStore small(RecordsMode::Newer, smallLimits);
    small.useGenerator(&reading, "lte");
    PlistDictionary counter{{"a", "0"}};
    state.set(StateKey::display, PlistDictionary{{"Section", counter}});
    std::map<std::uint64_t, bool> warned;
    for (int i = 0; i < 3000; ++i) {
        const bool isKnown = i % 3 == 0;
        reading.read.kind = isKnown ? LayoutKind::Base : LayoutKind::NotKnown;
        if (i % 3 != 1)
            counter.set("a", std::to_string(i));
        small.messageTaken(start + i * 1s, message, state);
        warned[small.present()] = !small.at(small.present()).layoutWarningsAt("/Section").empty();
    }
    std::erase_if(warned, [&](const auto& known) { return known.first <= small.firstMoment(); });
    for (const auto& [moment, isWarned] : warned)
        EXPECT_EQ(!small.at(moment).layoutWarningsAt("/Section").empty(), isWarned) << moment;
}

TEST_F(ChangeStoreNotesTest, StaysWithinItsSizeWhileOnlyLayoutsChange)
{
    ChangeStore small(RecordsMode::Newer, smallLimits);
    small.useGenerator(&reading, "lte");
    state.set(StateKey::display, PlistDictionary{{"Section", "1"}});
    for (int i = 0; i < 40000; ++i) {
        reading.read.kind = i % 2 == 0 ? LayoutKind::NotKnown : LayoutKind::Base;
        small.messageTaken(start + i * 1s, message, state);
    }
    EXPECT_LE(small.bytes(), smallLimits.bytes);
    EXPECT_EQ(small.at(small.present()).valueAt("/Section")->shown.text, "1");
    EXPECT_GT(small.firstTime(), start);
    EXPECT_EQ(small.timeOf(small.firstMoment()), small.firstTime());
}

TEST_F(ChangeStoreNotesTest, KnowsTheWarningsOfAnEarlierPart)
{
    ChangeStore small(RecordsMode::Newer, smallLimits);
    small.useGenerator(&reading, "lte");
    reading.read.kind = LayoutKind::NotKnown;
    PlistDictionary counter{{"a", "0"}};
    state.set(StateKey::display, PlistDictionary{{"Section", counter}});
    for (int i = 0; i < 20000; ++i) {
        counter.set("a", std::to_string(i));
        small.messageTaken(start + i * 1s, message, state);
    }
    ASSERT_GT(small.firstMoment(), 0U);
    EXPECT_EQ(small.at(small.firstMoment() + 1).layoutWarningsAt("/Section").size(), 1U);
}

namespace
{

/// Wants the records of one code, and reads some of them.
class ChoosyGenerator : public IdleGenerator
{
  public:
    PlistDictionary getStartCommand() const override
    {
        return {{"SetOrbelLogCodes", PlistArray{0xB0C2}}};
    }
    const ReadLayout* lastRead() const override { return isRead ? &read : nullptr; }

    bool isRead = true;
    ReadLayout read{0xB0C2, 7, 40, LayoutKind::Base};
};

} // namespace

TEST_F(ChangeStoreTest, TakesNoRecordThatCouldNotBeReadForValuesToldAgain)
{
    ChoosyGenerator choosy;
    store.useGenerator(&choosy, "lte");
    message = PacketBuilder(0xB0C2).build();
    show(PlistDictionary{{"a", "1"}});
    take();
    choosy.isRead = false;
    take();
    EXPECT_EQ(store.lastHeard(0xB0C2), start + 1s);
    show(PlistDictionary{{"a", "2"}});
    EXPECT_EQ(store.lastHeard(0xB0C2), start + 1s);
    EXPECT_EQ(store.at(store.present()).valueAt("/a")->logCode, 0xB0C2U);
}

namespace
{

/// A technology's scenario through its generator, and a store beside it.
class ChangeStoreOfTechnologyTest : public testing::TestWithParam<std::string_view>
{
  protected:
    ChangeStoreOfTechnologyTest() { addTemplates(fake.resources, VENTRIK_RESOURCES); }

    struct Fakes {
        CapturingSystemLog log;
        MemoryResources resources;
        FixedClock clock;
    } fake;
};

} // namespace

TEST_P(ChangeStoreOfTechnologyTest, ShowsEachMomentAsTheDisplayWasThen)
{
    const Technology technology = *technologyNamed(GetParam());
    const auto generator = LogGenerator::generatorsReading(RecordsMode::Extended)(
        technology.identifier, {fake.log, fake.resources, fake.clock});
    ChangeStore store(RecordsMode::Extended, {.bytes = 2 << 20});
    store.useGenerator(generator.get(), technology.name);
    const auto scenario = makeScenario(technology, 5, RecordsMode::Extended);
    PlistDictionary state;
    std::map<std::uint64_t, std::string> trees;
    for (int i = 0; i < 2000; ++i) {
        const auto message = scenario->next();
        generator->updateState(state, message->data);
        store.messageTaken(start + message->due, message->data, state);
        if (i % 7 == 0)
            trees[store.present()] = treeOf(state.find(StateKey::display));
    }
    ASSERT_GT(trees.size(), 20U);
    for (const auto& [moment, tree] : trees) {
        if (moment < store.firstMoment())
            continue;
        DisplayMoment then = store.at(moment);
        ASSERT_EQ(treeOf(then), tree) << moment;
    }
}

INSTANTIATE_TEST_SUITE_P(All, ChangeStoreOfTechnologyTest,
                         testing::Values("lte", "gsm", "utran", "c2k", "ifx"),
                         [](const auto& name) { return std::string(name.param); });

} // namespace ventrik
