#include "LogGenerator/Core/StateKeys.h"
#include "Model/PinnedSeries.h"
#include "Platform/Technology.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tests/Support/ResourceFiles.h"

#include <algorithm>
#include <chrono>
#include <map>
#include <set>

#include <fmt/format.h>
#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

const Clock::TimePoint start = FixedClock().now();

/// Displays made by hand, one a second, and the series of what is pinned of them.
class PinnedSeriesTest : public testing::Test
{
  protected:
    PinnedSeriesTest() { store.useGenerator(&generator, "ifx"); }

    void show(const PlistValue& display)
    {
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
        time += 1s;
    }
    /// Points as "from-until: value", in seconds; with a "." where the line ends.
    std::vector<std::string> points(std::size_t pin = 0)
    {
        series.update();
        std::vector<std::string> lines;
        for (const SeriesPoint& point : series.series()[pin].points)
            lines.push_back(fmt::format("{}-{}: {}{}", (point.from - start) / 1s,
                                        (point.until - start) / 1s, point.value,
                                        point.isEnd ? "." : ""));
        return lines;
    }

    IdleGenerator generator;
    PlistDictionary state;
    Clock::TimePoint time = start;
    ChangeStore store{RecordsMode::Newer};
    PinnedSeries series{store};
};

PlistDictionary level(std::string_view text)
{
    return PlistDictionary{{"Level", text}};
}

} // namespace

TEST_F(PinnedSeriesTest, HasTheNumbersOfAValueAndSinceWhenTheyStand)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("-70 dBm")}});
    show(PlistDictionary{{"Cell", level("-75 dBm")}});
    EXPECT_THAT(points(), ElementsAre("0-0: -70", "1-1: -75"));
    EXPECT_EQ(series.series()[0].unit, "dBm");
    EXPECT_EQ(series.series()[0].pin.name, "Level");
}

TEST_F(PinnedSeriesTest, GoesOnWithWhatIsToldAgain)
{
    series.setPins({Pin::of("/Cell/Level")});
    for (int i = 0; i < 4; ++i)
        show(PlistDictionary{{"Cell", level("-70 dBm")}});
    EXPECT_THAT(points(), ElementsAre("0-3: -70"));
}

TEST_F(PinnedSeriesTest, StandsOnlyUntilItWasToldLast)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("1")}});
    time += 20s;
    show(PlistDictionary{{"Cell", level("2")}});
    EXPECT_THAT(points(), ElementsAre("0-0: 1", "21-21: 2"));
}

TEST_F(PinnedSeriesTest, HasAGapBeforeTheSameValueThatIsToldAgainLater)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("-62")}});
    time += 600s;
    show(PlistDictionary{{"Cell", level("-62")}});
    show(PlistDictionary{{"Cell", level("-62")}});
    EXPECT_THAT(points(), ElementsAre("0-0: -62", "601-602: -62"));
}

TEST_F(PinnedSeriesTest, HoldsAValueGoodForTenSeconds)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("-62")}});
    time += 9s;
    show(PlistDictionary{{"Cell", level("-62")}});
    EXPECT_THAT(points(), ElementsAre("0-10: -62"));
}

TEST_F(PinnedSeriesTest, TakesWhatIsNewEachTime)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("1")}});
    EXPECT_THAT(points(), ElementsAre("0-0: 1"));
    show(PlistDictionary{{"Cell", level("2")}});
    show(PlistDictionary{{"Cell", level("2")}});
    EXPECT_THAT(points(), ElementsAre("0-0: 1", "1-2: 2"));
}

TEST_F(PinnedSeriesTest, EndsWhereTheValueIsNoNumberAnyMore)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("1")}});
    show(PlistDictionary{{"Cell", level("N/A")}});
    show(PlistDictionary{{"Cell", level("2")}});
    EXPECT_THAT(points(), ElementsAre("0-1: 1.", "2-2: 2"));
}

TEST_F(PinnedSeriesTest, EndsWhereTheGroupGoes)
{
    series.setPins({Pin::of("/Cell/Level")});
    show(PlistDictionary{{"Cell", level("1")}});
    show(PlistDictionary{});
    EXPECT_THAT(points(), ElementsAre("0-1: 1."));
}

TEST_F(PinnedSeriesTest, OfAListIsTheHighestNumber)
{
    series.setPins({Pin::of("/Cells/*/Level")});
    show(PlistDictionary{{"Cells", PlistArray{level("-90"), level("-80"), level("none")}}});
    show(PlistDictionary{{"Cells", PlistArray{level("-90")}}});
    show(PlistDictionary{{"Cells", PlistArray()}});
    EXPECT_THAT(points(), ElementsAre("0-0: -80", "1-2: -90."));
    EXPECT_EQ(series.series()[0].pin.name, "Best Level");
}

TEST_F(PinnedSeriesTest, OfALaterPinBeginsWithWhatTheStoreHas)
{
    show(PlistDictionary{{"Cell", level("1")}});
    show(PlistDictionary{{"Cell", level("2")}});
    series.setPins({Pin::of("/Other"), Pin::of("/Cell/Level")});
    EXPECT_THAT(points(0), IsEmpty());
    EXPECT_THAT(points(1), ElementsAre("0-0: 1", "1-1: 2"));
}

TEST_F(PinnedSeriesTest, TellsWhatOneMessageToldOnce)
{
    series.setPins({Pin::of("/Cells/*/Level")});
    show(PlistDictionary{{"Cells", PlistArray{level("1"), level("2"), level("3")}}});
    EXPECT_THAT(points(), ElementsAre("0-0: 3"));
}

TEST_F(PinnedSeriesTest, LeavesOutPinsBeyondItsLimit)
{
    std::vector<Pin> pins;
    for (int i = 0; i < 40; ++i)
        pins.push_back(Pin::of("/" + std::to_string(i)));
    series.setPins(pins);
    EXPECT_EQ(series.series().size(), PinnedSeries::mostPins);
}

TEST_F(PinnedSeriesTest, DrawsALevelThatLeavesOutItsSignBelowZero)
{
    series.setPins({{"/Cells/*/Level", "Best", true}});
    show(PlistDictionary{{"Cells", PlistArray{level("90 dBm"), level("-80 dBm")}}});
    show(PlistDictionary{{"Cells", PlistArray{level("75 dBm"), level("-80 dBm")}}});
    EXPECT_THAT(points(), ElementsAre("0-0: -80", "1-1: -75"));
}

TEST_F(PinnedSeriesTest, HasTheUnitOfItsPinWhateverARecordTells)
{
    series.setPins({{"/Cell/Level", "RSCP", false, "dBm"}});
    show(PlistDictionary{{"Cell", level("-90")}});
    EXPECT_THAT(points(), ElementsAre("0-0: -90"));
    EXPECT_EQ(series.series()[0].unit, "dBm");
    show(PlistDictionary{{"Cell", level("-90 dB")}});
    EXPECT_EQ(series.series()[0].unit, "dBm");
}

namespace
{

/// Says of which code the record was that was read.
class TellingGenerator : public IdleGenerator
{
  public:
    const ReadLayout* lastRead() const override { return &read; }

    ReadLayout read{};
};

/// Series of a store that has dropped its beginning.
class PinnedSeriesOfALaterStoreTest : public testing::Test
{
  protected:
    PinnedSeriesOfALaterStoreTest()
    {
        generator.read.logCode = 1;
        store.useGenerator(&generator, "ifx");
    }

    void take()
    {
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
        time += 1s;
    }
    /// Enough of another record that what came before goes.
    void fill()
    {
        generator.read.logCode = 2;
        const auto first = store.firstMoment();
        for (int i = 0; i < 20000; ++i) {
            display.set("Count", fmt::format("{}", ++count));
            take();
            if (isFollowed && i % 100 == 0)
                series.update();
        }
        ASSERT_GT(store.firstMoment(), first + 10);
        generator.read.logCode = 1;
    }
    std::vector<double> values(std::size_t pin = 0)
    {
        series.update();
        std::vector<double> values;
        for (const SeriesPoint& point : series.series()[pin].points)
            values.push_back(point.value);
        return values;
    }

    TellingGenerator generator;
    PlistDictionary state;
    PlistDictionary display{{"Cell", PlistDictionary{{"Level", "-70 dBm"}}},
                            {"Cells", PlistArray{PlistDictionary{{"Level", "-80"}},
                                                 PlistDictionary{{"Level", "-90"}}}}};
    Clock::TimePoint time = start;
    ChangeStore store{RecordsMode::Newer, {.bytes = 65536}};
    PinnedSeries series{store};
    int count = 0;
    bool isFollowed = false;
};

} // namespace

TEST_F(PinnedSeriesOfALaterStoreTest, HasWhatStandsSinceBeforeTheStoresFirstMoment)
{
    take();
    fill();
    series.setPins({Pin::of("/Cell/Level")});
    ASSERT_THAT(values(), ElementsAre(-70));
    EXPECT_EQ(series.series()[0].unit, "dBm");
    EXPECT_EQ(series.series()[0].points[0].until, start) << "it was not told again";
    take();
    ASSERT_THAT(values(), ElementsAre(-70));
    EXPECT_EQ(series.series()[0].points[0].from, time - 1s);
}

TEST_F(PinnedSeriesOfALaterStoreTest, KnowsTheBestOfAListThatStandsSinceBefore)
{
    take();
    fill();
    series.setPins({Pin::of("/Cells/*/Level")});
    display.set("Cells",
                PlistArray{PlistDictionary{{"Level", "-80"}}, PlistDictionary{{"Level", "-85"}}});
    take();
    EXPECT_THAT(values(), ElementsAre(-80));
}

TEST_F(PinnedSeriesOfALaterStoreTest, KnowsWhatChangedInWhatItDidNotSee)
{
    series.setPins({Pin::of("/Cell/Level"), Pin::of("/Cells/*/Level")});
    take();
    EXPECT_THAT(values(), ElementsAre(-70));
    display.set("Cell", PlistDictionary{{"Level", "-75 dBm"}});
    display.remove("Cells");
    take();
    fill();
    EXPECT_THAT(values(), ElementsAre(-75));
    EXPECT_THAT(values(1), IsEmpty());
}

TEST_F(PinnedSeriesOfALaterStoreTest, GoesOnWithWhatWasNotToldForAsLongAsTheStoreHas)
{
    isFollowed = true;
    series.setPins({Pin::of("/Cell/Level")});
    take();
    fill();
    take();
    ASSERT_THAT(values(), ElementsAre(-70));
    EXPECT_EQ(series.series()[0].points[0].from, time - 1s);
}

TEST(PinTest, AreOfTheServingSetAndOfConnectedNeighborsFromTheStart)
{
    const auto isPinned = [](std::string_view technology, std::string_view path) {
        return std::ranges::any_of(defaultPins(technology),
                                   [path](const Pin& pin) { return pin.matches(path); });
    };
    EXPECT_TRUE(isPinned("gsm", "/Serving Cell/Active Set/0/RSCP"));
    EXPECT_TRUE(isPinned("gsm", "/Serving Cell/Active Set/0/Energy Per Chip"));
    EXPECT_TRUE(isPinned("lte", "/Neighbors/Measured Neighbor Cells/0/Filtered RSRP"));
}

TEST(PinTest, OfAPathOfADefaultIsThatDefault)
{
    for (const char* technology : {"lte", "gsm", "utran", "c2k", "ifx"})
        for (const Pin& pin : defaultPins(technology))
            EXPECT_EQ(Pin::of(pin.path), pin) << pin.path;
}

TEST(PinTest, OfAnElementLeavesOutTheSignWhereTheDefaultOfItsListDoes)
{
    const Pin pin = Pin::of("/Neighbors/Neighboring Cells/0/RSSI");
    EXPECT_EQ(pin.name, "GSM RSSI");
    EXPECT_TRUE(pin.leavesOutSign);
    EXPECT_EQ(pin.unit, "dBm") << "some records tell none, and bands are of levels";
    const Pin other = Pin::of("/Neighbors/Neighbor Cells List/0/Measured RSRP");
    EXPECT_EQ(other.name, "Measured RSRP");
    EXPECT_FALSE(other.leavesOutSign);
}

TEST(PinTest, MatchesElementsOfItsListOnly)
{
    const Pin pin = Pin::of("/Cells/*/Level");
    EXPECT_TRUE(pin.matches("/Cells/12/Level"));
    EXPECT_FALSE(pin.matches("/Cells/12/Other"));
    EXPECT_FALSE(pin.matches("/Cells/1/2/Level"));
    EXPECT_FALSE(pin.matches("/Cells/Level"));
    EXPECT_FALSE(pin.matches("/Other/1/Level"));
}

TEST(PinTest, IsOfEachTechnologyFromTheStart)
{
    for (const char* technology : {"lte", "gsm", "utran", "c2k", "ifx"})
        EXPECT_FALSE(defaultPins(technology).empty()) << technology;
    EXPECT_TRUE(defaultPins("other").empty());
}

namespace
{

/// What is pinned from the start, as a technology's scenario moves it.
class DefaultPinsTest : public testing::TestWithParam<std::string_view>
{
  protected:
    DefaultPinsTest() { addTemplates(fake.resources, VENTRIK_RESOURCES); }

    FakePlatform fake;
};

} // namespace

TEST_P(DefaultPinsTest, FindTheirPlaces)
{
    const Technology technology = *technologyNamed(GetParam());
    const auto generator = LogGenerator::generatorsReading(RecordsMode::Extended)(
        technology.identifier, {fake.log, fake.resources, fake.clock});
    ChangeStore store(RecordsMode::Extended);
    store.useGenerator(generator.get(), technology.name);
    PinnedSeries series(store);
    series.setPins(defaultPins(technology.name));
    const auto scenario = makeScenario(technology, 5, RecordsMode::Extended);
    PlistDictionary state;
    for (int i = 0; i < 2000; ++i) {
        const auto message = scenario->next();
        generator->updateState(state, message->data);
        store.messageTaken(start + message->due, message->data, state);
    }
    series.update();
    std::map<std::string, std::set<std::string>> units; // by the last word of their names
    for (const PinnedSeries::Series& each : series.series()) {
        EXPECT_FALSE(each.points.empty()) << each.pin.name;
        units[each.pin.name.substr(each.pin.name.rfind(' ') + 1)].insert(each.unit);
    }
    for (const auto& [quantity, different] : units)
        EXPECT_EQ(different.size(), 1U) << quantity << " has more than a lane";
}

INSTANTIATE_TEST_SUITE_P(OfScenarios, DefaultPinsTest, testing::Values("lte", "gsm", "c2k"),
                         [](const auto& name) { return std::string(name.param); });

TEST(MeasurementTest, IsANumberWithAUnitOfLevels)
{
    EXPECT_EQ(measurementIn("-73 dBm")->number, -73);
    EXPECT_EQ(measurementIn("-73 dBm")->unit, "dBm");
    EXPECT_EQ(measurementIn("+1.50 dB")->number, 1.5);
    EXPECT_EQ(measurementIn("+1.50 dB")->unit, "dB");
    EXPECT_FALSE(measurementIn("dB"));
    EXPECT_FALSE(measurementIn(" dB"));
    EXPECT_FALSE(measurementIn("5 sec"));
    EXPECT_FALSE(measurementIn("5dB"));
}

} // namespace ventrik
