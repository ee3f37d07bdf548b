#include "App/Lists/CellsModel.h"
#include "App/Lists/CellsView.h"
#include "App/Lists/EventsView.h"
#include "App/Strip/SignalStrip.h"
#include "App/VentrikCell.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"
#include "Tests/Support/IdleGenerator.h"

#include <QApplication>
#include <QDir>
#include <QFile>
#include <QLabel>
#include <QListView>
#include <QMenu>
#include <QPushButton>
#include <QTabBar>
#include <QTableView>
#include <QTest>

#include <array>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

/// The window with a drive of a few messages: each sends the serving cell's identity, one every two
/// seconds.
class PauseTest : public AppFixture
{
  protected:
    PauseTest()
    {
        fake.resources.add("/res/LTE.plist", "<plist><dict><key>Serving Cell Info</key><dict>"
                                             "<key>Physical Cell ID</key><string>-</string>"
                                             "</dict></dict></plist>");
    }

    static Bytes cellInfo(std::uint16_t physicalCellId)
    {
        return PacketBuilder(0xB0C2).u16(14, physicalCellId).size(38).build();
    }
    void drive(std::uint16_t physicalCellId)
    {
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0, cellInfo(physicalCellId)));
        fake.mainQueue.run();
        fake.clock.advance(2s);
        fake.mainQueue.advance(2s);
    }
    void press(Qt::Key key)
    {
        EXPECT_TRUE(QTest::qWaitForWindowActive(app.window()));
        QTest::keyClick(app.window()->focusWidget(), key);
    }
    std::string firstRow() { return topPane().textForCopying({0, 0}).toStdString(); }
};

} // namespace

TEST_F(PauseTest, TheSpaceBarFreezesThePanesWhileDataRunOn)
{
    launchAndConnect();
    drive(301);
    openRow(0);
    press(Qt::Key_Space);
    drive(302);
    EXPECT_EQ(firstRow(), "Physical Cell ID: 301");
    press(Qt::Key_Space);
    EXPECT_EQ(firstRow(), "Physical Cell ID: 302");
}

TEST_F(PauseTest, AtAPauseNothingBecomesYounger)
{
    launchAndConnect();
    drive(301);
    openRow(0);
    fake.clock.advance(60s);
    fake.mainQueue.advance(60s);
    EXPECT_TRUE(app.isStale("/Serving Cell Info/Physical Cell ID"));
    press(Qt::Key_Space);
    EXPECT_TRUE(app.isStale("/Serving Cell Info/Physical Cell ID"));
    EXPECT_EQ(app.timeLine().pausedAt(), fake.clock.now());
}

TEST_F(PauseTest, WhatWasToldAgainAndAgainIsNotOldInThePast)
{
    launchAndConnect();
    for (int message = 0; message < 20; ++message)
        drive(301);
    drive(302);
    app.timeLine().showTime(fake.clock.now() - 6s);
    EXPECT_FALSE(app.isStale("/Serving Cell Info/Physical Cell ID"));
}

TEST_F(PauseTest, WhatCameAgainOnlyLaterIsOldInAGap)
{
    launchAndConnect();
    drive(301);
    fake.clock.advance(60s);
    drive(301);
    app.timeLine().showTime(fake.clock.now() - 2s);
    EXPECT_FALSE(app.isStale("/Serving Cell Info/Physical Cell ID"));
    app.timeLine().showTime(fake.clock.now() - 30s);
    EXPECT_TRUE(app.isStale("/Serving Cell Info/Physical Cell ID"));
}

TEST_F(PauseTest, ComingBackTintsNothing)
{
    launchAndConnect();
    drive(301);
    openRow(0);
    press(Qt::Key_Space);
    drive(302);
    app.timeLine().goLive();
    ASSERT_EQ(firstRow(), "Physical Cell ID: 302");
    EXPECT_FALSE(static_cast<VentrikCell&>(*topPane().table().rowAt({0, 0})).isTinted());
}

TEST_F(PauseTest, TheChannelStaysInViewAtAPause)
{
    launchAndConnect();
    drive(301);
    app.toggleChannelPane();
    const int rows = topPane().rowsInSection(0);
    ASSERT_GT(rows, 0);
    press(Qt::Key_Space);
    ASSERT_TRUE(app.showsPast());
    EXPECT_EQ(topPane().rowsInSection(0), rows);
}

TEST_F(PauseTest, TheStatusTellsOfThePause)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    EXPECT_EQ(statusText(topPane()), "Paused at 06:10:30 · Live");
    drive(302);
    EXPECT_EQ(statusText(topPane()), "Paused at 06:10:30 · Live");
    press(Qt::Key_Space);
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:32");
}

TEST_F(PauseTest, HomeReturnsToThePresent)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    drive(302);
    press(Qt::Key_Home);
    openRow(0);
    EXPECT_EQ(firstRow(), "Physical Cell ID: 302");
}

TEST_F(PauseTest, HomeGoesToTheFirstRowWhereNothingIsPaused)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_End);
    press(Qt::Key_Home);
    EXPECT_EQ(topPane().table().indexPathForCurrentRow(), (IndexPath{0, 0}));
}

TEST_F(PauseTest, AClickOnTheStatusReturnsToThePresent)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    QTest::mouseClick(&statusLabel(topPane()), Qt::LeftButton);
    EXPECT_FALSE(app.timeLine().isPaused());
}

TEST_F(PauseTest, AClickOnTheStatusOfThePresentDoesNothing)
{
    launchAndConnect();
    drive(301);
    QTest::mouseClick(&statusLabel(topPane()), Qt::LeftButton);
    EXPECT_FALSE(app.timeLine().isPaused());
}

TEST_F(PauseTest, PanesShowAnyMomentThatWasKept)
{
    launchAndConnect();
    const Clock::TimePoint start = fake.clock.now();
    for (const std::uint16_t cell : std::array<std::uint16_t, 3>{301, 302, 303})
        drive(cell);
    openRow(0);
    app.timeLine().showTime(start + 2s);
    EXPECT_EQ(firstRow(), "Physical Cell ID: 302");
    EXPECT_EQ(statusText(topPane()), "Paused at 06:10:30 · Live");
    app.timeLine().showTime(start);
    EXPECT_EQ(firstRow(), "Physical Cell ID: 301");
}

TEST_F(PauseTest, ThePresentIsSavedAllTheSame)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    drive(302);
    drive(303);
    app.showSaveView();
    ASSERT_NE(app.saveViewController(), nullptr);
    press(Qt::Key_Space); // goes into the description
    EXPECT_TRUE(app.timeLine().isPaused());
    app.saveViewController()->savePressed();
    const QStringList files = QDir(temporary.path()).entryList({QStringLiteral("*.ventrik")});
    ASSERT_EQ(files.size(), 1);
    QFile file(temporary.filePath(files.front()));
    ASSERT_TRUE(file.open(QIODevice::ReadOnly));
    EXPECT_TRUE(file.readAll().contains("303"));
}

TEST_F(PauseTest, NothingIsPausedBeforeAnythingCame)
{
    launchAndConnect();
    press(Qt::Key_Space);
    EXPECT_FALSE(app.timeLine().isPaused());
}

TEST_F(PauseTest, APaneOfWhatWasNotThereYetStaysAndIsEmpty)
{
    launchAndConnect();
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    refreshWithData();
    const Clock::TimePoint before = fake.clock.now();
    fake.clock.advance(10s);
    changeTechnology(kQXLogChannelTechnology_Orbel_LTE);
    fake.mainQueue.advance(7s);
    drive(301);
    openRow(0);
    ASSERT_THAT(titles(), ElementsAre("Ventrik", "Serving Cell Info"));
    app.timeLine().showTime(before);
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Serving Cell Info"));
    EXPECT_EQ(topPane().rowsInSection(0), 0);
    EXPECT_EQ(topPane().table().placeholder().toStdString(), "Nothing was here then");
    app.timeLine().goLive();
    EXPECT_EQ(firstRow(), "Physical Cell ID: 301");
}

TEST_F(PauseTest, TheChannelsPaneIsOfThePresent)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    app.toggleChannelPane();
    EXPECT_FALSE(app.timeLine().isPaused());
    EXPECT_EQ(titles().back(), "Channel");
}

namespace
{

/// A capture of a cell's identity, told in two turns.
class TwoTurns : public OpenedSource
{
  public:
    /// The second turn ends with a text of its own.
    explicit TwoTurns(const FakePlatform& fake, std::string text = {})
        : _fake(fake), _text(std::move(text))
    {
    }

    void setObserver(MessageObserver& observer) override
    {
        _observer = &observer;
        observer.useGenerator(&_generator, "lte");
    }
    std::string name() const override { return "drive.pcap"; }
    bool readOn() override
    {
        ++_turn;
        if (before)
            before(_turn);
        _state.set(
            StateKey::display,
            PlistDictionary{{"Cell", PlistDictionary{{"PCI", std::to_string(300 + _turn)},
                                                     {"Text", _turn < turns ? "" : _text}}}});
        _observer->messageTaken(_fake.clock.now() + _turn * 60s, {}, _state);
        return _turn < turns;
    }
    std::string progress() const override { return std::to_string(_turn) + " messages"; }
    std::string fault() const override { return "it ends too early"; }

    int turns = 2;
    std::function<void(int turn)> before = {};

  private:
    const FakePlatform& _fake;
    std::string _text;
    IdleGenerator _generator;
    PlistDictionary _state;
    MessageObserver* _observer = nullptr;
    int _turn = 0;
};

class OpenedWindowTest : public AppFixture
{
  protected:
    static VentrikAppOptions optionsOf(std::shared_ptr<OpenedSource> opened)
    {
        VentrikAppOptions options;
        options.animation = false;
        options.saveButton = true;
        options.windowSize = QSize(480, 640);
        options.opened = std::move(opened);
        return options;
    }
    /// Of which only the newest state is kept.
    VentrikAppOptions shortHistory() const
    {
        VentrikAppOptions options =
            optionsOf(std::make_shared<TwoTurns>(fake, std::string(40000, 'x')));
        options.historyLimits.bytes = 16384;
        return options;
    }
    VentrikPaneController& root()
    {
        return static_cast<VentrikPaneController&>(*window.navController()->screens().front());
    }

    VentrikApp window{fake.platform(), optionsOf(std::make_shared<TwoTurns>(fake))};
};

} // namespace

TEST_F(OpenedWindowTest, TellsHowFarTheReadingIs)
{
    window.applicationDidFinishLaunching();
    EXPECT_EQ(statusText(root()), "Reading drive.pcap: 0 messages");
    EXPECT_TRUE(isSpinning(root()));
    EXPECT_EQ(window.window()->windowTitle().toStdString(), "Ventrik – drive.pcap – LTE");
}

TEST_F(OpenedWindowTest, ShowsTheCapturesEndWithoutAService)
{
    window.applicationDidFinishLaunching();
    fake.mainQueue.run();
    EXPECT_EQ(statusText(root()), "drive.pcap at 2026-11-16 06:12:28");
    EXPECT_FALSE(isSpinning(root()));
    EXPECT_EQ(note(root()), "it ends too early");
    EXPECT_EQ(*window.nodeAtPath("/Cell/PCI")->value(), "302");
    EXPECT_TRUE(fake.record->operations().empty());
}

TEST_F(OpenedWindowTest, GoesBackInTheCaptureAndToItsEnd)
{
    window.applicationDidFinishLaunching();
    fake.mainQueue.run();
    window.timeLine().showTime(fake.clock.now() + 60s);
    EXPECT_EQ(*window.nodeAtPath("/Cell/PCI")->value(), "301");
    EXPECT_EQ(statusText(root()), "drive.pcap at 2026-11-16 06:11:28");
    window.goLive();
    EXPECT_EQ(*window.nodeAtPath("/Cell/PCI")->value(), "302");
}

TEST_F(OpenedWindowTest, ShowsWhatStandsWhereTheHistoryHasNoChangeLeft)
{
    VentrikApp small(fake.platform(), shortHistory());
    small.applicationDidFinishLaunching();
    fake.mainQueue.run();
    const ChangeStore& store = small.timeLine().store();
    ASSERT_FALSE(store.isEmpty());
    ASSERT_EQ(store.firstMoment(), store.present());
    EXPECT_EQ(*small.nodeAtPath("/Cell/PCI")->value(), "302");
}

TEST_F(OpenedWindowTest, AMomentThatWasChosenStaysWhileItIsRead)
{
    const auto source = std::make_shared<TwoTurns>(fake);
    VentrikApp read(fake.platform(), optionsOf(source));
    source->turns = 3;
    source->before = [&](int turn) {
        fake.clock.advance(1s);
        if (turn == 3)
            read.timeLine().showTime(read.timeLine().store().firstTime());
    };
    read.applicationDidFinishLaunching();
    fake.mainQueue.run();
    EXPECT_EQ(*read.nodeAtPath("/Cell/PCI")->value(), "301");
    read.goLive();
    EXPECT_EQ(*read.nodeAtPath("/Cell/PCI")->value(), "303");
}

TEST_F(OpenedWindowTest, TellsWhatTheHistoryHasNotKept)
{
    VentrikApp small(fake.platform(), shortHistory());
    small.applicationDidFinishLaunching();
    fake.mainQueue.run();
    EXPECT_EQ(small.statusNote().text, "it ends too early; what was before 2026-11-16 06:12:28 is "
                                       "gone: --history keeps more");
}

TEST_F(OpenedWindowTest, AWindowThatGrowsShowsTheTimeLine)
{
    window.applicationDidFinishLaunching();
    fake.mainQueue.run();
    window.window()->resize(1000, 640);
    QTest::qWait(0);
    EXPECT_EQ(window.timeLineView()->findChild<QLabel*>()->text(), "at 2026-11-16 06:12:28");
    EXPECT_GT(window.timeLineView()->events().list().model()->rowCount(), 0);
}

TEST_F(OpenedWindowTest, SavesNothingAndHasNoChannel)
{
    window.applicationDidFinishLaunching();
    fake.mainQueue.run();
    window.showSaveView();
    EXPECT_EQ(window.saveViewController(), nullptr);
    window.toggleChannelPane();
    EXPECT_EQ(window.navController()->screens().size(), 1U);
    EXPECT_FALSE(window.allowSaveButton());
}

TEST_F(OpenedWindowTest, EndsWhileItReads)
{
    window.applicationDidFinishLaunching();
    window.applicationWillTerminate();
    fake.mainQueue.run();
    EXPECT_EQ(window.window(), nullptr);
}

namespace
{

/// A window of some width, with the values of one cell.
class TimeLineWindowTest : public AppFixture
{
  protected:
    static VentrikAppOptions optionsOf(int width)
    {
        VentrikAppOptions options;
        options.animation = false;
        options.windowSize = QSize(width, 640);
        return options;
    }
    VentrikApp& launch(int width, bool withTimeLine = true)
    {
        VentrikAppOptions options = optionsOf(width);
        options.timeLine = withTimeLine;
        return launch(options);
    }
    VentrikApp& launch(const VentrikAppOptions& options)
    {
        window.emplace(fake.platform(), options);
        window->applicationDidFinishLaunching();
        fake.mainQueue.run();
        tell(301);
        return *window;
    }
    void tell(std::uint16_t identity)
    {
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0,
                                       PacketBuilder(0xB0C2).u16(14, identity).size(38).build()));
        fake.mainQueue.run();
        fake.mainQueue.advance(2s);
    }
    void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier)
    {
        EXPECT_TRUE(QTest::qWaitForWindowActive(window->window()));
        QTest::keyClick(window->window()->focusWidget(), key, modifiers);
    }
    bool showsTimeLine() { return window->timeLineView()->isVisible(); }
    int panesWidth() { return window->navController()->width(); }
    std::vector<std::string> screenTitles()
    {
        std::vector<std::string> result;
        for (const Screen* screen : window->navController()->screens())
            result.push_back(screen->title().toStdString());
        return result;
    }
    void resize(int width)
    {
        window->window()->resize(width, 640);
        QTest::qWait(0);
    }
    VentrikPaneController& top()
    {
        return static_cast<VentrikPaneController&>(window->navController()->topScreen());
    }
    void openFirstRow() { top().rowSelected(top().table(), IndexPath{0, 0}); }
    static QWidget* waitForPopup()
    {
        EXPECT_TRUE(QTest::qWaitFor([] { return QApplication::activePopupWidget(); }));
        return QApplication::activePopupWidget();
    }
    std::size_t pins() { return window->timeLine().series().series().size(); }

    std::optional<VentrikApp> window;
};

constexpr const char* cellTemplate = "<plist><dict><key>Serving Cell Info</key><dict>"
                                     "<key>Physical Cell ID</key><string>-</string>"
                                     "<key>Name</key><string>of no number</string>"
                                     "</dict></dict></plist>";

} // namespace

TEST_F(TimeLineWindowTest, StandsBesidePanesOfAPhonesWidthInAWideWindow)
{
    launch(840);
    EXPECT_TRUE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 390);
    EXPECT_GE(window->timeLineView()->x(), 390);
    EXPECT_EQ(window->timeLineView()->geometry().right(), 839);
}

TEST_F(TimeLineWindowTest, LeavesANarrowWindowAsItIs)
{
    launch(839);
    EXPECT_FALSE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 839);
}

TEST_F(TimeLineWindowTest, ComesAndGoesWithTheWindowsWidth)
{
    launch(839);
    resize(900);
    EXPECT_TRUE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 390);
    resize(500);
    EXPECT_FALSE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 500);
}

TEST_F(TimeLineWindowTest, IsHiddenAndShownByAKeyWhichIsRemembered)
{
    launch(900);
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_FALSE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 900);
    window->applicationWillTerminate();
    launch(900);
    EXPECT_FALSE(showsTimeLine());
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_TRUE(showsTimeLine());
    window->applicationWillTerminate();
    launch(900);
    EXPECT_TRUE(showsTimeLine());
}

TEST_F(TimeLineWindowTest, IsNotThereFromTheStartWhereThatIsSaid)
{
    launch(900, false);
    EXPECT_FALSE(showsTimeLine());
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_TRUE(showsTimeLine());
}

TEST_F(TimeLineWindowTest, IsAScreenOfItsOwnInANarrowWindow)
{
    launch(480);
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik", "Time Line"));
    EXPECT_TRUE(showsTimeLine());
    EXPECT_EQ(window->timeLineView()->width(), 480);
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik"));
    EXPECT_FALSE(showsTimeLine());
}

TEST_F(TimeLineWindowTest, LeavesItsScreenByTheWayBack)
{
    launch(480);
    press(Qt::Key_T, Qt::ControlModifier);
    press(Qt::Key_Escape);
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik"));
    press(Qt::Key_T, Qt::ControlModifier);
    EXPECT_TRUE(showsTimeLine());
}

TEST_F(TimeLineWindowTest, GoesBesideThePanesWhenTheWindowBecomesWide)
{
    launch(480);
    press(Qt::Key_T, Qt::ControlModifier);
    resize(900);
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik"));
    EXPECT_TRUE(showsTimeLine());
    EXPECT_EQ(panesWidth(), 390);
}

TEST_F(TimeLineWindowTest, OutlivesTheEndOfTheApplicationInEitherPlace)
{
    launch(480);
    press(Qt::Key_T, Qt::ControlModifier);
    window->applicationWillTerminate();
    EXPECT_EQ(window->timeLineView(), nullptr);
    launch(900);
    window->applicationWillTerminate();
    EXPECT_EQ(window->timeLineView(), nullptr);
}

TEST_F(TimeLineWindowTest, ANumberIsPinnedByAKeyAndUnpinnedByIt)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    const std::size_t before = pins();
    openFirstRow();
    press(Qt::Key_Down);
    press(Qt::Key_P);
    ASSERT_EQ(pins(), before + 1);
    EXPECT_EQ(window->timeLine().series().series().back().pin.path,
              "/Serving Cell Info/Physical Cell ID");
    EXPECT_EQ(window->timeLine().series().series().back().points.size(), 1U);
    press(Qt::Key_P);
    EXPECT_EQ(pins(), before);
}

TEST_F(TimeLineWindowTest, PinsAreKeptForTheNextTime)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    window->togglePin("/Serving Cell Info/Physical Cell ID");
    window->togglePin("/Serving Cell Measurements/Measured RSSI");
    const std::size_t count = pins();
    window->applicationWillTerminate();
    launch(900);
    EXPECT_EQ(pins(), count);
    EXPECT_TRUE(window->isPinned("/Serving Cell Info/Physical Cell ID"));
    EXPECT_FALSE(window->isPinned("/Serving Cell Measurements/Measured RSSI"));
    EXPECT_TRUE(window->isPinned("/Serving Cell Measurements/Measured RSRP"));
}

TEST_F(TimeLineWindowTest, WhatIsNoNumberCannotBePinned)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    EXPECT_FALSE(window->canPin("/Serving Cell Info/Name"));
    EXPECT_FALSE(window->canPin("/Serving Cell Info"));
    window->togglePin("/Serving Cell Info/Name");
    EXPECT_FALSE(window->isPinned("/Serving Cell Info/Name"));
}

TEST_F(TimeLineWindowTest, ALongPressOffersWhatCanBeDoneWithARow)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(480);
    openFirstRow();
    const std::size_t before = pins();
    QTest::mousePress(top().table().viewport(), Qt::LeftButton, {}, QPoint(50, 20));
    const auto* menu = qobject_cast<QMenu*>(waitForPopup());
    ASSERT_NE(menu, nullptr);
    ASSERT_EQ(menu->actions().size(), 3);
    EXPECT_EQ(menu->actions()[0]->text(), "Copy");
    EXPECT_EQ(menu->actions()[1]->text(), "Where It Comes From");
    EXPECT_EQ(menu->actions()[2]->text(), "Pin to the Time Line");
    menu->actions()[2]->trigger();
    EXPECT_EQ(pins(), before + 1);
}

TEST_F(TimeLineWindowTest, ThePauseButtonFreezesAndLeadsBack)
{
    launch(900);
    QPushButton& button = *window->timeLineView()->findChild<QPushButton*>();
    EXPECT_EQ(button.text(), "Pause");
    button.click();
    EXPECT_TRUE(window->timeLine().isPaused());
    EXPECT_EQ(button.text(), "Live");
    EXPECT_EQ(window->timeLineView()->strip().cursor(), window->timeLine().pausedAt());
    button.click();
    EXPECT_FALSE(window->timeLine().isPaused());
    EXPECT_EQ(window->timeLineView()->strip().cursor(), std::nullopt);
}

TEST_F(TimeLineWindowTest, CellsAreAsOldAsTheyWereAtTheMoment)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    fake.clock.advance(60s);
    window->timeLine().showTime(fake.clock.now() - 20s);
    const QAbstractItemModel& cells = *window->timeLineView()->cells().table().model();
    EXPECT_EQ(cells.index(0, CellsModel::Age).data().toString(), "40");
}

TEST_F(TimeLineWindowTest, AnEventThatTheHistoryHasNoMoreLeadsToItsBeginning)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    VentrikAppOptions options = optionsOf(900);
    options.historyLimits.bytes = 65536;
    launch(options);
    for (std::uint16_t identity = 0; identity < 500; ++identity) {
        fake.clock.advance(2s);
        tell(identity);
    }
    const Event oldest = window->timeLine().events().events().front();
    const Clock::TimePoint begin = window->timeLine().store().firstTime();
    ASSERT_FALSE(window->timeLine().store().isEmpty());
    ASSERT_LT(oldest.time, begin);
    window->timeLine().showEvent(oldest);
    EXPECT_EQ(window->timeLine().pausedAt(), begin);
}

TEST_F(TimeLineWindowTest, ALostChannelIsAnEventAtOnce)
{
    launch(900);
    loseService();
    fake.mainQueue.advance(4s); // the model finds out
    EXPECT_EQ(window->timeLine().events().events().back().kind, EventKind::Channel);
}

TEST_F(TimeLineWindowTest, SpacePausesFromTheListsAsWell)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    for (QWidget* list : {static_cast<QWidget*>(&window->timeLineView()->cells()),
                          static_cast<QWidget*>(&window->timeLineView()->events())}) {
        list->setFocus();
        press(Qt::Key_Space);
        EXPECT_TRUE(window->timeLine().isPaused());
        press(Qt::Key_Home);
        EXPECT_FALSE(window->timeLine().isPaused());
    }
}

TEST_F(TimeLineWindowTest, TheBarIsNotLiveWhileTheChannelIsLost)
{
    launch(900);
    const QLabel& bar = *window->timeLineView()->findChild<QLabel*>();
    EXPECT_EQ(bar.text(), "Live");
    loseService();
    fake.mainQueue.advance(4s); // the model finds out
    EXPECT_EQ(bar.text(), "Connecting...");
}

TEST_F(TimeLineWindowTest, APauseTellsThatTheChannelIsLostMeanwhile)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    press(Qt::Key_Space);
    ASSERT_TRUE(window->timeLine().isPaused());
    EXPECT_THAT(statusText(top()), testing::EndsWith(" · Live"));
    loseService();
    fake.mainQueue.advance(4s); // the model finds out
    EXPECT_THAT(statusText(top()), testing::EndsWith(" · Connecting..."));
}

TEST_F(TimeLineWindowTest, AClickOnACellOpensItsPaneWithTheWayBackBelowIt)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(900);
    QTableView& cells = window->timeLineView()->cells().table();
    ASSERT_EQ(cells.model()->rowCount(), 1);
    QTest::mouseClick(cells.viewport(), Qt::LeftButton, {},
                      cells.visualRect(cells.model()->index(0, 0)).center());
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik", "Serving Cell Info"));
}

TEST_F(TimeLineWindowTest, AClickOnACellLeavesTheTimeLinesScreen)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(480);
    press(Qt::Key_T, Qt::ControlModifier);
    QTableView& cells = window->timeLineView()->cells().table();
    QTest::mouseClick(cells.viewport(), Qt::LeftButton, {},
                      cells.visualRect(cells.model()->index(0, 0)).center());
    EXPECT_THAT(screenTitles(), ElementsAre("Ventrik", "Serving Cell Info"));
    EXPECT_FALSE(showsTimeLine());
}

TEST_F(TimeLineWindowTest, CellsGrowOldWhileNothingComes)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(1280);
    const CellsModel& cells = window->timeLineView()->cells().model();
    ASSERT_EQ(cells.rowCount(), 1);
    const auto before = cells.cell(0).age;
    fake.clock.advance(14s);
    fake.mainQueue.advance(1s);
    EXPECT_EQ(cells.cell(0).age, before + 14s);
}

TEST_F(TimeLineWindowTest, AClickOnAnEventGoesToItsMoment)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(1280);
    const Clock::TimePoint first = fake.clock.now();
    fake.clock.advance(10s);
    tell(302);
    fake.clock.advance(10s);
    tell(303);
    QListView& events = window->timeLineView()->events().list();
    ASSERT_GE(events.model()->rowCount(), 2); // the newest on top
    QTest::mouseClick(events.viewport(), Qt::LeftButton, {},
                      events.visualRect(events.model()->index(1, 0)).center());
    EXPECT_EQ(window->timeLine().pausedAt(), first + 10s);
    EXPECT_EQ(*window->nodeAtPath("/Serving Cell Info/Physical Cell ID")->value(), "302");
}

TEST_F(TimeLineWindowTest, AClickOnTheStripShowsThatMomentEverywhere)
{
    fake.resources.add("/res/LTE.plist", cellTemplate);
    launch(1280);
    window->togglePin("/Serving Cell Info/Physical Cell ID");
    const Clock::TimePoint first = fake.clock.now();
    fake.clock.advance(100s);
    tell(302);
    SignalStrip& strip = window->timeLineView()->strip();
    QTest::mouseClick(&strip, Qt::LeftButton, {},
                      QPoint(static_cast<int>(strip.xOf(first + 50s)), strip.height() / 3));
    ASSERT_TRUE(window->timeLine().isPaused());
    EXPECT_NEAR(std::chrono::duration<double>(*window->timeLine().pausedAt() - first).count(), 50,
                2);
    EXPECT_EQ(*window->nodeAtPath("/Serving Cell Info/Physical Cell ID")->value(), "301");
    ASSERT_EQ(window->timeLineView()->cells().model().rowCount(), 1);
    EXPECT_EQ(window->timeLineView()->cells().model().cell(0).identity, "301");
    press(Qt::Key_Home);
    EXPECT_EQ(window->timeLineView()->cells().model().cell(0).identity, "302");
}

TEST_F(TimeLineWindowTest, ListsStandUnderTabsWhereThereIsNoRoomForBoth)
{
    launch(900);
    EXPECT_TRUE(window->timeLineView()->cells().isVisible());
    EXPECT_FALSE(window->timeLineView()->events().isVisible());
    QTabBar& tabs = *window->timeLineView()->findChild<QTabBar*>();
    tabs.setCurrentIndex(1);
    EXPECT_FALSE(window->timeLineView()->cells().isVisible());
    EXPECT_TRUE(window->timeLineView()->events().isVisible());
    resize(1280);
    EXPECT_TRUE(window->timeLineView()->cells().isVisible());
    EXPECT_TRUE(window->timeLineView()->events().isVisible());
    EXPECT_FALSE(tabs.isVisible());
}

} // namespace ventrik
