#include "Model/ChannelNote.h"
#include "Tests/App/AppFixture.h"

#include <QLocale>
#include <QPushButton>
#include <QTest>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

/// The application while nothing comes: no service, a silent one, no display.
class QuietStateTest : public AppFixture
{
  protected:
    std::string emptyText() { return topPane().table().placeholder().toStdString(); }
    void launchAndShowData()
    {
        launchAndConnect();
        refreshWithData();
    }
    // The service goes and the next tick finds out; nothing has come before that.
    void loseServiceSilently()
    {
        loseService();
        fake.mainQueue.advance(2s);
    }
    // Both clocks move.
    void wait(std::chrono::seconds time)
    {
        fake.clock.advance(time);
        fake.mainQueue.advance(time);
    }
    void save()
    {
        app.showSaveView();
        QTest::mouseClick(&app.saveViewController()->saveButton(), Qt::LeftButton);
        fake.mainQueue.run();
    }
};

/// The note as the model's state has it, a minute after the first update.
std::string noteOf(const ChannelState& state)
{
    FixedClock clock;
    const auto lastUpdate = clock.now();
    clock.advance(1min);
    return channelNote(state, clock, lastUpdate);
}

constexpr const char* brokenTemplate = "LTE.plist: no property list in line 3";

} // namespace

TEST(StatusNote, EachFaultIsTold)
{
    EXPECT_EQ(noteOf({.fault = ChannelFault::PortTaken}),
              "last update 06:10:28 · another viewer holds the port");
    EXPECT_EQ(noteOf({.fault = ChannelFault::NoAnswer}),
              "last update 06:10:28 · the service does not answer");
}

TEST(StatusNote, ADisplayThatCannotBeMadeIsToldBeforeTheSilence)
{
    const auto connected = FixedClock().now();
    EXPECT_EQ(noteOf({.connectedSince = connected}), "no data for 60 s");
    EXPECT_EQ(noteOf({.connectedSince = connected, .displayFault = brokenTemplate}),
              brokenTemplate);
}

TEST(StatusNote, AMessageOfAnEarlierConnectionDoesNotCount)
{
    const auto start = FixedClock().now();
    EXPECT_EQ(noteOf({.connectedSince = start + 30s, .lastMessageTime = start}),
              "no data for 30 s");
    EXPECT_EQ(noteOf({.connectedSince = start, .lastMessageTime = start + 45s}),
              "no data for 15 s");
}

TEST(StatusNote, AClockThatIsSetBackTellsNoSilence)
{
    EXPECT_EQ(noteOf({.connectedSince = FixedClock().now() + 1h}), "");
}

TEST(StatusNote, AnEmptyPaneTellsTheDisplaysFaultFirst)
{
    EXPECT_EQ(reasonForNoData({}), "No data yet");
    EXPECT_EQ(reasonForNoData({.fault = ChannelFault::NoService}), "No service");
    EXPECT_EQ(reasonForNoData({.fault = ChannelFault::NoService, .displayFault = brokenTemplate}),
              brokenTemplate);
}

TEST_F(QuietStateTest, AServiceThatGoesWithoutNewsIsSeenAtTheNextTick)
{
    launchAndShowData();
    loseServiceSilently();
    EXPECT_EQ(statusText(topPane()), "Connecting...");
    EXPECT_TRUE(isSpinning(topPane()));
}

TEST_F(QuietStateTest, TheLastUpdateAndTheReasonStayReadable)
{
    launchAndShowData();
    fake.clock.advance(1h);
    loseServiceSilently();
    EXPECT_EQ(note(topPane()), "last update 06:10:28 · no service");
}

TEST_F(QuietStateTest, TheLastUpdateIsTheLocalTimeInEveryLanguage)
{
    fake.clock.setTimeZone({2 * 3600, false});
    launchAndShowData();
    QLocale::setDefault(QLocale(QLocale::Arabic, QLocale::Egypt));
    loseServiceSilently();
    QLocale::setDefault(QLocale::c());
    EXPECT_EQ(note(topPane()), "last update 08:10:28 · no service");
}

TEST_F(QuietStateTest, WhenTheServiceIsBackTheNoteGoesAndTheStatusIsTheLastUpdate)
{
    launchAndShowData();
    loseServiceSilently();
    ASSERT_EQ(statusText(topPane()), "Connecting...");
    changeTechnology(kQXLogChannelTechnology_Orbel_LTE);
    fake.mainQueue.advance(10s);
    EXPECT_EQ(note(topPane()), "");
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:28");
    EXPECT_FALSE(isSpinning(topPane()));
}

TEST_F(QuietStateTest, BeforeTheFirstUpdateTheReasonStandsAloneAndTheStatusStays)
{
    loseService();
    launchAndConnect();
    EXPECT_EQ(statusText(topPane()), "Connecting");
    EXPECT_EQ(note(topPane()), "no service");
    EXPECT_EQ(emptyText(), "No service");
}

TEST_F(QuietStateTest, AServiceThatIsThereAtLastLeavesTheFirstStatusUntilThereIsData)
{
    loseService();
    launchAndConnect();
    changeTechnology(kQXLogChannelTechnology_Orbel_LTE);
    fake.mainQueue.advance(10s);
    EXPECT_EQ(statusText(topPane()), "Connecting");
    EXPECT_TRUE(isSpinning(topPane()));
    EXPECT_EQ(note(topPane()), "");
    EXPECT_EQ(emptyText(), "No data yet");
}

TEST_F(QuietStateTest, ASilentServiceIsToldAfterTenSecondsAndTheSecondsAreCounted)
{
    launchAndShowData();
    wait(9s);
    EXPECT_EQ(note(topPane()), "");
    wait(1s);
    EXPECT_EQ(note(topPane()), "no data for 10 s");
    wait(24s);
    EXPECT_EQ(note(topPane()), "no data for 34 s");
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:28");
    EXPECT_FALSE(isSpinning(topPane()));
}

TEST_F(QuietStateTest, SilenceIsCountedFromTheConnectionWhereNothingHasEverCome)
{
    launchAndConnect();
    wait(12s);
    EXPECT_EQ(note(topPane()), "no data for 12 s");
}

TEST_F(QuietStateTest, NewDataEndsTheSilence)
{
    launchAndShowData();
    wait(20s);
    refreshWithData();
    EXPECT_EQ(note(topPane()), "");
}

TEST_F(QuietStateTest, CountingLeavesTheToolbarInPlace)
{
    launchAndShowData();
    wait(20s);
    const StatusLabel* label = &statusLabel(topPane());
    wait(1s);
    EXPECT_EQ(&statusLabel(topPane()), label);
    EXPECT_EQ(note(topPane()), "no data for 21 s");
}

TEST_F(QuietStateTest, APaneThatIsOpenedTellsTheSame)
{
    launchAndShowData();
    loseServiceSilently();
    openRow(0);
    EXPECT_EQ(note(topPane()), "last update 06:10:28 · no service");
}

TEST_F(QuietStateTest, AMissingTemplateIsToldInTheStatusLineAndInTheMiddle)
{
    fake.resources.remove("/res/LTE.plist");
    launchAndShowData();
    EXPECT_EQ(note(topPane()), "display template LTE.plist is missing");
    EXPECT_EQ(emptyText(), "Display template LTE.plist is missing");
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:28");
}

TEST_F(QuietStateTest, ABrokenTemplateIsToldWithItsFileAndReason)
{
    fake.resources.add("/res/LTE.plist", "<plist><dict>");
    launchAndShowData();
    const std::string start = "display template /res/LTE.plist: ";
    EXPECT_EQ(note(topPane()).substr(0, start.size()), start);
    EXPECT_GT(note(topPane()).size(), start.size());
}

TEST_F(QuietStateTest, TheWindowsTitleNamesTheTechnologyAndThePane)
{
    loseService();
    launchAndConnect();
    EXPECT_EQ(windowTitle(), "Ventrik");
    changeTechnology(kQXLogChannelTechnology_Orbel_LTE);
    fake.mainQueue.advance(5s);
    EXPECT_EQ(windowTitle(), "Ventrik – LTE");
    refreshWithData();
    openRow(0);
    EXPECT_EQ(windowTitle(), "Ventrik – LTE – Cell");
    openRow(0);
    EXPECT_EQ(windowTitle(), "Ventrik – LTE – Details");
    app.navController()->pop(true);
    app.navController()->pop(true);
    EXPECT_EQ(windowTitle(), "Ventrik – LTE");
}

TEST_F(QuietStateTest, TheWindowsTitleFollowsAPaneThatIsPoppedByARefresh)
{
    launchAndShowData();
    openRow(0);
    openRow(0);
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    refreshWithData();
    EXPECT_EQ(windowTitle(), "Ventrik – UTRAN – Cell");
}

TEST_F(QuietStateTest, AfterASaveTheStatusLineTellsForSomeSecondsWhereTheFileIs)
{
    launchAndShowData();
    save();
    const std::string file = temporary.filePath("VentrikSnapshot-1794809428.ventrik").toStdString();
    EXPECT_EQ(note(topPane()), "Saved to " + file);
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:28");
    refreshWithData();
    EXPECT_EQ(note(topPane()), "Saved to " + file);
    fake.mainQueue.advance(8s);
    EXPECT_EQ(note(topPane()), "");
}

TEST_F(QuietStateTest, ASecondSaveIsToldForItsWholeTime)
{
    launchAndShowData();
    save();
    fake.mainQueue.advance(6s);
    fake.clock.advance(6s);
    save();
    const std::string file = temporary.filePath("VentrikSnapshot-1794809434.ventrik").toStdString();
    fake.mainQueue.advance(6s);
    EXPECT_EQ(note(topPane()), "Saved to " + file);
}

TEST_F(QuietStateTest, NothingIsToldAfterTermination)
{
    launchAndShowData();
    save();
    app.applicationWillTerminate();
    EXPECT_EQ(app.statusNote().text, "");
    wait(1min);
}

} // namespace ventrik
