#include "LogGenerator/Core/StateKeys.h"
#include "Model/EventLog.h"
#include "Tests/Support/IdleGenerator.h"

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

std::string lineOf(const Event& event)
{
    return fmt::format("{}: {}", nameOf(event.kind), event.text);
}

std::vector<std::string> linesOf(const std::vector<Event>& events)
{
    std::vector<std::string> lines;
    for (const Event& event : events)
        lines.push_back(lineOf(event));
    return lines;
}

/// A log of displays made by hand, one a second.
class EventLogTest : public testing::Test
{
  protected:
    void use(std::string_view technology) { store.useGenerator(&generator, technology); }
    void show(const PlistValue& display)
    {
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
        time += 1s;
    }
    /// The events of a display after the former ones.
    std::vector<std::string> eventsOf(const PlistValue& display)
    {
        log.update();
        show(display);
        return linesOf(log.update());
    }

    IdleGenerator generator;
    ChangeStore store{RecordsMode::Base};
    EventLog log{store, {*parseAlert("/**/Measured RSRP < -110").alert}};
    PlistDictionary state;
    Clock::TimePoint time = start;
};

PlistDictionary lteCell(std::string_view identity, std::string_view channel)
{
    return {{"Serving Cell Info",
             PlistDictionary{{"Physical Cell ID", identity}, {"Download Frequency", channel}}}};
}

PlistDictionary sessions(const std::vector<std::string_view>& names)
{
    PlistArray contexts;
    for (const std::string_view name : names)
        contexts.append(PlistDictionary{{"APN", name}, {"Bearer", "5"}});
    return {{"PDP Context Info", contexts}};
}

} // namespace

TEST_F(EventLogTest, IsEmptyAtFirst)
{
    EXPECT_THAT(log.update(), IsEmpty());
    EXPECT_THAT(log.events(), IsEmpty());
}

TEST_F(EventLogTest, BeginsWithTheTechnologyAndNothingElseOfTheFirstDisplay)
{
    use("lte");
    show(lteCell("301", "1300"));
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Technology: LTE"));
}

TEST_F(EventLogTest, TellsAnotherServingCellAsOneEvent)
{
    use("lte");
    show(lteCell("301", "1300"));
    EXPECT_THAT(eventsOf(lteCell("87", "6300")),
                ElementsAre("Cell: PCI 301 → 87, E-ARFCN 1300 → 6300"));
    const Event& event = log.events().back();
    EXPECT_EQ(event.time, start + 1s);
    EXPECT_EQ(event.moment, 4U); // both messages changed two values
    EXPECT_EQ(event.path, "/Serving Cell Info");
    EXPECT_TRUE(event.isMark);
}

TEST_F(EventLogTest, TellsOfTheServingCellOnlyWhatIsAnother)
{
    use("lte");
    show(lteCell("301", "1300"));
    EXPECT_THAT(eventsOf(lteCell("302", "1300")), ElementsAre("Cell: PCI 301 → 302"));
    EXPECT_THAT(eventsOf(lteCell("302", "1300")), IsEmpty());
}

TEST_F(EventLogTest, TellsAnotherServingCellOnceWhereSeveralPlacesDo)
{
    use("lte");
    PlistDictionary display = lteCell("301", "1300");
    const auto measured = [](std::string_view identity) {
        return PlistDictionary{{"Physical Cell ID", identity}, {"E-ARFCN", "1300"}};
    };
    display.set("Serving Cell Measurements", measured("301"));
    show(display);
    display.set("Serving Cell Measurements", measured("302"));
    EXPECT_THAT(eventsOf(display), ElementsAre("Cell: PCI 301 → 302"));
    EXPECT_EQ(log.events().back().path, "/Serving Cell Measurements");
    display.set("Serving Cell Info", *lteCell("302", "1300").find("Serving Cell Info"));
    EXPECT_THAT(eventsOf(display), IsEmpty());
}

TEST_F(EventLogTest, TellsNothingOfValuesThatComeFromNothing)
{
    use("lte");
    show(lteCell("-", "-"));
    EXPECT_THAT(eventsOf(lteCell("301", "1300")), ElementsAre());
    EXPECT_THAT(eventsOf(lteCell("N/A", "1300")), ElementsAre());
    EXPECT_THAT(eventsOf(lteCell("302", "1300")), ElementsAre("Cell: PCI 301 → 302"));
}

TEST_F(EventLogTest, TellsTheStatesOfGSMByTheirPanes)
{
    use("gsm");
    const auto display = [](std::string_view rrc, std::string_view mm, std::string_view sub,
                            std::string_view gmm) {
        return PlistDictionary{
            {"Serving Cell",
             PlistDictionary{{"UMTS RR Info", PlistDictionary{{"RRC State", rrc}}}}},
            {"Registration", PlistDictionary{{"Process CS", PlistDictionary{{"MM State", mm},
                                                                            {"MM Sub State", sub}}},
                                             {"Process PS", PlistDictionary{{"MM State", gmm}}}}}};
    };
    show(display("CELL_FACH", "MM_IDLE", "MM_NORMAL_SERVICE", "GMM_REGISTERED"));
    EXPECT_THAT(
        eventsOf(display("CELL_DCH", "MM_NULL", "MM_NO_IMSI", "GMM_NULL")),
        ElementsAre("RRC: RRC State CELL_FACH → CELL_DCH",
                    "Registration: MM State MM_IDLE → MM_NULL, MM Sub State MM_NORMAL_SERVICE → "
                    "MM_NO_IMSI",
                    "Registration: GMM State GMM_REGISTERED → GMM_NULL"));
    EXPECT_TRUE(log.events()[1].isMark);
    EXPECT_FALSE(log.events()[2].isMark);
    EXPECT_EQ(log.events()[2].path, "/Registration/Process CS");
    EXPECT_EQ(log.events()[3].path, "/Registration/Process PS");
}

TEST_F(EventLogTest, KeepsKindsApartThatOnePaneShows)
{
    use("gsm");
    const auto display = [](std::string_view rr, std::string_view mode) {
        return PlistDictionary{
            {"Serving Cell", PlistDictionary{{"GSM RR Info", PlistDictionary{{"RR State", rr},
                                                                             {"RR Mode", mode}}}}}};
    };
    show(display("RR_IDLE", "Data"));
    EXPECT_THAT(
        eventsOf(display("RR_DATA_TRANSFER", "Voice")),
        ElementsAre("RRC: RR State RR_IDLE → RR_DATA_TRANSFER", "Call: RR Mode Data → Voice"));
}

TEST_F(EventLogTest, RemembersTheServingCellWhereAnotherPlaceDoesNotTellIt)
{
    use("lte");
    PlistDictionary display = lteCell("301", "1300");
    show(display);
    display.set("Serving Cell Measurements", PlistDictionary{{"E-ARFCN", "1300"}});
    EXPECT_THAT(eventsOf(display), IsEmpty());
    display.set("Serving Cell Info", *lteCell("302", "1300").find("Serving Cell Info"));
    EXPECT_THAT(eventsOf(display), ElementsAre("Cell: PCI 301 → 302"));
}

TEST_F(EventLogTest, TellsWhichServingCellOfTwoSystemsIsAnother)
{
    use("gsm");
    const auto display = [](std::string_view arfcn, std::string_view code) {
        return PlistDictionary{
            {"Serving Cell",
             PlistDictionary{{"GSM Serving Cell", PlistDictionary{{"ARFCN", arfcn}}},
                             {"UMTS RR Info", PlistDictionary{{"Scrambling Code", code}}}}}};
    };
    show(display("66", "58"));
    EXPECT_THAT(eventsOf(display("66", "9")), ElementsAre("Cell: PSC 58 → 9"));
    EXPECT_THAT(eventsOf(display("79", "9")), ElementsAre("Cell: ARFCN 66 → 79"));
}

TEST_F(EventLogTest, TellsTheStatesOfUTRAN)
{
    use("utran");
    const auto display = [](std::string_view text, std::string_view code) {
        return PlistDictionary{
            {"RRC Info", PlistDictionary{{"State", text}}},
            {"Serving Cell Info", PlistDictionary{{"Cell Scrambling Code", code}}}};
    };
    show(display("Cell Fach", "31"));
    EXPECT_THAT(eventsOf(display("Cell DCH", "47")),
                ElementsAre("Cell: CPI 31 → 47", "RRC: State Cell Fach → Cell DCH"));
}

TEST_F(EventLogTest, TellsTheReferencePilotOfCDMAAndItsStates)
{
    use("c2k");
    const auto display = [](std::string_view first, std::string_view second,
                            std::string_view deviceState) {
        return PlistDictionary{
            {"1x",
             PlistDictionary{{"State", deviceState},
                             {"Active Set", PlistDictionary{{"12", first}, {"180", second}}}}},
            {"EV-DO", PlistDictionary{{"Radio", PlistDictionary{{"Channel", "475"}}}}}};
    };
    show(display("(ref pilot) -5.00 dB", "-9.00 dB", "Paging [6]"));
    EXPECT_THAT(eventsOf(display("-9.00 dB", "(ref pilot) -5.00 dB", "Traffic [8]")),
                ElementsAre("Cell: 1x PN 12 → 180", "RRC: 1x State Paging [6] → Traffic [8]"));
    EXPECT_EQ(log.events()[1].path, "/1x/Active Set");
}

TEST_F(EventLogTest, TellsCallsOfTheCellMonitorAsTheyBeginAndEnd)
{
    use("ifx");
    const PlistDictionary quiet{{"Registration", "Registered, home"}};
    const PlistDictionary busy{{"Registration", "Registered, busy"},
                               {"Call", PlistDictionary{{"Channel", "TCH/F"}}}};
    show(quiet);
    EXPECT_THAT(eventsOf(busy),
                ElementsAre("Registration: Registration Registered, home → Registered, busy",
                            "Call: Call began"));
    EXPECT_EQ(log.events()[1].path, "/");
    EXPECT_EQ(log.events()[2].path, "/Call");
    EXPECT_THAT(eventsOf(quiet),
                ElementsAre("Registration: Registration Registered, busy → Registered, home",
                            "Call: Call ended"));
}

TEST_F(EventLogTest, TellsNothingOfACallThatWasThereFromTheStart)
{
    use("ifx");
    show(PlistDictionary{{"Call", PlistDictionary{{"Channel", "TCH/F"}}}});
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Technology: Cell monitor"));
    EXPECT_THAT(eventsOf(PlistDictionary{{"Registration", "x"}}), ElementsAre("Call: Call ended"));
}

TEST_F(EventLogTest, TellsTheDataSessionsTogether)
{
    use("lte");
    show(sessions({}));
    EXPECT_THAT(eventsOf(sessions({"ims"})), IsEmpty());
    EXPECT_THAT(eventsOf(sessions({"ims", "internet"})),
                ElementsAre("Data: Contexts ims → ims, internet"));
    EXPECT_EQ(log.events().back().path, "/PDP Context Info");
    EXPECT_THAT(eventsOf(sessions({"internet"})),
                ElementsAre("Data: Contexts ims, internet → internet"));
    EXPECT_THAT(eventsOf(sessions({})), ElementsAre("Data: Contexts internet → none"));
    EXPECT_THAT(eventsOf(sessions({"ims"})), ElementsAre("Data: Contexts none → ims"));
    EXPECT_THAT(eventsOf(PlistDictionary{{"a", "b"}}), ElementsAre("Data: Contexts ims → none"));
    EXPECT_THAT(eventsOf(sessions({"ims"})), ElementsAre("Data: Contexts none → ims"));
}

TEST_F(EventLogTest, TellsAnotherCard)
{
    use("utran");
    const auto display = [](std::string_view number) {
        return PlistDictionary{{"SIM Info", PlistDictionary{{"EF-ICCID", number}}}};
    };
    show(display("8949"));
    EXPECT_THAT(eventsOf(display("8931")), ElementsAre("SIM: ICCID 8949 → 8931"));
}

TEST_F(EventLogTest, TellsAnotherTechnologyAndNothingOfItsFirstDisplay)
{
    use("lte");
    show(sessions({"ims"}));
    log.update();
    use("utran");
    EXPECT_THAT(eventsOf(sessions({"internet"})), ElementsAre("Technology: LTE → UTRAN"));
    EXPECT_EQ(log.events().back().moment, store.present());
    EXPECT_TRUE(log.events().back().isMark);
}

TEST_F(EventLogTest, TellsWhenTheChannelIsLostAndBackAmongTheOthers)
{
    store.channelChanged(start, true, "");
    use("lte");
    show(lteCell("301", "1300"));
    store.channelChanged(time, false, "the service has gone");
    store.channelChanged(time + 5s, true, "");
    time += 6s;
    show(lteCell("302", "1300"));
    store.channelChanged(time, false, "");
    EXPECT_THAT(linesOf(log.update()),
                ElementsAre("Channel: Opened", "Technology: LTE",
                            "Channel: Lost: the service has gone", "Channel: Opened",
                            "Cell: PCI 301 → 302", "Channel: Lost"));
    EXPECT_EQ(log.events()[2].time, start + 1s);
    EXPECT_EQ(log.events()[2].moment, 2U);
    EXPECT_EQ(log.events()[2].path, "/Channel");
    EXPECT_THAT(log.update(), IsEmpty());
}

TEST_F(EventLogTest, FiresAnAlert)
{
    use("lte");
    const auto display = [](std::string_view level) {
        return PlistDictionary{
            {"Serving Cell Measurements", PlistDictionary{{"Measured RSRP", level}}}};
    };
    show(display("-109.00 dBm"));
    EXPECT_THAT(eventsOf(display("-111.50 dBm")),
                ElementsAre("Alert: Measured RSRP is -111.50 dBm (< -110)"));
    EXPECT_EQ(log.events().back().path, "/Serving Cell Measurements");
    EXPECT_FALSE(log.events().back().isMark);
    EXPECT_THAT(eventsOf(display("-112.50 dBm")), IsEmpty());
}

TEST_F(EventLogTest, ReturnsOnlyWhatIsNewAndKeepsAll)
{
    use("lte");
    show(lteCell("301", "1300"));
    log.update();
    show(lteCell("302", "1300"));
    show(lteCell("303", "1300"));
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Cell: PCI 301 → 302", "Cell: PCI 302 → 303"));
    EXPECT_THAT(log.update(), IsEmpty());
    EXPECT_EQ(log.events().size(), 3U);
}

TEST_F(EventLogTest, TellsEachOfSeveralMessagesOfOneTime)
{
    use("lte");
    show(lteCell("301", "1300"));
    log.update();
    for (const char* identity : {"302", "303"}) {
        time = start + 1s;
        show(lteCell(identity, "1300"));
    }
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Cell: PCI 301 → 302", "Cell: PCI 302 → 303"));
}

TEST_F(EventLogTest, KeepsTheNewestWhenThereAreTooMany)
{
    use("lte");
    PlistDictionary display = lteCell("0", "1300");
    PlistDictionary cell = *display.find("Serving Cell Info")->dictionary();
    for (std::size_t i = 0; i < EventLog::mostEvents + 5; ++i) {
        cell.set("Physical Cell ID", fmt::format("{}", i % 2));
        show(display);
    }
    log.update();
    EXPECT_EQ(log.events().size(), EventLog::mostEvents);
    EXPECT_EQ(log.events().back().moment, store.present());
}

TEST_F(EventLogTest, CutsTextsThatAreLongerThanALine)
{
    use("lte");
    show(lteCell("301", "1300"));
    std::string text(100, 'x');
    for (int i = 0; i < 1000; ++i)
        text += "ä";
    const std::string line = eventsOf(lteCell(text, "1300")).front();
    EXPECT_LT(line.size(), 200U);
    EXPECT_TRUE(line.ends_with("ä…"));
}

TEST_F(EventLogTest, CutsTheNameInAnAlertThatIsLongerThanALine)
{
    EventLog alerts(store, {*parseAlert("/** < 5").alert});
    use("lte");
    const std::string name(1000, 'x');
    show(PlistDictionary{{name, "6"}});
    show(PlistDictionary{{name, "4"}});
    const auto events = alerts.update();
    ASSERT_FALSE(events.empty());
    EXPECT_THAT(events.back().text, testing::EndsWith("x… is 4 (< 5)"));
    EXPECT_LT(events.back().text.size(), 200U);
}

namespace
{

/// Stores that forget soon.
class SmallStoreEventLogTest : public testing::Test
{
  protected:
    void show(const PlistValue& display)
    {
        state.set(StateKey::display, display);
        store.messageTaken(time, Bytes(13), state);
        time += 1s;
    }
    /// Until what came before has gone, and a little more.
    void showForLong(PlistDictionary display)
    {
        const auto first = store.present();
        for (int i = 0; i < 20000; ++i) {
            display.set("Count", fmt::format("{}", i));
            show(display);
        }
        ASSERT_GT(store.firstMoment(), first + 5);
    }

    IdleGenerator generator;
    ChangeStore store{RecordsMode::Base, {.bytes = 65536}};
    PlistDictionary state;
    Clock::TimePoint time = start;
};

} // namespace

TEST_F(SmallStoreEventLogTest, TakesWhatStandsWhereTheChangesBeforeAreGone)
{
    EventLog log(store);
    store.useGenerator(&generator, "lte");
    PlistDictionary display = lteCell("301", "1300");
    show(display);
    log.update();
    display.set("Serving Cell Info", *lteCell("302", "1300").find("Serving Cell Info"));
    for (int i = 0; i < 20000; ++i) {
        display.set("Count", fmt::format("{}", i));
        show(display);
    }
    ASSERT_GT(store.firstMoment(), 5U);
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
    display.set("Serving Cell Info", *lteCell("303", "1300").find("Serving Cell Info"));
    show(display);
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Cell: PCI 302 → 303"));
}

TEST_F(SmallStoreEventLogTest, FiresAnAlertOfANumberThatStandsSinceBeforeTheFirstMoment)
{
    EventLog log(store, {*parseAlert("/Level < -110").alert});
    store.useGenerator(&generator, "lte");
    showForLong(PlistDictionary{{"Level", "-109"}});
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Technology: LTE"));
    show(PlistDictionary{{"Level", "-111"}});
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Alert: Level is -111 (< -110)"));
}

TEST_F(SmallStoreEventLogTest, FiresNoAlertForWhatCrossedUnseen)
{
    EventLog log(store, {*parseAlert("/Level < -110").alert});
    store.useGenerator(&generator, "lte");
    show(PlistDictionary{{"Level", "-109"}});
    log.update();
    showForLong(PlistDictionary{{"Level", "-111"}});
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
    show(PlistDictionary{{"Level", "-112"}});
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
}

TEST_F(SmallStoreEventLogTest, KnowsWhatWentUnseen)
{
    EventLog log(store);
    store.useGenerator(&generator, "lte");
    show(sessions({"ims", "internet"}));
    log.update();
    showForLong(sessions({"mms"}));
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
    show(sessions({"xcap"}));
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Data: Contexts mms → xcap"));
}

TEST_F(SmallStoreEventLogTest, TellsACallThatBeganAfterOneThatEndedUnseen)
{
    EventLog log(store);
    const PlistDictionary busy{{"Call", PlistDictionary{{"Channel", "TCH/F"}}}};
    store.useGenerator(&generator, "ifx");
    show(busy);
    log.update();
    showForLong({});
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
    show(busy);
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Call: Call began"));
}

TEST_F(SmallStoreEventLogTest, TellsTheTechnologyThatCameUnseen)
{
    EventLog log(store);
    store.useGenerator(&generator, "lte");
    PlistDictionary display = lteCell("301", "1300");
    for (int i = 0; i < 20000; ++i) {
        display.set("Count", fmt::format("{}", i));
        show(display);
    }
    ASSERT_GT(store.firstMoment(), 5U);
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Technology: LTE"));
}

TEST_F(SmallStoreEventLogTest, FollowsAStoreThatBeganAnew)
{
    EventLog log(store, {*parseAlert("/**/Physical Cell ID > 400").alert});
    store.useGenerator(&generator, "lte");
    PlistDictionary display{{"First", "1"}};
    display.set("Serving Cell Info", *lteCell("301", "1300").find("Serving Cell Info"));
    show(display);
    log.update();
    display.remove("First"); // places after it get other numbers
    for (int i = 0; store.generation() == 0 && i < 20000; ++i) {
        display.set(fmt::format("Name {}", i), "1");
        show(display);
        display.remove(fmt::format("Name {}", i));
    }
    ASSERT_EQ(store.generation(), 1U);
    show(display);
    EXPECT_THAT(linesOf(log.update()), IsEmpty());
    display.set("Serving Cell Info", *lteCell("402", "1300").find("Serving Cell Info"));
    show(display);
    EXPECT_THAT(linesOf(log.update()),
                ElementsAre("Cell: PCI 301 → 402", "Alert: Physical Cell ID is 402 (> 400)"));
}

TEST_F(SmallStoreEventLogTest, LooksForTheValuesOfAnotherTechnology)
{
    EventLog log(store);
    const PlistDictionary info{{"Physical Cell ID", "301"}, {"Cell Scrambling Code", "31"}};
    store.useGenerator(&generator, "lte");
    show(PlistDictionary{{"Serving Cell Info", info}});
    log.update();
    store.useGenerator(&generator, "utran");
    show(PlistDictionary{{"Serving Cell Info", info}, {"a", "b"}});
    log.update();
    const PlistDictionary other{{"Physical Cell ID", "302"}, {"Cell Scrambling Code", "47"}};
    show(PlistDictionary{{"Serving Cell Info", other}, {"a", "b"}});
    show(PlistDictionary{{"Serving Cell Info", info}, {"a", "b"}});
    EXPECT_THAT(linesOf(log.update()), ElementsAre("Cell: CPI 47 → 31"));
}

} // namespace ventrik
