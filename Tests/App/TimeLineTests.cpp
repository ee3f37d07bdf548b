#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"

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

TEST_F(PauseTest, TheStatusTellsOfThePause)
{
    launchAndConnect();
    drive(301);
    press(Qt::Key_Space);
    EXPECT_EQ(statusText(topPane()), "Paused at 06:10:28 · Live");
    drive(302);
    EXPECT_EQ(statusText(topPane()), "Paused at 06:10:28 · Live");
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

} // namespace ventrik
