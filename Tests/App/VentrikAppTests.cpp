#include "Tests/App/AppFixture.h"

#include "App/Toolkit/Transition.h"
#include "App/VentrikCell.h"
#include "Tests/App/TestScreen.h"

#include <QDir>
#include <QGuiApplication>
#include <QLineEdit>
#include <QLocale>
#include <QPushButton>
#include <QScreen>
#include <QTest>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

// A kind of screen of its own, which writes down what it is told.
class Legend : public Screen
{
  public:
    Legend() { setTitle("Legend"); }

    bool reload() override
    {
        told.emplace_back("data");
        return hasContent;
    }
    void setStatus(const std::string& status, bool isLoading) override
    {
        told.push_back(status + (isLoading ? " (loading)" : ""));
    }
    void updateNotes() override { told.emplace_back("notes"); }

    bool hasContent = true;
    std::vector<std::string> told;
};

class VentrikAppTest : public AppFixture
{
  protected:
    Legend& openLegend()
    {
        auto legend = std::make_unique<Legend>();
        Legend& opened = *legend;
        app.navController()->push(std::move(legend), false);
        return opened;
    }
    // Down to Cell / Details / More.
    void openAll()
    {
        openRow(0);
        openRow(0);
        openRow(0);
        ASSERT_THAT(titles(), ElementsAre("Ventrik", "Cell", "Details", "More"));
    }
    // The toolbar's Save button of the top pane.
    QPushButton& saveButton()
    {
        return dynamic_cast<QPushButton&>(*topPane().toolbar().items().at(3));
    }
    // Pictures that slide; those that fade let clicks through.
    std::size_t covers()
    {
        std::size_t count = 0;
        for (const QWidget* widget : app.window()->findChildren<QWidget*>())
            if (dynamic_cast<const Transition*>(widget) &&
                !widget->testAttribute(Qt::WA_TransparentForMouseEvents))
                ++count;
        return count;
    }
    void waitForStillness()
    {
        ASSERT_TRUE(QTest::qWaitFor([this] { return covers() == 0; }));
    }
    // Launches with a tree two levels deep in view, and lets the window move from then on.
    void launchMoving()
    {
        launchAndConnect();
        refreshWithData();
        openRow(0);
        openRow(0);
        app.navController()->setAnimationEnabled(true);
        ASSERT_EQ(covers(), 0U);
    }
    int savedRows() { return app.saveViewController()->rowsInSection(0); }
    std::string valueText(int row)
    {
        const auto& cell = dynamic_cast<VentrikCell&>(*topPane().table().rowAt({0, row}));
        return cell.value()->text().toStdString();
    }
};

} // namespace

TEST_F(VentrikAppTest, TheFirstStatusIsConnectingWithoutDots)
{
    app.applicationDidFinishLaunching();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
    EXPECT_EQ(pane(0).path(), "/");
    EXPECT_EQ(statusText(pane(0)), "Connecting");
    EXPECT_TRUE(isSpinning(pane(0)));
    EXPECT_TRUE(pane(0).table().visibleRows().empty());
}

TEST_F(VentrikAppTest, TheModelIsStartedOneTurnAfterTheLaunch)
{
    app.applicationDidFinishLaunching();
    EXPECT_EQ(fake.telephony.creationCount(), 0U);
    fake.mainQueue.run();
    EXPECT_EQ(fake.telephony.creationCount(), 1U);
}

TEST_F(VentrikAppTest, TheWindowIsShownAsLargeAsAskedFor)
{
    app.applicationDidFinishLaunching();
    EXPECT_TRUE(app.window()->isVisible());
    EXPECT_EQ(app.window()->size(), QSize(480, 640));
}

TEST_F(VentrikAppTest, TheWindowIsAsLargeAsTheMainScreenOtherwise)
{
    VentrikApp large(fake.platform(), {});
    large.applicationDidFinishLaunching();
    EXPECT_EQ(large.window()->size(), QGuiApplication::primaryScreen()->size());
}

TEST_F(VentrikAppTest, TheRootStaysEmptyWithConnectingUntilTheFirstRefresh)
{
    launchAndConnect();
    fake.mainQueue.advance(20s);
    EXPECT_EQ(statusText(pane(0)), "Connecting");
    EXPECT_TRUE(isSpinning(pane(0)));
    EXPECT_TRUE(pane(0).table().visibleRows().empty());
}

TEST_F(VentrikAppTest, ARefreshShowsTheTreeAndItsTime)
{
    launchAndConnect();
    refreshWithData();
    EXPECT_EQ(pane(0).table().visibleRows().size(), 1U);
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 06:10:28");
    EXPECT_FALSE(isSpinning(pane(0)));
}

TEST_F(VentrikAppTest, TheUpdateTimeIsLocalTime)
{
    fake.clock.setTimeZone({2 * 3600 + 1800, false});
    launchAndConnect();
    refreshWithData();
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 08:40:28");
}

TEST_F(VentrikAppTest, EachRefreshBringsTheTimeForward)
{
    launchAndConnect();
    refreshWithData();
    fake.clock.advance(75s);
    refreshWithData();
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 06:11:43");
    EXPECT_EQ(app.updateMessage(), "Updated 2026-11-16 at 06:11:43");
}

TEST_F(VentrikAppTest, APaneShownBeforeTheFirstUpdateReadsConnectingAtRest)
{
    launchAndConnect();
    app.updateStatusForViewController(pane(0));
    EXPECT_EQ(statusText(pane(0)), "Connecting...");
    EXPECT_FALSE(isSpinning(pane(0)));
}

TEST_F(VentrikAppTest, OnlyTheTopPanesStatusChanges)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    fake.clock.advance(2s);
    refreshWithData();
    EXPECT_EQ(statusText(pane(1)), "Updated 2026-11-16 at 06:10:30");
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 06:10:28");
}

TEST_F(VentrikAppTest, APaneThatComesBackIntoViewGetsTheCurrentStatus)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    fake.clock.advance(2s);
    refreshWithData();
    app.navController()->pop(true);
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 06:10:30");
}

TEST_F(VentrikAppTest, EveryPaneIsReloaded)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    EXPECT_EQ(valueText(1), "lte");
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell"));
    EXPECT_EQ(topPane().table().visibleRows().size(), 1U);
}

TEST_F(VentrikAppTest, AVanishedDrillDownPopsToTheDeepestLivingPane)
{
    launchAndConnect();
    refreshWithData();
    openAll();
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    fake.clock.advance(5s);
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell"));
    EXPECT_EQ(statusText(topPane()), "Updated 2026-11-16 at 06:10:33");
}

TEST_F(VentrikAppTest, AScreenThatIsNoPaneIsToldOfDataStatusAndNotes)
{
    launchAndConnect();
    refreshWithData();
    Legend& legend = openLegend();
    EXPECT_THAT(legend.told, ElementsAre("Updated 2026-11-16 at 06:10:28"));
    EXPECT_EQ(windowTitle(), "Ventrik – LTE – Legend");
    legend.told.clear();
    refreshWithData();
    EXPECT_THAT(legend.told, testing::IsSupersetOf({"data", "Updated 2026-11-16 at 06:10:28"}));
    legend.told.clear();
    app.snapshotSaved("file");
    EXPECT_THAT(legend.told, ElementsAre("notes"));
}

TEST_F(VentrikAppTest, AScreenThatIsNoPaneIsToldThatTheConnectionIsLost)
{
    launchAndConnect();
    refreshWithData();
    Legend& legend = openLegend();
    legend.told.clear();
    loseService();
    fake.mainQueue.advance(2s);
    EXPECT_THAT(legend.told, testing::Contains("Connecting... (loading)"));
}

TEST_F(VentrikAppTest, AScreenThatIsNoPaneStaysWhileItHasSomethingToShow)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    Legend& legend = openLegend();
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell", "Legend"));
    legend.hasContent = false;
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell"));
}

TEST_F(VentrikAppTest, AScreenThatIsNoPaneTakesThoseAboveAlong)
{
    launchAndConnect();
    refreshWithData();
    Legend& legend = openLegend();
    app.navController()->push(
        VentrikPaneController::initWithNode(app, app.nodeAtPath("/Cell"), "/Cell"), false);
    legend.hasContent = false;
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
}

TEST_F(VentrikAppTest, AScreenThatTakesNothingUpMayStandOnTheStack)
{
    launchAndConnect();
    app.navController()->push(std::make_unique<Screen>(), false);
    refreshWithData();
    fake.mainQueue.advance(2s);
    EXPECT_EQ(app.navController()->screens().size(), 2U);
}

TEST_F(VentrikAppTest, ADrillDownThatIsStillThereStays)
{
    launchAndConnect();
    refreshWithData();
    openAll();
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell", "Details", "More"));
}

TEST_F(VentrikAppTest, WithoutAConnectionTheTopPaneReadsConnectingWithDots)
{
    launchAndConnect();
    refreshWithData();
    const auto message = app.updateMessage();
    EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0, Bytes(13)));
    fake.mainQueue.run();
    loseService();
    fake.mainQueue.advance(2s);
    EXPECT_EQ(statusText(pane(0)), "Connecting...");
    EXPECT_TRUE(isSpinning(pane(0)));
    EXPECT_EQ(app.updateMessage(), message);
}

TEST_F(VentrikAppTest, APaneOpenedWithoutAConnectionReadsConnectingWithDots)
{
    launchAndConnect();
    refreshWithData();
    loseService();
    fake.mainQueue.advance(2s);
    openRow(0);
    EXPECT_EQ(statusText(topPane()), "Connecting...");
    EXPECT_TRUE(isSpinning(topPane()));
}

TEST_F(VentrikAppTest, WithoutTheMarkerThereIsNoSaveButton)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    EXPECT_FALSE(app.allowSaveButton());
    EXPECT_EQ(pane(0).toolbar().items().size(), 3U);
    EXPECT_EQ(pane(1).toolbar().items().size(), 3U);
}

TEST_F(VentrikAppTest, WhereSavingIsAllowedEveryPaneHasTheButton)
{
    launchAndConnect();
    app.setAllowSaveButton(true);
    refreshWithData();
    openRow(0);
    EXPECT_EQ(pane(0).toolbar().items().size(), 4U);
    EXPECT_EQ(pane(1).toolbar().items().size(), 4U);
}

TEST_F(VentrikAppTest, TheSaveButtonOpensTheSaveScreenWithWhatThereIsToSave)
{
    launchAndConnect();
    app.setAllowSaveButton(true);
    refreshWithData();
    refreshWithData();
    QTest::mouseClick(&saveButton(), Qt::LeftButton);
    ASSERT_NE(app.saveViewController(), nullptr);
    EXPECT_EQ(app.navController()->presentedScreen(), app.saveViewController());
    EXPECT_EQ(savedRows(), 3); // two displays and the DLF
}

TEST_F(VentrikAppTest, BeforeTheServiceAnswersThereIsNothingToSave)
{
    app.applicationDidFinishLaunching();
    app.showSaveView();
    EXPECT_EQ(savedRows(), 0);
}

TEST_F(VentrikAppTest, ASecondPressOfSaveDoesNothing)
{
    launchAndConnect();
    app.showSaveView();
    const auto* first = app.saveViewController();
    app.showSaveView();
    EXPECT_EQ(app.saveViewController(), first);
}

TEST_F(VentrikAppTest, HistoryGatheredAfterTheOpeningIsNotShown)
{
    launchAndConnect();
    refreshWithData();
    app.showSaveView();
    refreshWithData();
    EXPECT_EQ(savedRows(), 2);
    app.closeSaveView();
    app.showSaveView();
    EXPECT_EQ(savedRows(), 3);
}

TEST_F(VentrikAppTest, ClosingTheSaveScreenReleasesIt)
{
    launchAndConnect();
    app.showSaveView();
    app.closeSaveView();
    EXPECT_EQ(app.saveViewController(), nullptr);
    EXPECT_EQ(app.navController()->presentedScreen(), nullptr);
    EXPECT_TRUE(topPane().isVisible());
    app.closeSaveView();
    EXPECT_EQ(app.saveViewController(), nullptr);
}

TEST_F(VentrikAppTest, CancelClosesTheSaveScreenOnTheMainQueue)
{
    launchAndConnect();
    app.showSaveView();
    QTest::mouseClick(&app.saveViewController()->cancelButton(), Qt::LeftButton);
    EXPECT_NE(app.saveViewController(), nullptr);
    fake.mainQueue.run();
    EXPECT_EQ(app.saveViewController(), nullptr);
}

TEST_F(VentrikAppTest, SaveWritesIntoTheSnapshotDirectoryAndClosesTheScreen)
{
    launchAndConnect();
    refreshWithData();
    app.showSaveView();
    QTest::mouseClick(&app.saveViewController()->saveButton(), Qt::LeftButton);
    fake.mainQueue.run();
    EXPECT_EQ(app.saveViewController(), nullptr);
    EXPECT_TRUE(QFile::exists(temporary.filePath("VentrikSnapshot-1794809428.ventrik")));
}

TEST_F(VentrikAppTest, ARefreshBehindTheSaveScreenLeavesItTheKeyboard)
{
    launchAndConnect();
    refreshWithData();
    openAll();
    app.showSaveView();
    QCoreApplication::processEvents();
    app.saveViewController()->saveDescription().setFocus();
    ASSERT_TRUE(app.saveViewController()->saveDescription().hasFocus());
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    refreshWithData();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Cell"));
    EXPECT_TRUE(app.saveViewController()->saveDescription().hasFocus());
}

TEST_F(VentrikAppTest, TerminationClosesAnOpenSaveScreen)
{
    launchAndConnect();
    app.showSaveView();
    app.applicationWillTerminate();
    EXPECT_EQ(app.saveViewController(), nullptr);
    fake.mainQueue.run();
}

TEST_F(VentrikAppTest, TheOptionOffersSaveWithoutTheMarker)
{
    VentrikAppOptions options;
    options.saveButton = true;
    VentrikApp saving(fake.platform(), options);
    saving.getSaveButtonPref();
    EXPECT_TRUE(saving.allowSaveButton());
}

TEST_F(VentrikAppTest, TheHomeScreenIsLeftAloneUntilTheEnd)
{
    launchAndConnect();
    refreshWithData();
    EXPECT_THAT(fake.preferences.calls(), IsEmpty());
}

TEST_F(VentrikAppTest, TerminationResetsTheHomeScreenAndClosesEverything)
{
    launchAndConnect();
    refreshWithData();
    app.applicationWillTerminate();
    EXPECT_THAT(fake.preferences.calls(),
                ElementsAre("set org.ventrik.HomeScreen HSShowGSMRSSI false",
                            "synchronize org.ventrik.HomeScreen",
                            "post org.ventrik.HomeScreen HSShowGSMRSSI"));
    EXPECT_EQ(app.updateMessage(), std::nullopt);
    EXPECT_EQ(app.window(), nullptr);
    EXPECT_EQ(app.navController(), nullptr);
}

TEST_F(VentrikAppTest, TheWindowIsGoneBeforeTheModelTearsDownItsPorts)
{
    launchAndConnect();
    const auto port = fake.ports.localPort(logChannelLocalPortName);
    std::vector<std::string> order;
    QObject::connect(app.window(), &QObject::destroyed, [&] {
        order.push_back(port->isValid() ? "window, port still open" : "window");
        order.push_back(fake.preferences.calls().empty() ? "no preferences" : "preferences first");
    });
    fake.ports.clearOperations();
    app.applicationWillTerminate();
    EXPECT_THAT(order, ElementsAre("window, port still open", "preferences first"));
    const std::string local(logChannelLocalPortName);
    const std::string remote(remoteName);
    EXPECT_THAT(fake.ports.operations(),
                ElementsAre("local callback cleared " + local, "local invalidated " + local,
                            "remote callback cleared " + remote, "remote invalidated " + remote,
                            "remote released " + remote));
}

TEST_F(VentrikAppTest, NothingRunsAfterTermination)
{
    launchAndConnect();
    EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0, Bytes(13)));
    app.applicationWillTerminate();
    fake.mainQueue.advance(1min);
    EXPECT_EQ(fake.telephony.creationCount(), 1U);
}

TEST_F(VentrikAppTest, AnApplicationThatEndsBeforeItsFirstTurnStartsNoModel)
{
    app.applicationDidFinishLaunching();
    app.applicationWillTerminate();
    fake.mainQueue.run();
    EXPECT_EQ(fake.telephony.creationCount(), 0U);
}

TEST_F(VentrikAppTest, TheWindowIsLaidOutFromLeftToRightOnEveryDesktop)
{
    QGuiApplication::setLayoutDirection(Qt::RightToLeft);
    launchAndConnect();
    refreshWithData();
    QCoreApplication::processEvents();
    QGuiApplication::setLayoutDirection(Qt::LeftToRight);
    EXPECT_EQ(app.window()->layoutDirection(), Qt::LeftToRight);
    EXPECT_EQ(pane(0).toolbar().items().at(1)->x(), 12);
}

TEST_F(VentrikAppTest, AWindowKeepsItsSizeHoweverNarrowItIs)
{
    launchAndConnect();
    app.setAllowSaveButton(true);
    refreshWithData();
    for (const QSize size : {QSize(320, 568), QSize(200, 480)}) {
        showAt(*app.window(), size.width(), size.height());
        refreshWithData();
        app.showSaveView();
        QCoreApplication::processEvents();
        EXPECT_EQ(app.window()->size(), size);
        app.closeSaveView();
        QCoreApplication::processEvents();
        EXPECT_EQ(app.window()->size(), size);
        EXPECT_EQ(topPane().width(), size.width());
        EXPECT_LE(saveButton().geometry().right(), size.width() - 12);
    }
}

TEST_F(VentrikAppTest, TheMarkerIsTheOneOfInternalBuilds)
{
    EXPECT_EQ(VentrikAppOptions().saveButtonMarker,
              "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
}

TEST_F(VentrikAppTest, TheLaunchLooksForTheMarker)
{
    VentrikAppOptions options;
    options.saveButtonMarker = temporary.filePath("marker").toStdString();
    VentrikApp without(fake.platform(), options);
    without.applicationDidFinishLaunching();
    EXPECT_FALSE(without.allowSaveButton());
    QDir(temporary.path()).mkdir("marker");
    VentrikApp with(fake.platform(), options);
    with.applicationDidFinishLaunching();
    EXPECT_TRUE(with.allowSaveButton());
}

TEST_F(VentrikAppTest, APaneWhoseNodeIsGoneGoesAwayInMotion)
{
    launchMoving();
    changeTechnology(kQXLogChannelTechnology_Orbel_UTRAN2);
    fake.mainQueue.advance(2s);
    ASSERT_EQ(titles().size(), 3U);
    refreshWithData();
    ASSERT_EQ(titles().size(), 2U);
    EXPECT_GT(covers(), 0U);
}

TEST_F(VentrikAppTest, TheSaveScreenComesAndGoesInMotion)
{
    launchMoving();
    app.showSaveView();
    EXPECT_GT(covers(), 0U);
    waitForStillness();
    app.closeSaveView();
    EXPECT_GT(covers(), 0U);
}

TEST_F(VentrikAppTest, TheFormatterIsReleasedAtTermination)
{
    launchAndConnect();
    EXPECT_NE(app.dateFormatter(), nullptr);
    app.applicationWillTerminate();
    EXPECT_EQ(app.dateFormatter(), nullptr);
}

TEST_F(VentrikAppTest, TheRootPaneIsReloadedAlsoWithoutANode)
{
    app.applicationDidFinishLaunching();
    pane(0).reloadWithNode(VentrikModelTreeNode::initWithName("Old", {}));
    app.updateViewControllerFromModel();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
}

TEST_F(VentrikAppTest, TerminationMayComeTwice)
{
    launchAndConnect();
    app.applicationWillTerminate();
    app.applicationWillTerminate();
    EXPECT_EQ(app.window(), nullptr);
}

TEST_F(VentrikAppTest, TerminationBeforeTheLaunchResetsTheHomeScreen)
{
    app.applicationWillTerminate();
    EXPECT_EQ(fake.preferences.calls().size(), 3U);
}

TEST_F(VentrikAppTest, AnotherWindowLeavesTheOpenSaveScreenItsOwner)
{
    launchAndConnect();
    app.showSaveView();
    app.setWindow(std::make_unique<QWidget>());
    EXPECT_EQ(app.navController(), nullptr);
    ASSERT_NE(app.saveViewController(), nullptr);
    EXPECT_EQ(app.saveViewController()->parentWidget(), nullptr);
    app.closeSaveView();
    EXPECT_EQ(app.saveViewController(), nullptr);
}

TEST_F(VentrikAppTest, WithoutItsPanesNothingIsShownOrReloaded)
{
    app.showSaveView();
    launchAndConnect();
    app.setWindow(nullptr);
    app.showSaveView();
    app.updateViewControllerFromModel();
    EXPECT_EQ(app.saveViewController(), nullptr);
}

TEST_F(VentrikAppTest, TheUpdateTimeIsWrittenTheSameInEveryLanguage)
{
    QLocale::setDefault(QLocale(QLocale::Arabic, QLocale::Egypt));
    launchAndConnect();
    refreshWithData();
    QLocale::setDefault(QLocale::c());
    EXPECT_EQ(statusText(pane(0)), "Updated 2026-11-16 at 06:10:28");
}

TEST_F(VentrikAppTest, PlainValuesAreNotTinted)
{
    EXPECT_TRUE(app.tintsChanges());
    VentrikAppOptions options;
    options.tintsChanges = false;
    EXPECT_FALSE(VentrikApp(fake.platform(), options).tintsChanges());
}

} // namespace ventrik
