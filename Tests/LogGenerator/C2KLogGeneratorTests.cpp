#include "LogGenerator/C2K/C2KOutput.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/LogGenerator/C2KFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using Line = CapturingSystemLog::Line;

class C2KLogGeneratorTest : public C2KFixture
{
  protected:
    Bytes collected()
    {
        generator->generateLogUsingState(state);
        return *state.find("DisplayState")->data();
    }
};

class C2KProcessTemplateTest : public testing::Test
{
  protected:
    void process(const PlistDictionary& displayTemplate)
    {
        C2KLogGenerator::processTemplate(displayTemplate, display, lookup, log);
    }
    PlistArray entries(std::string_view lookupKey) { return *lookup.find(lookupKey)->array(); }

    CapturingSystemLog log;
    PlistDictionary display;
    PlistDictionary lookup;
};

constexpr Field valueField{"k", u8(0)};
constexpr Field channelField{"kChannel", u8(0)};

class C2KOutputTest : public testing::Test
{
  protected:
    void publish()
    {
        C2KLabels labels;
        labels.useLookup(&lookup);
        C2KOutput(labels, totals, state, log).publish(valueField, "v");
    }

    CapturingSystemLog log;
    TotalPlaces totals;
    PlistDictionary state;
    PlistDictionary display;
    PlistDictionary lookup;
};

class C2KTextTableTest : public C2KOutputTest
{
  protected:
    C2KTextTableTest()
    {
        lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
        lookup.set("l", PlistArray{PlistDictionary{{"key", "B"}, {"dict", display}}});
        labels.useLookup(&lookup);
    }
    void publishText() { labels.publish(table, "N/A"); }
    void publishNumbers(const Bytes& part) { labels.publish(table, nullptr, LogPacket(part)); }

    static constexpr std::array<Field, 2> table{{{"k", u8(0)}, {"l", u8(1)}}};
    C2KLabels labels;
};

class C2KWithoutTemplateTest : public GeneratorFixture
{
  protected:
    std::unique_ptr<C2KLogGenerator> generator = C2KLogGenerator::generator(services());
};

} // namespace

TEST_F(C2KLogGeneratorTest, IsChosenForItsTechnology)
{
    const auto chosen =
        LogGenerator::generatorFromTechnology(kQXLogChannelTechnology_Orbel_CDMA, services());
    EXPECT_NE(dynamic_cast<C2KLogGenerator*>(chosen.get()), nullptr);
}

TEST_F(C2KLogGeneratorTest, AsksForItsEightCodesInOrder)
{
    const PlistDictionary command = generator->getStartCommand();
    EXPECT_THAT(keysOf(command), ElementsAre("SetState", "SetOrbelLogCodes"));
    EXPECT_EQ(textAt(command, {"SetState"}), "Streaming");
    EXPECT_EQ(*command.find("SetOrbelLogCodes"),
              PlistValue(PlistArray{4234, 4483, 4498, 4790, 4508, 4509, 4734, 4943}));
}

TEST_F(C2KLogGeneratorTest, TakesEachCodeToItsDecoder)
{
    const std::vector<std::pair<PacketBuilder, std::string>> packets{
        {fingerC2IPacket(), "kFingerC2I"},
        {evdoStatusPacket(), "kColorCode"},
        {activeSetPilotsPacket(), "kActiveSetPilots"},
        {oneXStatusPacket(), "k1xTxAGC"},
        {oneXTrafficFERPacket(true), "k1xTrafficFER"},
        {servingSystemPacket(), "kBaseId"}};
    for (const auto& [packet, key] : packets) {
        EXPECT_EQ(shown(key), "") << key;
        feed(packet);
        EXPECT_NE(shown(key), "") << key;
    }
    feed(forwardDataPacket(1));
    EXPECT_TRUE(state.contains("FLDataSeqNum"));
    EXPECT_FALSE(state.contains("RLDataSeqNum"));
    feed(reverseDataPacket(1));
    EXPECT_TRUE(state.contains("RLDataSeqNum"));
    EXPECT_THAT(platform.log.lines(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, APacketOf12BytesIsIgnored)
{
    feed(PacketBuilder(0x1183).type(2).size(12));
    EXPECT_THAT(platform.log.lines(), IsEmpty());
    EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, APrefixedPacketOf13BytesIsReadFrom11)
{
    feed(PacketBuilder(0x1183).size(11).withPrefix());
    EXPECT_THAT(platform.log.lines(),
                ElementsAre(Line{3, "Log code 0x1183 is 11 bytes long but should be 50 bytes."}));
    EXPECT_THAT(collected(), testing::SizeIs(11));
}

TEST_F(C2KLogGeneratorTest, APacketOfAnotherTypeIsReportedAndDecoded)
{
    feed(evdoStatusPacket().type(2));
    EXPECT_EQ(shown("kChannel"), "283");
    feed(evdoStatusPacket().type(0xAB));
    EXPECT_THAT(platform.log.lines(), ElementsAre(Line{3, "Invalid log type: 2. Dropping."},
                                                  Line{3, "Invalid log type: ab. Dropping."}));
    EXPECT_THAT(collected(), testing::SizeIs(100));
}

TEST_F(C2KLogGeneratorTest, APacketOfAnExtraCodeIsReportedAndIgnored)
{
    feed(evdoStatusPacket().type(255));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.texts(), ElementsAre("Invalid log type: ff. Dropping."));
    EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, AnUnlistedCodeIsIgnored)
{
    feed(PacketBuilder(0x1184).size(50));
    EXPECT_TRUE(showsNothing());
    EXPECT_THAT(platform.log.lines(), IsEmpty());
    EXPECT_THAT(collected(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, KeepsListedPacketsWithoutTheirPrefix)
{
    const Bytes status = evdoStatusPacket().build();
    const Bytes rejected = PacketBuilder(0x134F).size(20).build();
    feed(evdoStatusPacket().withPrefix());
    feed(PacketBuilder(0x2000).size(20));
    feed(rejected);
    Bytes both = status;
    both.insert(both.end(), rejected.begin(), rejected.end());
    EXPECT_EQ(collected(), both);
}

TEST_F(C2KLogGeneratorTest, APeriodWithoutPacketsKeepsTheDisplayAndNoBytes)
{
    feed(evdoStatusPacket());
    const auto first = generator->generateLogUsingState(state);
    const auto second = generator->generateLogUsingState(state);
    EXPECT_TRUE(first->dictionary()->isSameContainer(*second->dictionary()));
    EXPECT_EQ(textAt(*second, {"kChannel"}), "283");
    EXPECT_THAT(*state.find("DisplayState")->data(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, RecordsEachPeriodInTheHistory)
{
    feed(evdoStatusPacket());
    generator->generateLogUsingState(state);
    const PlistArray& history = *state.find("History")->array();
    ASSERT_EQ(history.size(), 1U);
    EXPECT_THAT(keysOf(*history[0].dictionary()),
                ElementsAre("DisplayState", "Display", "ExtraInfo", "Date", "Description"));
}

TEST_F(C2KLogGeneratorTest, SavesADlfLogOfItsPackets)
{
    feed(evdoStatusPacket());
    generator->generateLogUsingState(state);
    const PlistValue saved = generator->getSaveContentsFromState(state);
    EXPECT_EQ(textAt((*saved.array())[1], {"Description"}), "DLF binary (210 bytes)"); // 161 + 49
}

TEST_F(C2KLogGeneratorTest, TheDisplayGoesOnWithTheNextGenerator)
{
    feed(evdoStatusPacket());
    generator = C2KLogGenerator::generator(services());
    feed(servingSystemPacket());
    EXPECT_EQ(shown("kChannel"), "283");
    EXPECT_EQ(shown("kBaseId"), "1201");
}

TEST_F(C2KLogGeneratorTest, TheDisplayOfAnotherTechnologyMakesWay)
{
    state.set("DisplayOwner", "LTE");
    state.set("Display", PlistDictionary{{"RSRP", "-90"}});
    feed(evdoStatusPacket());
    EXPECT_EQ(shown("RSRP"), "(no label)");
    EXPECT_EQ(shown("kChannel"), "283");
}

TEST_F(C2KLogGeneratorTest, TheTemplateIsReadOnce)
{
    PlistDictionary other;
    other.set("DisplayOwner", "C2KTemplate");
    other.set("Template", PlistDictionary{{"Channel", "kChannel"}});
    generator->updateState(other, evdoStatusPacket().build());
    EXPECT_EQ(textAt(*other.find("Display"), {"Channel"}), "283");
    platform.resources.remove("/res/C2KTemplate.plist");
    state.remove("Display");
    EXPECT_TRUE(generator->getDisplayFromState(state));
}

TEST_F(C2KLogGeneratorTest, ALostLookupPublishesNothing)
{
    state.remove("Lookup");
    feed(evdoStatusPacket());
    EXPECT_TRUE(showsNothing());
}

TEST_F(C2KWithoutTemplateTest, EveryAttemptIsReported)
{
    platform.log.clear();
    EXPECT_EQ(generator->getDisplayFromState(state), std::nullopt);
    EXPECT_EQ(generator->generateLogUsingState(state), std::nullopt);
    EXPECT_THAT(platform.log.lines(), ElementsAre(Line{3, "Cannot load C2K template for display"},
                                                  Line{3, "Cannot load C2K template for display"}));
    EXPECT_FALSE(state.contains("Template"));
    EXPECT_FALSE(state.contains("ExtraInfo"));
}

TEST_F(C2KWithoutTemplateTest, ATemplateThatIsNoDictionaryCounts)
{
    platform.resources.add("/res/C2KTemplate.plist", plistXml("<array/>"));
    EXPECT_EQ(generator->getDisplayFromState(state), std::nullopt);
    EXPECT_TRUE(platform.log.contains("Cannot load C2K template for display"));
}

TEST_F(C2KWithoutTemplateTest, PacketsAreDecodedAndKeptAllTheSame)
{
    generator->updateState(state, forwardDataPacket(1).build());
    EXPECT_TRUE(state.contains("FLDataSeqNum"));
    EXPECT_FALSE(state.contains("ExtraInfo"));
    generator->generateLogUsingState(state);
    EXPECT_THAT(*state.find("DisplayState")->data(), testing::SizeIs(241));
}

TEST_F(C2KProcessTemplateTest, MirrorsGroupsAndEmptiesValues)
{
    process({{"Channel", "kChannel"},
             {"Status", PlistDictionary{{"Channel", "kChannel"}, {"Order", "_sorted"}}}});
    EXPECT_EQ(display, (PlistDictionary{
                           {"Channel", ""},
                           {"Status", PlistDictionary{{"Channel", ""}, {"Order", "_sorted"}}}}));
    EXPECT_THAT(keysOf(lookup), ElementsAre("kChannel"));
    EXPECT_EQ(entries("kChannel").size(), 2U);
}

TEST_F(C2KProcessTemplateTest, OnePublishedValueFillsAllItsLabels)
{
    process({{"Channel", "kChannel"}, {"Status", PlistDictionary{{"Number", "kChannel"}}}});
    PlistDictionary state;
    TotalPlaces totals;
    C2KLabels labels;
    labels.useLookup(&lookup);
    C2KOutput(labels, totals, state, log).publish(channelField, "283");
    EXPECT_EQ(textAt(display, {"Channel"}), "283");
    EXPECT_EQ(textAt(display, {"Status", "Number"}), "283");
}

TEST_F(C2KProcessTemplateTest, EntriesHoldALabelAndItsGroup)
{
    process({{"Group", PlistDictionary{{"B", "k"}}}, {"A", "k"}});
    ASSERT_EQ(entries("k").size(), 2U);
    const PlistDictionary& first = *entries("k")[0].dictionary();
    EXPECT_THAT(keysOf(first), ElementsAre("key", "dict"));
    EXPECT_EQ(textAt(first, {"key"}), "B");
    EXPECT_TRUE(
        first.find("dict")->dictionary()->isSameContainer(*display.find("Group")->dictionary()));
    EXPECT_EQ(textAt(*entries("k")[1].dictionary(), {"key"}), "A");
}

TEST_F(C2KProcessTemplateTest, OtherKindsAreSkipped)
{
    process({{"Number", 1}, {"List", PlistArray{"k"}}, {"Flag", true}, {"Data", Bytes{1}}});
    EXPECT_TRUE(display.empty());
    EXPECT_TRUE(lookup.empty());
}

TEST_F(C2KProcessTemplateTest, EachGroupIsALineInTheLog)
{
    process({});
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "Processing the template"}));
    process({{"A", PlistDictionary{{"B", PlistDictionary{}}}}, {"C", PlistDictionary{}}});
    EXPECT_EQ(log.count("Processing the template"), 1U + 4U);
}

TEST_F(C2KOutputTest, AKeyWithoutLabelsIsDropped)
{
    publish();
    lookup.set("k", "no array");
    publish();
    EXPECT_TRUE(display.empty());
}

// Whoever changes the display behind the labels' back sees what they store.
TEST_F(C2KOutputTest, AnUnchangedValueIsNotStoredAgain)
{
    constexpr Field field{"k", u8(0)};
    lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
    C2KLabels labels;
    labels.useLookup(&lookup);
    labels.publish(field, nullptr, 5);
    EXPECT_EQ(textAt(display, {"A"}), "5");
    display.set("A", "mine");
    labels.publish(field, nullptr, 5);
    EXPECT_EQ(textAt(display, {"A"}), "mine");
    labels.publish(field, nullptr, 6);
    EXPECT_EQ(textAt(display, {"A"}), "6");
    labels.publish(field, "N/A");
    labels.publish(field, nullptr, 6);
    EXPECT_EQ(textAt(display, {"A"}), "6");
}

TEST_F(C2KTextTableTest, ShowsTheTextInThePlaceOfEachNumber)
{
    publishText();
    EXPECT_EQ(display, (PlistDictionary{{"A", "N/A"}, {"B", "N/A"}}));
}

TEST_F(C2KTextTableTest, NumbersAndTextsTakeTurns)
{
    for (int i = 0; i < 2; ++i) {
        publishNumbers({5, 6});
        EXPECT_EQ(display, (PlistDictionary{{"A", "5"}, {"B", "6"}}));
        publishText();
        EXPECT_EQ(display, (PlistDictionary{{"A", "N/A"}, {"B", "N/A"}}));
    }
}

TEST_F(C2KTextTableTest, TheTextComesAgainAfterASingleField)
{
    publishText();
    labels.publish(table[1], "mine");
    publishText();
    EXPECT_EQ(textAt(display, {"B"}), "N/A");
}

// Who wrote the same text last matters: that one's next text is another.
TEST_F(C2KTextTableTest, TheTextComesAgainAfterASingleFieldThatHadTheSameOne)
{
    publishText();
    labels.publish(table[1], "N/A");
    publishText();
    labels.publish(table[1], "mine");
    publishText();
    EXPECT_EQ(textAt(display, {"B"}), "N/A");
}

TEST_F(C2KTextTableTest, NumbersComeAgainAfterAPartOfTheirTableShowedOthers)
{
    const auto first = std::span(table).first(1);
    const Bytes five{5, 6};
    const Bytes seven{7, 6};
    labels.publish(first, nullptr, LogPacket(five));
    publishNumbers(five);
    labels.publish(first, nullptr, LogPacket(seven));
    publishNumbers(five);
    EXPECT_EQ(textAt(display, {"A"}), "5");
}

TEST_F(C2KTextTableTest, TheTextShowsAgainInAnotherLookup)
{
    publishText();
    const PlistDictionary shown;
    const PlistDictionary other{{"k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", shown}}}}};
    labels.useLookup(&other);
    publishText();
    EXPECT_EQ(shown, (PlistDictionary{{"A", "N/A"}}));
}

TEST_F(C2KTextTableTest, AnUnchangedTextIsNotStoredAgain)
{
    publishText();
    display.set("A", "mine");
    publishText();
    EXPECT_EQ(textAt(display, {"A"}), "mine");
}

TEST_F(C2KOutputTest, AnotherLookupIsFilledAnew)
{
    constexpr Field field{"k", u8(0)};
    lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
    C2KLabels labels;
    labels.useLookup(&lookup);
    labels.publish(field, nullptr, 5);
    PlistDictionary second;
    const PlistDictionary other{{"k", PlistArray{PlistDictionary{{"key", "B"}, {"dict", second}}}}};
    labels.useLookup(&other);
    labels.publish(field, nullptr, 5);
    EXPECT_EQ(second, (PlistDictionary{{"B", "5"}}));
}

TEST_F(C2KOutputTest, ATableShowsAgainInAnotherLookup)
{
    static constexpr std::array<Field, 2> table{{{"k", u8(0)}, {"l", u8(1)}}};
    const Bytes part{5, 6};
    C2KLabels labels;
    for (int i = 0; i < 2; ++i) {
        const PlistDictionary shown;
        const PlistDictionary fresh{
            {"k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", shown}}}},
            {"l", PlistArray{PlistDictionary{{"key", "B"}, {"dict", shown}}}}};
        labels.useLookup(&fresh);
        labels.publish(table, nullptr, LogPacket(part));
        EXPECT_EQ(shown, (PlistDictionary{{"A", "5"}, {"B", "6"}}));
    }
}

TEST_F(C2KOutputTest, PilotsOfTheSameBytesNeedNotBeWorkedOutAgain)
{
    constexpr Field field{"k", u8(0)};
    lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
    C2KLabels labels;
    labels.useLookup(&lookup);
    const Bytes source{1, 2};
    EXPECT_FALSE(labels.showsPilotsOf(field, source));
    labels.publish(field, {{0, 12, -3.5}}, source);
    EXPECT_TRUE(labels.showsPilotsOf(field, source));
    EXPECT_FALSE(labels.showsPilotsOf(field, Bytes{1, 3}));
    labels.publish(field, {{0, 12, -4}}, "nothing");
    EXPECT_FALSE(labels.showsPilotsOf(field, source));
    EXPECT_FALSE(labels.showsPilotsOf(field, ByteView()));
    labels.publish(field, {{0, 12, -3.5}}, source);
    labels.publish(field, "nothing");
    EXPECT_FALSE(labels.showsPilotsOf(field, source));
}

TEST_F(C2KOutputTest, AGroupOfPilotsThatChangesIsANewGroup)
{
    constexpr Field field{"k", u8(0)};
    lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
    C2KLabels labels;
    labels.useLookup(&lookup);
    labels.publish(field, {{0, 12, -3.5}}, "nothing");
    const PlistDictionary before = *display.find("A")->dictionary();
    labels.publish(field, {{0, 12, -3.5}}, "nothing");
    EXPECT_TRUE(display.find("A")->dictionary()->isSameContainer(before));
    labels.publish(field, {{0, 12, -4}}, "nothing");
    EXPECT_EQ(textAt(before, {"0;12"}), "-3.50 dB");
    EXPECT_EQ(textAt(display, {"A", "0;12"}), "-4.00 dB");
    labels.publish(field, std::vector<ShownPilot>(), "nothing");
    EXPECT_EQ(textAt(display, {"A"}), "nothing");
}

TEST_F(C2KOutputTest, PilotsThatComeAndGoLeaveAGroupThatSomebodyHolds)
{
    constexpr Field field{"k", u8(0)};
    lookup.set("k", PlistArray{PlistDictionary{{"key", "A"}, {"dict", display}}});
    C2KLabels labels;
    labels.useLookup(&lookup);
    labels.publish(field, {{0, 12, -3.5}}, "nothing");
    const PlistDictionary held = *display.find("A")->dictionary();
    const PlistDictionary heldAsWell = held;
    for (int round = 0; round < 2; ++round) {
        labels.publish(field, std::vector<ShownPilot>(), "nothing");
        EXPECT_EQ(textAt(display, {"A"}), "nothing");
        labels.publish(field, {{0, 12, -4}}, "nothing");
        EXPECT_EQ(textAt(display, {"A", "0;12"}), "-4.00 dB");
    }
    EXPECT_EQ(textAt(held, {"0;12"}), "-3.50 dB");
}

TEST_F(C2KOutputTest, AnEntryThatIsNoneEndsThePublishing)
{
    const PlistDictionary good{{"key", "A"}, {"dict", display}};
    const PlistDictionary last{{"key", "B"}, {"dict", display}};
    const std::vector<PlistValue> bad{PlistDictionary{{"key", "X"}},
                                      PlistDictionary{{"dict", display}},
                                      PlistDictionary{{"key", 1}, {"dict", display}},
                                      PlistDictionary{{"key", "X"}, {"dict", "text"}}, "text"};
    for (const PlistValue& entry : bad) {
        display.clear();
        lookup.set("k", PlistArray{good, entry, last});
        publish();
        EXPECT_EQ(display, (PlistDictionary{{"A", "v"}}));
    }
}

} // namespace ventrik
