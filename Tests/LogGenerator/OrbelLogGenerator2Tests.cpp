#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

constexpr Record first{0x1000, "First", 0};
constexpr Record both{0x2000, "Both", 0};
constexpr Record extra{0xFF0000, "Extra", 0};
constexpr SectionTable firstTable{.name = "First", .records = {{{&first}, {&both}, {&extra}}}};
constexpr SectionTable secondTable{.name = "Second", .records = {{{&both}}}};

// Notes every packet that reaches it, and shows the last one's size.
class NotingSection : public Base
{
  public:
    NotingSection(SystemLog& log, const SectionTable& table, std::vector<std::string>& notes)
        : Base(log, table), _notes(notes)
    {
    }

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override
    {
        _notes.push_back(
            fmt::format("{} {:X} {}", getSectionName(), shown.record->logCode, packet.size()));
        showValue("Size", fmt::format("{}", packet.size()));
    }

    std::vector<std::string>& _notes;
};

class NotingIndex : public ClassIndex
{
  public:
    NotingIndex(SystemLog& log, std::vector<std::string>& notes) : ClassIndex(log)
    {
        add<NotingSection>(firstTable, notes);
        add<NotingSection>(secondTable, notes);
    }
};

class NotingGenerator : public OrbelLogGenerator2
{
  public:
    NotingGenerator(const GeneratorServices& services, std::vector<std::string>& notes)
        : OrbelLogGenerator2(services)
    {
        initWithPListName("Notes", std::make_shared<NotingIndex>(log(), notes));
    }
};

class OrbelLogGenerator2Test : public GeneratorFixture
{
  protected:
    OrbelLogGenerator2Test()
    {
        setTemplate("<dict><key>Group</key><dict><key>_sorted</key><string>1</string>"
                    "<key>First</key><dict><key>Size</key><string>-</string></dict></dict>"
                    "<key>Second</key><dict/></dict>");
        generator = std::make_unique<NotingGenerator>(services(), notes);
        platform.log.clear();
    }

    void setTemplate(std::string_view content)
    {
        platform.resources.add("/res/Notes.plist", plistXml(content));
    }
    void feed(const Bytes& packet) { generator->updateState(state, packet); }
    std::string displayed(std::initializer_list<std::string_view> path)
    {
        return state.contains("Display") ? textAt(*state.find("Display"), path) : "(no display)";
    }

    std::vector<std::string> notes;
    std::unique_ptr<NotingGenerator> generator;
};

} // namespace

TEST_F(OrbelLogGenerator2Test, RoutesAPacketToItsSubscribersInOrder)
{
    feed(PacketBuilder(0x2000).build());
    EXPECT_THAT(notes, ElementsAre("First 2000 13", "Second 2000 13"));
}

TEST_F(OrbelLogGenerator2Test, RoutesExtraCodesByTheTypeByte)
{
    feed(PacketBuilder(0xFF0000).build());
    feed(PacketBuilder(0x0000).build());
    EXPECT_THAT(notes, ElementsAre("First FF0000 13"));
}

TEST_F(OrbelLogGenerator2Test, IgnoresAPacketOf12Bytes)
{
    feed(PacketBuilder(0x1000).size(12).build());
    EXPECT_TRUE(notes.empty());
    EXPECT_FALSE(platform.log.contains("Invalid log type: 0. Dropping."));
}

TEST_F(OrbelLogGenerator2Test, DecodesAPrefixedPacketOf13BytesFrom11)
{
    feed(PacketBuilder(0x1000).size(11).withPrefix().build());
    EXPECT_THAT(notes, ElementsAre("First 1000 11"));
}

TEST_F(OrbelLogGenerator2Test, DropsAPacketOfAnotherType)
{
    feed(PacketBuilder(0x1000).type(2).build());
    feed(PacketBuilder(0x1000).type(0xFE).build());
    EXPECT_TRUE(notes.empty());
    EXPECT_THAT(platform.log.texts(3),
                ElementsAre("Invalid log type: 2. Dropping.", "Invalid log type: fe. Dropping."));
}

TEST_F(OrbelLogGenerator2Test, TakesAPacketNobodyWantsSilently)
{
    feed(PacketBuilder(0x1000).build());
    platform.log.clear();
    feed(PacketBuilder(0x3000).build());
    EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(OrbelLogGenerator2Test, TheFirstPacketFindsItsSectionBound)
{
    feed(PacketBuilder(0x1000).size(20).build());
    EXPECT_EQ(displayed({"Group", "First", "Size"}), "20");
}

TEST_F(OrbelLogGenerator2Test, TheCallThatBuildsTheDisplayReturnsNone)
{
    EXPECT_FALSE(generator->getDisplayFromState(state));
    EXPECT_TRUE(generator->getDisplayFromState(state));
}

TEST_F(OrbelLogGenerator2Test, TheFirstGenerationWithoutAPacketReturnsNoneButFillsTheState)
{
    EXPECT_FALSE(generator->generateLogUsingState(state));
    EXPECT_TRUE(state.contains("Display"));
    EXPECT_TRUE(state.contains("ExtraInfo"));
    EXPECT_EQ(*state.find("DisplayState"), PlistValue(Bytes()));
    EXPECT_EQ(state.find("History")->array()->size(), 1U);
}

TEST_F(OrbelLogGenerator2Test, AfterAPacketTheGenerationReturnsTheSameDisplayEachTime)
{
    feed(PacketBuilder(0x1000).build());
    const auto display = generator->generateLogUsingState(state);
    const auto next = generator->generateLogUsingState(state);
    ASSERT_TRUE(display && next);
    EXPECT_TRUE(display->dictionary()->isSameContainer(*next->dictionary()));
}

TEST_F(OrbelLogGenerator2Test, DisplayStateHoldsThePacketsOfThePeriodAsReceived)
{
    const Bytes prefixed = PacketBuilder(0x1000).withPrefix().build();
    const Bytes shortOne{1, 2, 3};
    feed(prefixed);
    feed(shortOne);
    generator->generateLogUsingState(state);
    Bytes expected = prefixed;
    expected.insert(expected.end(), {1, 2, 3});
    EXPECT_EQ(*state.find("DisplayState")->data(), expected);
    generator->generateLogUsingState(state);
    EXPECT_TRUE(state.find("DisplayState")->data()->empty());
}

TEST_F(OrbelLogGenerator2Test, BuildingLogsIndexStatusAndBindings)
{
    generator->getDisplayFromState(state);
    const auto texts = platform.log.texts(4);
    ASSERT_EQ(texts.size(), 5U);
    EXPECT_THAT(texts[0], testing::MatchesRegex("Initialized class index: 0x.*, Self: 0x.*"));
    EXPECT_THAT(std::vector(texts.begin() + 1, texts.end()),
                ElementsAre("Dictionary = 1", "String = 0", "First", "Second"));
}

TEST_F(OrbelLogGenerator2Test, ASectionNamedTwiceIsBoundToTheCopyMadeLast)
{
    setTemplate("<dict><key>A</key><dict><key>First</key><dict/></dict>"
                "<key>B</key><dict><key>First</key><dict/></dict></dict>");
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(displayed({"A", "First", "Size"}), "(none)");
    EXPECT_EQ(displayed({"B", "First", "Size"}), "13");
}

TEST_F(OrbelLogGenerator2Test, ADictionaryIsBoundAfterWhatItHolds)
{
    setTemplate("<dict><key>First</key><dict><key>Second</key><dict/></dict></dict>");
    generator->getDisplayFromState(state);
    const auto texts = platform.log.texts(4);
    EXPECT_THAT(std::vector(texts.end() - 2, texts.end()), ElementsAre("Second", "First"));
}

TEST_F(OrbelLogGenerator2Test, TheDisplayIsACopyOfTheTemplate)
{
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(textAt(*state.find("Template"), {"Group", "First", "Size"}), "-");
    EXPECT_EQ(displayed({"Group", "_sorted"}), "1");
    EXPECT_THAT(keysOf(*state.find("Display")->dictionary()), ElementsAre("Group", "Second"));
}

TEST_F(OrbelLogGenerator2Test, ArraysOfATemplateAreCopiedWithTheirElements)
{
    setTemplate("<dict><key>L</key><array><string>a</string><dict/></array></dict>");
    generator->getDisplayFromState(state);
    const PlistArray* list = state.find("Display")->dictionary()->find("L")->array();
    ASSERT_TRUE(list);
    EXPECT_EQ(*list, (PlistArray{"a", PlistDictionary()}));
}

TEST_F(OrbelLogGenerator2Test, AMissingTemplateIsReportedAndTriedAgain)
{
    platform.resources.remove("/res/Notes.plist");
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(platform.log.count("Cannot load template for display"), 1U);
    EXPECT_THAT(notes, ElementsAre("First 1000 13"));
    EXPECT_FALSE(generator->generateLogUsingState(state));
    EXPECT_EQ(platform.log.count("Cannot load template for display"), 2U);

    setTemplate("<dict><key>First</key><dict/></dict>");
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(displayed({"First", "Size"}), "13");
    EXPECT_EQ(generator->displayFault(), "");
}

TEST_F(OrbelLogGenerator2Test, ATemplateThatCannotBeUsedIsNamedWithTheReason)
{
    EXPECT_EQ(generator->displayFault(), "");
    platform.resources.remove("/res/Notes.plist");
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(generator->displayFault(), "display template Notes.plist is missing");
    setTemplate("<array/>");
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(generator->displayFault(),
              "display template /res/Notes.plist: it is no dictionary but of type array");
}

TEST_F(OrbelLogGenerator2Test, ABrokenTemplateIsReadOnceAndReportedEachTime)
{
    platform.resources.add("/res/Notes.plist", "no property list");
    feed(PacketBuilder(0x1000).build());
    EXPECT_THAT(generator->displayFault(),
                testing::StartsWith("display template /res/Notes.plist: "));
    setTemplate("<dict/>");
    feed(PacketBuilder(0x1000).build());
    EXPECT_FALSE(state.contains("Display"));
    EXPECT_EQ(platform.log.count("Cannot load template for display"), 2U);
    NotingGenerator(services(), notes).updateState(state, PacketBuilder(0x1000).build());
    EXPECT_TRUE(state.contains("Display"));
}

TEST_F(OrbelLogGenerator2Test, ATemplateThatHoldsANumberIsProcessedOnce)
{
    setTemplate("<dict><key>N</key><integer>1</integer></dict>");
    feed(PacketBuilder(0x1000).build());
    feed(PacketBuilder(0x1000).build());
    EXPECT_EQ(platform.log.count("Received an object of unknown type"), 1U);
    EXPECT_EQ(generator->displayFault(), "display template /res/Notes.plist: it holds a value that "
                                         "is neither text nor array nor dictionary");
}

TEST_F(OrbelLogGenerator2Test, WithoutADisplayNothingIsAddedToTheHistory)
{
    platform.resources.remove("/res/Notes.plist");
    feed(PacketBuilder(0x1000).build());
    generator->generateLogUsingState(state);
    EXPECT_FALSE(state.contains("History"));
}

TEST_F(OrbelLogGenerator2Test, ATemplateThatIsNoDictionaryCannotBeLoaded)
{
    setTemplate("<array/>");
    generator->getDisplayFromState(state);
    EXPECT_TRUE(platform.log.contains("Cannot load template for display"));
}

TEST_F(OrbelLogGenerator2Test, ATemplateThatHoldsANumberStopsTheBuild)
{
    setTemplate("<dict><key>N</key><integer>1</integer></dict>");
    generator->getDisplayFromState(state);
    EXPECT_EQ(platform.log.lines()[platform.log.lines().size() - 2],
              (CapturingSystemLog::Line{3, "Received an object of unknown type"}));
    EXPECT_EQ(platform.log.lines().back(),
              (CapturingSystemLog::Line{4, "Processing the template"}));
    EXPECT_FALSE(state.contains("Display"));
}

TEST_F(OrbelLogGenerator2Test, PrintDictReportsOnlyUnknownKinds)
{
    generator->printDict(PlistDictionary{{"a", "x"}, {"b", PlistArray{"y", 1, true}}});
    EXPECT_THAT(platform.log.texts(3), ElementsAre("Received an object of unknown type",
                                                   "Received an object of unknown type"));
}

TEST_F(OrbelLogGenerator2Test, TheStartCommandSplitsOrdinaryAndExtraCodes)
{
    const PlistDictionary command = generator->getStartCommand();
    EXPECT_THAT(keysOf(command), ElementsAre("SetState", "SetOrbelLogCodes", "SetQxExtraCodes"));
    EXPECT_EQ(textAt(command, {"SetState"}), "Streaming");
    EXPECT_EQ(*command.find("SetOrbelLogCodes"), PlistValue(PlistArray{0x1000, 0x2000}));
    EXPECT_EQ(*command.find("SetQxExtraCodes"), PlistValue(PlistArray{0}));
}

TEST_F(OrbelLogGenerator2Test, ANewStateGetsADisplayOfItsOwn)
{
    feed(PacketBuilder(0x1000).size(20).build());
    PlistDictionary otherState;
    generator->updateState(otherState, PacketBuilder(0x1000).size(30).build());
    EXPECT_EQ(displayed({"Group", "First", "Size"}), "20");
    EXPECT_EQ(textAt(*otherState.find("Display"), {"Group", "First", "Size"}), "30");
}

TEST_F(OrbelLogGenerator2Test, AGeneratorAfterARestartGoesOnInTheSameDisplay)
{
    feed(PacketBuilder(0x1000).size(20).build());
    const auto before = *state.find("Display");
    generator = std::make_unique<NotingGenerator>(services(), notes);
    feed(PacketBuilder(0x1000).size(30).build());
    EXPECT_TRUE(before.dictionary()->isSameContainer(*state.find("Display")->dictionary()));
    EXPECT_EQ(displayed({"Group", "First", "Size"}), "30");
}

TEST_F(OrbelLogGenerator2Test, ARowThatBearsASectionsNameDoesNotGetThatSectionAfterARestart)
{
    platform.resources.add("/res/LTE.plist",
                           plistXml("<dict><key>SIM Info</key><dict><key>EF-ICCID</key>"
                                    "<string>-</string></dict>"
                                    "<key>PDP Context Info</key><array/></dict>"));
    const PlistArray rows{PlistDictionary{{"SIM Info", PlistDictionary{{"a", "b"}}}}};
    LTELogGenerator::generator(services())
        ->updateState(state, propertyListPacket(0xFF0002, rows.copy()));
    const auto next = LTELogGenerator::generator(services());
    next->updateState(state,
                      propertyListPacket(0xFF0000, PlistDictionary{{"kSimFile_ICCID", "8"}}));
    EXPECT_EQ(displayed({"SIM Info", "EF-ICCID"}), "8");
    EXPECT_EQ(*state.find("Display")->dictionary()->find("PDP Context Info"), PlistValue(rows));
}

TEST_F(OrbelLogGenerator2Test, AnArrayOfTheTemplateIsBoundElementByElementAfterARestart)
{
    setTemplate("<dict><key>L</key><array><dict><key>First</key><dict/></dict></array></dict>");
    feed(PacketBuilder(0x1000).size(20).build());
    generator = std::make_unique<NotingGenerator>(services(), notes);
    feed(PacketBuilder(0x1000).size(30).build());
    const PlistArray& list = *state.find("Display")->dictionary()->find("L")->array();
    EXPECT_EQ(textAt(list[0], {"First", "Size"}), "30");
}

TEST_F(OrbelLogGenerator2Test, KeepsNoPacketsWhereNobodyWantsThem)
{
    GeneratorServices without = services();
    without.rawPackets = RawPackets::Dropped;
    NotingGenerator dropping(without, notes);
    dropping.updateState(state, PacketBuilder(0x1000).build());
    dropping.generateLogUsingState(state);
    EXPECT_EQ(state.find("DisplayState"), nullptr);
    EXPECT_THAT(notes, ElementsAre("First 1000 13"));
}

TEST_F(OrbelLogGenerator2Test, AFloodKeepsTheNewestPacketsOfThePeriodAndSaysSoOnce)
{
    for (int i = 0; i < 70; ++i)
        feed(PacketBuilder(0x1000).size(std::size_t{1} << 20).build());
    generator->generateLogUsingState(state);
    EXPECT_EQ(state.find("DisplayState")->data()->size(), std::size_t{64} << 20);
    EXPECT_EQ(platform.log.count("The period's raw packets are above 64 MiB: the oldest 6 are "
                                 "dropped"),
              1U);
    EXPECT_EQ(displayed({"Group", "First", "Size"}), "1048576");
    platform.log.clear();
    generator->generateLogUsingState(state);
    EXPECT_TRUE(platform.log.texts(3).empty());
}

TEST_F(OrbelLogGenerator2Test, ADisplayOfAnotherTechnologyMakesWayAndTheHistoryStays)
{
    feed(PacketBuilder(0x1000).size(20).build());
    generator->generateLogUsingState(state);
    platform.resources.add("/res/LTE.plist", plistXml("<dict><key>LTE</key><dict/></dict>"));
    LTELogGenerator::generator(services())->updateState(state, Bytes(13, 1));
    EXPECT_THAT(keysOf(*state.find("Display")->dictionary()), ElementsAre("LTE"));
    EXPECT_EQ(state.find("History")->array()->size(), 1U);
}

TEST_F(OrbelLogGenerator2Test, ADisplayOfUnknownOriginIsReturnedAsItIs)
{
    state.set("Display", PlistDictionary{{"a", "b"}});
    EXPECT_EQ(textAt(*generator->getDisplayFromState(state), {"a"}), "b");
}

TEST_F(OrbelLogGenerator2Test, UnparsableSimDataIsContainedAndLaterPacketsGoOn)
{
    platform.resources.add("/res/LTE.plist",
                           plistXml("<dict><key>SIM Info</key><dict><key>EF-ICCID</key>"
                                    "<string>-</string></dict>"
                                    "<key>PDP Context Info</key><array/></dict>"));
    const auto lte = LTELogGenerator::generator(services());
    lte->updateState(state, PacketBuilder(0xFF0000).u8(13, 'x').build());
    lte->updateState(state, PacketBuilder(0xFF0002).u8(13, 'x').build());
    EXPECT_TRUE(platform.log.contains("SIM File dictionary data could not be constructed"));
    EXPECT_TRUE(platform.log.contains("PDP context data could not be constructed"));
    EXPECT_EQ(displayed({"SIM Info", "EF-ICCID"}), "-");

    lte->updateState(state, propertyListPacket(0xFF0000, PlistDictionary{{"kSimFile_ICCID", "8"}}));
    EXPECT_EQ(displayed({"SIM Info", "EF-ICCID"}), "8");
}

TEST_F(OrbelLogGenerator2Test, LTEInitialisationLogsInOrder)
{
    const auto lte = LTELogGenerator::generator(services());
    using testing::MatchesRegex;
    const auto texts = platform.log.texts();
    ASSERT_EQ(texts.size(), 15U);
    EXPECT_EQ(texts[0], "Creating LTELogGenerator object");
    EXPECT_EQ(texts[1], "Array Count: 3"); // and ten more, one for each section
    EXPECT_EQ(texts[11], "Array Count: 1");
    EXPECT_THAT(std::vector(texts.begin() + 12, texts.end()),
                ElementsAre(MatchesRegex("Creating OrbelLogGenerator2 object with 0x.*"),
                            MatchesRegex("Creating Log object: 0x.*"), "Class Index: 1"));
    EXPECT_THAT(platform.log.texts(3),
                ElementsAre("Creating LTELogGenerator object",
                            MatchesRegex("Creating OrbelLogGenerator2 object with 0x.*"),
                            "Class Index: 1"));
}

TEST_F(OrbelLogGenerator2Test, LTEDestructionLogsItsOwnLineAndTheFamilys)
{
    LTELogGenerator::generator(services()).reset();
    const auto texts = platform.log.texts(4);
    ASSERT_GE(texts.size(), 2U);
    EXPECT_THAT(std::vector(texts.end() - 2, texts.end()),
                ElementsAre(testing::StartsWith("LTELogGenerator is destructed 0x"),
                            testing::StartsWith("Orbel_GSMLogGenerator is destructed 0x")));
}

TEST_F(OrbelLogGenerator2Test, GSMDestructionLogsTheSameLineTwice)
{
    Orbel_GSMLogGenerator::generator(services()).reset();
    EXPECT_TRUE(platform.log.contains("Creating Orbel_GSMLogGenerator object"));
    const auto texts = platform.log.texts(4);
    ASSERT_GE(texts.size(), 2U);
    EXPECT_THAT(texts.back(), testing::StartsWith("Orbel_GSMLogGenerator is destructed 0x"));
    EXPECT_EQ(texts.back(), texts[texts.size() - 2]);
}

TEST_F(OrbelLogGenerator2Test, LTEAsksForTheCodesOfItsSections)
{
    const PlistDictionary command = LTELogGenerator::generator(services())->getStartCommand();
    EXPECT_EQ(*command.find("SetOrbelLogCodes"),
              PlistValue(PlistArray{0xB0C2, 0xB0C1, 0xB179, 0xB17F, 0xB180, 0xB186}));
    EXPECT_EQ(*command.find("SetQxExtraCodes"), PlistValue(PlistArray{1, 0, 2}));
}

} // namespace ventrik
