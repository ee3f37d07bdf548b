#include "App/OriginScreen.h"
#include "App/VentrikCell.h"
#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"

#include <QApplication>
#include <QClipboard>
#include <QHelpEvent>
#include <QLabel>
#include <QPlainTextEdit>
#include <QTest>
#include <QToolTip>

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::StartsWith;

/// The pane of a cell whose identity a record tells, and a name that none does.
class OriginTest : public AppFixture
{
  protected:
    OriginTest()
    {
        fake.resources.add("/res/LTE.plist", "<plist><dict><key>Serving Cell Info</key><dict>"
                                             "<key>Physical Cell ID</key><string>-</string>"
                                             "<key>Name</key><string>of no record</string>"
                                             "</dict></dict></plist>");
        launchAndConnect();
        tell(301);
        openRow(0);
    }

    void tell(std::uint16_t identity)
    {
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0,
                                       PacketBuilder(0xB0C2).u16(14, identity).size(38).build()));
        fake.mainQueue.run();
        wait(2s);
    }
    void wait(std::chrono::seconds time)
    {
        fake.clock.advance(time);
        fake.mainQueue.advance(time);
    }
    void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier)
    {
        EXPECT_TRUE(QTest::qWaitForWindowActive(app.window()));
        QTest::keyClick(app.window()->focusWidget(), key, modifiers);
    }
    OriginScreen& origin() { return dynamic_cast<OriginScreen&>(app.navController()->topScreen()); }
    std::string originText() { return origin().text().toStdString(); }
    VentrikCell& cell(int row)
    {
        return static_cast<VentrikCell&>(*topPane().table().rowAt({0, row}));
    }
    static int darkestOf(QWidget& widget)
    {
        const QImage image = widget.grab().toImage();
        int darkest = 255;
        for (int y = 0; y < image.height(); ++y)
            for (int x = 0; x < image.width(); ++x)
                darkest = std::min(darkest, image.pixelColor(x, y).lightness());
        return darkest;
    }
    static std::string tipOver(QWidget& widget)
    {
        const QPoint place = widget.rect().center();
        QHelpEvent rests(QEvent::ToolTip, place, widget.mapToGlobal(place));
        QCoreApplication::sendEvent(&widget, &rests);
        return rests.isAccepted() ? QToolTip::text().toStdString() : std::string();
    }
};

} // namespace

TEST_F(OriginTest, AKeyOpensWhatTellsWhereTheRowsValueComesFrom)
{
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    EXPECT_EQ(titles().back(), "Origin");
    EXPECT_THAT(originText(),
                StartsWith("Value: 301\nPath: /Serving Cell Info/Physical Cell ID\n"));
    EXPECT_THAT(originText(), HasSubstr("Log Code: 0xB0C2"));
    EXPECT_THAT(originText(), HasSubstr("Raw Number: 301 (0x12D)\n"));
    EXPECT_THAT(originText(), HasSubstr("Place: bytes 14 to 15, little-endian\n"));
    EXPECT_THAT(originText(), HasSubstr("[2D 01]"));
    press(Qt::Key_Escape);
    EXPECT_EQ(titles().back(), "Serving Cell Info");
}

TEST_F(OriginTest, TheBytesOfTheValueAreMarked)
{
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    const auto marks = origin().findChild<QPlainTextEdit*>()->extraSelections();
    ASSERT_EQ(marks.size(), 1);
    EXPECT_EQ(marks[0].cursor.selectedText(), "2D 01");
}

TEST_F(OriginTest, IsBroughtUpToDate)
{
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    tell(302);
    EXPECT_THAT(originText(), StartsWith("Value: 302\n"));
    EXPECT_THAT(originText(), HasSubstr("[2E 01]"));
}

TEST_F(OriginTest, IsThatOfTheMomentWhichIsShown)
{
    press(Qt::Key_Down);
    press(Qt::Key_Space);
    tell(302);
    press(Qt::Key_I, Qt::ControlModifier);
    EXPECT_THAT(originText(), StartsWith("Value: 301\n"));
}

TEST_F(OriginTest, TheKeyDoesNothingWhereNoRecordToldTheValue)
{
    press(Qt::Key_Down);
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    EXPECT_EQ(titles().back(), "Serving Cell Info");
}

TEST_F(OriginTest, TheSpaceBarPausesThereAndHomeReturns)
{
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    press(Qt::Key_Space);
    EXPECT_TRUE(app.showsPast());
    press(Qt::Key_Home);
    EXPECT_FALSE(app.showsPast());
}

TEST_F(OriginTest, WithoutASelectionAllIsCopied)
{
    press(Qt::Key_Down);
    press(Qt::Key_I, Qt::ControlModifier);
    press(Qt::Key_C, Qt::ControlModifier);
    EXPECT_EQ(QGuiApplication::clipboard()->text().toStdString(), originText());
}

TEST_F(OriginTest, ThePointerIsToldInShort)
{
    EXPECT_THAT(tipOver(cell(0)), StartsWith("0xB0C2 "));
    EXPECT_THAT(tipOver(cell(0)), HasSubstr("raw 301 (0x12D), bytes 14 to 15, little-endian"));
    EXPECT_EQ(tipOver(cell(1)), "");
}

TEST_F(OriginTest, AFainterValueFollowsTheColorsOfTheDesktop)
{
    wait(12s);
    QPalette dark = QApplication::palette();
    dark.setColor(QPalette::Base, Qt::black);
    dark.setColor(QPalette::Text, Qt::white);
    cell(0).setPalette(dark);
    EXPECT_GT(cell(0).value()->palette().color(QPalette::Text).lightness(), 200);
}

TEST_F(OriginTest, AValueThatWasNotToldForLongIsFainter)
{
    EXPECT_FALSE(cell(0).isFaint());
    const int usual = darkestOf(*cell(0).value());
    wait(12s);
    EXPECT_TRUE(cell(0).isFaint());
    EXPECT_GT(darkestOf(*cell(0).value()), usual + 40);
    EXPECT_FALSE(cell(1).isFaint()); // nobody tells it
    tell(301);
    EXPECT_FALSE(cell(0).isFaint());
    EXPECT_EQ(darkestOf(*cell(0).value()), usual);
}

} // namespace ventrik
