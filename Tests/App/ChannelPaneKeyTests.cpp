#include "Tests/App/AppFixture.h"

#include <QTest>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

class ChannelPaneKeyTest : public AppFixture
{
  protected:
    void pressF8() { pressF8In(app); }
    // Only a window that is active has shortcuts.
    static void pressF8In(VentrikApp& pressed)
    {
        EXPECT_TRUE(QTest::qWaitForWindowActive(pressed.window()));
        QTest::keyClick(pressed.window(), Qt::Key_F8);
    }
    // Both clocks move.
    void wait(std::chrono::seconds time)
    {
        fake.clock.advance(time);
        fake.mainQueue.advance(time);
    }
    static int rows(VentrikPaneController& pane) { return pane.rowsInSection(0); }
    // "name: value" of the row of that name.
    static std::string rowNamed(VentrikPaneController& pane, const std::string& name)
    {
        for (int row = 0; row < rows(pane); ++row) {
            const std::string text = pane.textForCopying({0, row}).toStdString();
            if (text.starts_with(name))
                return text;
        }
        return "no " + name;
    }
};

} // namespace

TEST_F(ChannelPaneKeyTest, OpensThePaneAndClosesIt)
{
    launchAndConnect();
    refreshWithData();
    const int rowsBefore = rows(pane(0));
    pressF8();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Channel"));
    EXPECT_EQ(rows(pane(0)), rowsBefore + 1);
    EXPECT_EQ(rowNamed(topPane(), "Messages"), "Messages: 1");
    pressF8();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
    EXPECT_EQ(rows(pane(0)), rowsBefore);
}

TEST_F(ChannelPaneKeyTest, ShowsThePaneBeforeThereIsAnyDisplay)
{
    fake.telephony.setServiceAvailable(false);
    launchAndConnect();
    pressF8();
    EXPECT_EQ(rowNamed(topPane(), "State"), "State: no service");
    EXPECT_EQ(statusText(topPane()), "Connecting...");
    EXPECT_TRUE(isSpinning(topPane()));
}

TEST_F(ChannelPaneKeyTest, LeadsThereFromAnyPane)
{
    launchAndConnect();
    refreshWithData();
    openRow(0);
    openRow(0);
    pressF8();
    EXPECT_THAT(titles(), ElementsAre("Ventrik", "Channel"));
    openRow(rows(topPane()) - 2); // the last that has rows
    EXPECT_EQ(titles().back(), "Came, Nobody Decodes");
    pressF8();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
}

TEST_F(ChannelPaneKeyTest, ThePaneLivesWhileNothingComes)
{
    launchAndConnect();
    refreshWithData();
    pressF8();
    wait(14s);
    EXPECT_THAT(rowNamed(topPane(), "Last Message"), testing::EndsWith("14 s ago"));
    loseService();
    wait(4s); // the model finds out, and then the pane
    EXPECT_EQ(rowNamed(topPane(), "State"), "State: no service");
}

TEST_F(ChannelPaneKeyTest, TheOptionsRowIsThereFromTheStartAndStays)
{
    VentrikAppOptions options;
    options.channelPane = true;
    options.animation = false;
    VentrikApp other(fake.platform(), options);
    other.applicationDidFinishLaunching();
    auto& root = static_cast<VentrikPaneController&>(*other.navController()->screens().front());
    EXPECT_EQ(rowNamed(root, "Channel"), "Channel");
    pressF8In(other);
    EXPECT_EQ(other.navController()->screens().size(), 2U);
    pressF8In(other);
    EXPECT_EQ(other.navController()->screens().size(), 1U);
    EXPECT_EQ(rowNamed(root, "Channel"), "Channel");
    other.applicationWillTerminate();
}

TEST_F(ChannelPaneKeyTest, TheKeyDoesNothingWhileASnapshotIsSaved)
{
    launchAndConnect();
    refreshWithData();
    app.showSaveView();
    app.toggleChannelPane();
    EXPECT_THAT(titles(), ElementsAre("Ventrik"));
}

TEST_F(ChannelPaneKeyTest, TheKeyDoesNothingBeforeLaunchAndAfterTheEnd)
{
    app.toggleChannelPane();
    launchAndConnect();
    app.applicationWillTerminate();
    app.toggleChannelPane();
    EXPECT_EQ(app.topLevelNodes(), nullptr);
}

} // namespace ventrik
