#include "LogGenerator/Core/AssertionFailure.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <csignal>
#include <cstdio>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::KilledBySignal;

Bytes message(const PlistValue& root)
{
    return propertyListBytes(root).value();
}

// Lets the lines be seen from outside a process that ends.
class PrintingSystemLog : public SystemLog
{
  public:
    PrintingSystemLog() : SystemLog(LogPriority::debug) {}

  protected:
    void write(int priority, std::string_view text) override
    {
        fmt::print(stderr, "log {} {}\n", priority, text);
    }
};

class GSMLogGeneratorTest : public GeneratorFixture
{
  protected:
    PlistValue processed(const PlistValue& value)
    {
        return GSMLogGenerator::processObject(value, platform.log);
    }
    void feed(const PlistValue& root) { generator->updateState(state, message(root)); }
    PlistValue display() { return *state.find("Display"); }
    static void feedToPrintingLog(const Bytes& data)
    {
        PrintingSystemLog log;
        const FakePlatform fake;
        PlistDictionary state;
        GSMLogGenerator::generator({log, fake.resources, fake.clock})->updateState(state, data);
    }

    std::unique_ptr<GSMLogGenerator> generator = GSMLogGenerator::generator(services());
};

using GSMLogGeneratorDeathTest = GSMLogGeneratorTest;

// "bplist00", an array of 2 and 5, the offsets 8, 11 and 13, and the trailer.
const Bytes binaryArrayOfTwoNumbers{'b',  'p', 'l', 'i', 's', 't', '0', '0', 0xA2, 1, 2, 0x10, 2,
                                    0x10, 5,   8,   11,  13,  0,   0,   0,   0,    0, 0, 1,    1,
                                    0,    0,   0,   0,   0,   0,   0,   3,   0,    0, 0, 0,    0,
                                    0,    0,   0,   0,   0,   0,   0,   0,   0,    0, 15};

} // namespace

TEST_F(GSMLogGeneratorTest, IsChosenForItsTechnology)
{
    const auto chosen =
        LogGenerator::generatorFromTechnology(kQXLogChannelTechnology_IFX, services());
    EXPECT_NE(dynamic_cast<GSMLogGenerator*>(chosen.get()), nullptr);
}

TEST_F(GSMLogGeneratorTest, AsksForStreamingAndNoMore)
{
    EXPECT_EQ(generator->getStartCommand(), (PlistDictionary{{"SetState", "Streaming"}}));
}

TEST_F(GSMLogGeneratorTest, LogsItsCreation)
{
    ASSERT_EQ(platform.log.lines().size(), 1U);
    EXPECT_EQ(platform.log.lines()[0].priority, 4);
    EXPECT_THAT(platform.log.lines()[0].text, testing::StartsWith("Creating Log object: 0x"));
}

TEST_F(GSMLogGeneratorTest, AStringStaysAsItIs)
{
    EXPECT_EQ(processed("-70 dBm"), PlistValue("-70 dBm"));
    EXPECT_EQ(processed(""), PlistValue(""));
}

TEST_F(GSMLogGeneratorTest, AnArrayLosesItsFirstElement)
{
    EXPECT_EQ(processed(PlistArray{"a", "b", "c"}), PlistValue(PlistArray{"b", "c"}));
    EXPECT_EQ(processed(PlistArray{"a"}), PlistValue(PlistArray{}));
    EXPECT_EQ(processed(PlistArray{}), PlistValue(PlistArray{}));
}

TEST_F(GSMLogGeneratorTest, EveryArrayInsideLosesItsFirstElement)
{
    EXPECT_EQ(processed(PlistArray{"x", PlistArray{"y", "a", "b"}}),
              PlistValue(PlistArray{PlistValue(PlistArray{"a", "b"})}));
}

TEST_F(GSMLogGeneratorTest, TheFirstElementIsNotLookedAt)
{
    EXPECT_EQ(processed(PlistArray{7, "a"}), PlistValue(PlistArray{"a"}));
}

TEST_F(GSMLogGeneratorTest, AnInnerDictionaryOfOneEntryGivesWayToItsValue)
{
    EXPECT_EQ(processed(PlistDictionary{{"Cell", PlistDictionary{{"RSSI", "-70"}}}}),
              PlistValue(PlistDictionary{{"Cell", "-70"}}));
    EXPECT_EQ(processed(PlistArray{"x", PlistDictionary{{"RSSI", "-70"}}}),
              PlistValue(PlistArray{"-70"}));
}

TEST_F(GSMLogGeneratorTest, ANestOfSuchDictionariesGivesWayAltogether)
{
    const PlistDictionary inner{{"B", PlistDictionary{{"C", PlistDictionary{{"D", "x"}}}}}};
    EXPECT_EQ(processed(PlistDictionary{{"A", inner}, {"E", "y"}}),
              PlistValue(PlistDictionary{{"A", "x"}, {"E", "y"}}));
}

TEST_F(GSMLogGeneratorTest, TheValueThatComesInstallsItselfWhateverItIs)
{
    EXPECT_EQ(processed(PlistDictionary{{"Cells", PlistDictionary{{"List", PlistArray{"x", "a"}}}},
                                        {"Last", "z"}}),
              PlistValue(PlistDictionary{{"Cells", PlistArray{"a"}}, {"Last", "z"}}));
}

TEST_F(GSMLogGeneratorTest, InnerDictionariesOfNoneOrTwoEntriesStay)
{
    const PlistDictionary two{{"A", "1"}, {"B", "2"}};
    const PlistDictionary root{{"None", PlistDictionary{}}, {"Two", two}};
    EXPECT_EQ(processed(root), PlistValue(root));
}

TEST_F(GSMLogGeneratorTest, TheTopLevelIsNeverCollapsed)
{
    const PlistDictionary root{{"Cell", "a"}};
    EXPECT_EQ(processed(root), PlistValue(root));
    EXPECT_EQ(processed(PlistDictionary{{"A", PlistDictionary{{"B", PlistDictionary{}}}}}),
              PlistValue(PlistDictionary{{"A", PlistDictionary{}}}));
}

TEST_F(GSMLogGeneratorTest, KeysKeepTheirOrder)
{
    const PlistValue value = processed(PlistDictionary{{"z", "1"}, {"a", "2"}, {"m", "3"}});
    EXPECT_THAT(keysOf(*value.dictionary()), ElementsAre("z", "a", "m"));
}

TEST_F(GSMLogGeneratorTest, CanCollapseGivesTheValueOfAOneEntryDictionary)
{
    EXPECT_EQ(generator->canCollapse(PlistDictionary{{"A", "x"}}), PlistValue("x"));
    EXPECT_EQ(generator->canCollapse(PlistDictionary{}), std::nullopt);
    EXPECT_EQ(generator->canCollapse(PlistDictionary{{"A", "x"}, {"B", "y"}}), std::nullopt);
    EXPECT_EQ(generator->canCollapse(PlistArray{"x"}), std::nullopt);
    EXPECT_EQ(generator->canCollapse("x"), std::nullopt);
}

TEST_F(GSMLogGeneratorTest, AMessageFillsTheState)
{
    const PlistDictionary root{{"Cells", PlistArray{"count", "a"}}, {"Band", "900"}};
    feed(root);
    EXPECT_EQ(*state.find("DisplayState"), PlistValue(root));
    EXPECT_EQ(display(), PlistValue(PlistDictionary{{"Cells", PlistArray{"a"}}, {"Band", "900"}}));
    EXPECT_EQ(*state.find("ExtraInfo"), PlistValue(PlistDictionary{}));
}

TEST_F(GSMLogGeneratorTest, TheNextMessageReplacesTheValues)
{
    feed(PlistDictionary{{"A", "1"}, {"B", "2"}});
    state.find("ExtraInfo")->dictionary()->set("old", "x");
    feed(PlistDictionary{{"B", "3"}});
    EXPECT_EQ(display(), PlistValue(PlistDictionary{{"B", "3"}}));
    EXPECT_EQ(*state.find("DisplayState"), PlistValue(PlistDictionary{{"B", "3"}}));
    EXPECT_EQ(*state.find("ExtraInfo"), PlistValue(PlistDictionary{}));
}

TEST_F(GSMLogGeneratorTest, GeneratingRecordsTheDisplayAndGivesIt)
{
    feed(PlistDictionary{{"A", "1"}, {"B", "2"}});
    EXPECT_EQ(generator->generateLogUsingState(state), display());
    const PlistValue saved = generator->getSaveContentsFromState(state);
    ASSERT_EQ(saved.array()->size(), 1U);
    EXPECT_THAT(keysOf(*(*saved.array())[0].dictionary()),
                ElementsAre("DisplayState", "Display", "ExtraInfo", "Date", "Description"));
}

TEST_F(GSMLogGeneratorTest, WithoutAMessageThereIsNoDisplayAndNothingToRecord)
{
    EXPECT_FALSE(generator->generateLogUsingState(state));
    EXPECT_FALSE(state.contains("History"));
}

TEST_F(GSMLogGeneratorTest, SavesANewArrayWithTheHistoryAlone)
{
    EXPECT_EQ(generator->getSaveContentsFromState(state), PlistValue(PlistArray{}));
    const PlistArray history{PlistDictionary{{"Date", "d"}}};
    state.set("History", history);
    const PlistValue saved = generator->getSaveContentsFromState(state);
    EXPECT_EQ(saved, PlistValue(history));
    EXPECT_FALSE(saved.array()->isSameContainer(history));
}

TEST_F(GSMLogGeneratorTest, TheDisplayOfAnotherTechnologyMakesWay)
{
    state.set("DisplayOwner", "LTE");
    state.set("Display", PlistDictionary{{"RSRP", "-90"}});
    EXPECT_EQ(generator->generateLogUsingState(state), std::nullopt);
    feed(PlistDictionary{{"A", "1"}});
    EXPECT_EQ(generator->generateLogUsingState(state), PlistDictionary({{"A", "1"}}));
}

TEST_F(GSMLogGeneratorTest, ADisplayOfItsOwnKindGoesOn)
{
    feed(PlistDictionary{{"A", "1"}});
    EXPECT_EQ(GSMLogGenerator::generator(services())->generateLogUsingState(state),
              PlistDictionary({{"A", "1"}}));
}

TEST_F(GSMLogGeneratorDeathTest, AMessageThatIsNoPropertyListEndsTheProcess)
{
    const Bytes text{'c', 'e', 'l', 'l'};
    for (const Bytes& data : {Bytes{}, text, Bytes(13, 1)})
        EXPECT_EXIT(generator->updateState(state, data), KilledBySignal(SIGABRT),
                    "Could not deserialize the object.*LogGenerator/GSM/GSMLogGenerator, line 90");
}

TEST_F(GSMLogGeneratorDeathTest, AnythingButTextAtALeafEndsTheProcess)
{
    const std::vector<std::pair<PlistValue, std::string>> leaves{{5, "integer"},
                                                                 {0.5, "real"},
                                                                 {true, "boolean"},
                                                                 {Bytes{1}, "data"},
                                                                 {PlistDate{0}, "date"}};
    for (const auto& [leaf, name] : leaves) {
        const std::string text = "Unknown object of type " + name +
                                 " encountered.*LogGenerator/GSM/GSMLogGenerator, line 78";
        EXPECT_EXIT(feed(leaf), KilledBySignal(SIGABRT), text);
        EXPECT_EXIT(feed(PlistDictionary{{"A", leaf}}), KilledBySignal(SIGABRT), text);
        EXPECT_EXIT(feed(PlistArray{"x", PlistArray{"y", leaf}}), KilledBySignal(SIGABRT), text);
    }
}

TEST_F(GSMLogGeneratorDeathTest, BinaryMessagesAreReadAsWell)
{
    EXPECT_EXIT(generator->updateState(state, binaryArrayOfTwoNumbers), KilledBySignal(SIGABRT),
                "Unknown object of type integer encountered");
}

TEST_F(GSMLogGeneratorDeathTest, TheSystemLogIsToldBeforeStandardError)
{
    EXPECT_EXIT(feedToPrintingLog(Bytes{}), KilledBySignal(SIGABRT),
                "log 3 Assertion failure: Could not deserialize the object "
                ".LogGenerator/GSM/GSMLogGenerator, line 90.\n"
                "Assertion failure: Could not deserialize the object");
}

TEST_F(GSMLogGeneratorTest, ThrowsItsAssertionFailuresWhereThatIsAskedFor)
{
    GeneratorServices throwing = services();
    throwing.assertions = AssertionPolicy::Throw;
    const auto thrower = GSMLogGenerator::generator(throwing);
    thrower->updateState(state, message(PlistDictionary{{"A", "a"}}));
    EXPECT_THROW(thrower->updateState(state, message(PlistDictionary{{"A", 1}})), AssertionFailure);
    EXPECT_THROW(thrower->updateState(state, Bytes{}), AssertionFailure);
    EXPECT_EQ(platform.log.texts(3).size(), 2U);
    EXPECT_EQ(display(), PlistValue(PlistDictionary{{"A", "a"}}));
}

TEST_F(GSMLogGeneratorTest, ADisplayOfAnotherTechnologyThatMakesWayLeavesNoBrokenHistoryEntry)
{
    state.set("DisplayOwner", "LTE");
    state.set("DisplayState", Bytes{1});
    state.set("Display", PlistDictionary{{"RSRP", "-100"}});
    state.set("ExtraInfo", PlistDictionary());
    EXPECT_FALSE(generator->generateLogUsingState(state));
    EXPECT_FALSE(state.contains("History"));
}

} // namespace ventrik
