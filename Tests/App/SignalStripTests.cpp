#include "Tests/App/StripFixture.h"

#include <QApplication>
#include <QFile>
#include <QImage>
#include <QNativeGestureEvent>
#include <QTemporaryDir>
#include <QXmlStreamReader>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::DoubleNear;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;

class SignalStripTest : public StripFixture
{
  protected:
    auto near(double second) { return Optional(DoubleNear(second, step())); }
    QColor background() { return strip.grab().toImage().pixelColor(2, 2); }
    void dragBy(int x) { drag({300, 150}, {300 + x, 150}); }
    // Leaves the newest, so that nothing moves by itself.
    void leaveNewest() { dragBy(150); }
    void pinch(QPoint one, QPoint other, QPoint oneTo, QPoint otherTo)
    {
        QTest::touchEvent(&strip, touchScreen()).press(0, one, &strip);
        QTest::touchEvent(&strip, touchScreen()).move(0, one, &strip).press(1, other, &strip);
        QTest::touchEvent(&strip, touchScreen()).move(0, oneTo, &strip).move(1, otherTo, &strip);
        QTest::touchEvent(&strip, touchScreen())
            .release(0, oneTo, &strip)
            .release(1, otherTo, &strip);
    }
    void tap(QPoint place)
    {
        QTest::touchEvent(&strip, touchScreen()).press(0, place, &strip);
        QTest::touchEvent(&strip, touchScreen()).release(0, place, &strip);
    }
};

} // namespace

// What is shown

TEST_F(SignalStripTest, AtFirstTheNewestFiveMinutesShow)
{
    EXPECT_EQ(first(), 900);
    EXPECT_EQ(last(), 1200);
}

TEST_F(SignalStripTest, AsLongAsThereIsLittleAllOfItShowsAndAMinuteAtLeast)
{
    setDataUntil(20);
    EXPECT_EQ(first(), -40);
    EXPECT_EQ(last(), 20);
    setDataUntil(100);
    EXPECT_EQ(first(), 0);
    EXPECT_EQ(last(), 100);
    setDataUntil(400);
    EXPECT_EQ(first(), 100);
}

TEST_F(SignalStripTest, ALengthThatWasChosenStaysThoughMoreComes)
{
    setDataUntil(100);
    wheel({599, 100}, {0, 120});
    const double chosen = length();
    ASSERT_LT(chosen, 100);
    setDataUntil(200);
    EXPECT_NEAR(length(), chosen, 0.01);
}

TEST_F(SignalStripTest, TheNewestIsFollowed)
{
    setDataUntil(1202);
    EXPECT_EQ(first(), 902);
    EXPECT_EQ(last(), 1202);
}

TEST_F(SignalStripTest, TheWheelZoomsAroundThePointer)
{
    leaveNewest();
    const double before = secondAt(200);
    wheel({200, 100}, {0, 240});
    EXPECT_NEAR(length(), 150, 0.01);
    EXPECT_NEAR(secondAt(200), before, 0.01);
    wheel({200, 100}, {0, -240});
    EXPECT_NEAR(length(), 300, 0.01);
}

TEST_F(SignalStripTest, ATurnedWheelMoves)
{
    leaveNewest();
    const double before = first();
    const double way = 60 * step();
    wheel({200, 100}, {120, 0});
    EXPECT_NEAR(first(), before - way, 0.01);
}

TEST_F(SignalStripTest, ADragMovesTheViewAndLeavesTheNewest)
{
    const double way = 100 * step();
    dragBy(100);
    EXPECT_NEAR(last(), 1200 - way, 0.01);
    setDataUntil(1202);
    EXPECT_NEAR(last(), 1200 - way, 0.01);
    EXPECT_FALSE(strip.isFollowing());
    EXPECT_THAT(moments, IsEmpty());
}

TEST_F(SignalStripTest, ADragToTheNewestFollowsAgain)
{
    dragBy(100);
    dragBy(-200);
    EXPECT_EQ(last(), 1200);
    setDataUntil(1210);
    EXPECT_EQ(last(), 1210);
}

TEST_F(SignalStripTest, NothingBeforeTheFirstIsShown)
{
    for (int i = 0; i < 10; ++i)
        dragBy(290);
    EXPECT_EQ(first(), 0);
}

TEST_F(SignalStripTest, ZoomingEndsAtASecond)
{
    for (int i = 0; i < 40; ++i)
        wheel({200, 100}, {0, 120});
    EXPECT_NEAR(length(), 1, 1e-6);
}

TEST_F(SignalStripTest, ZoomingEndsAtAYear)
{
    constexpr double year = 366.0 * 24 * 3600;
    setDataUntil(400 * 24 * 3600);
    for (int i = 0; i < 80; ++i)
        wheel({200, 100}, {0, -120});
    EXPECT_NEAR(length(), year, 1e-3);
    strip.fit();
    EXPECT_NEAR(length(), year, 1e-3);
}

TEST_F(SignalStripTest, ADoubleClickShowsAllAndChoosesNothing)
{
    doubleClick({300, 150});
    EXPECT_EQ(first(), 0);
    EXPECT_EQ(last(), 1200);
    EXPECT_EQ(strip.cursor(), std::nullopt);
    EXPECT_EQ(livesAsked, 1) << "the first click had chosen a moment";
}

TEST_F(SignalStripTest, ADoubleClickLeavesTheCursorWhereItWas)
{
    strip.setCursor(at(1000));
    doubleClick(placeOf(1100));
    EXPECT_THAT(cursor(), Optional(1000));
    EXPECT_EQ(moments.back(), at(1000));
}

TEST_F(SignalStripTest, WhatFitsGrowsWithWhatComes)
{
    strip.fit();
    setDataUntil(1300);
    EXPECT_EQ(first(), 0);
    EXPECT_EQ(last(), 1300);
}

// Cursors

TEST_F(SignalStripTest, AClickChoosesAMoment)
{
    click(1000);
    EXPECT_THAT(cursor(), near(1000));
    ASSERT_EQ(moments.size(), 1U);
    EXPECT_NEAR(seconds(moments[0]), 1000, step());
    EXPECT_EQ(first(), 900);
}

TEST_F(SignalStripTest, AMomentIsOneThatThereIs)
{
    QTest::mouseClick(&strip, Qt::LeftButton, {}, {595, 100});
    EXPECT_THAT(cursor(), Optional(1200));
}

TEST_F(SignalStripTest, ADragNearTheCursorMovesIt)
{
    click(1000);
    drag(placeOf(1000) + QPoint(6, 0), placeOf(1100));
    EXPECT_THAT(cursor(), near(1100));
    EXPECT_NEAR(seconds(moments.back()), 1100, step());
    EXPECT_EQ(first(), 900);
}

TEST_F(SignalStripTest, ADragFartherFromTheCursorMovesTheView)
{
    strip.setCursor(at(1000));
    drag(placeOf(1000) + QPoint(8, 0), placeOf(1100));
    EXPECT_THAT(cursor(), Optional(1000));
    EXPECT_LT(first(), 850);
}

TEST_F(SignalStripTest, AFingerReachesTheCursorFromFarther)
{
    strip.setCursor(at(1000));
    dragFinger(strip, placeOf(1000) + QPoint(14, 0), placeOf(1100));
    EXPECT_THAT(cursor(), near(1100));
}

TEST_F(SignalStripTest, TheMomentShownElsewhereIsNotTold)
{
    strip.setCursor(at(500));
    EXPECT_THAT(moments, IsEmpty());
    EXPECT_LT(first(), 500);
    EXPECT_GT(last(), 500);
}

TEST_F(SignalStripTest, ThePresentIsFollowedAgain)
{
    strip.setCursor(at(500));
    strip.setCursor(std::nullopt);
    EXPECT_EQ(last(), 1200);
    EXPECT_TRUE(strip.isFollowing());
    EXPECT_EQ(livesAsked, 0);
}

TEST_F(SignalStripTest, ToldThePresentAgainTheViewStays)
{
    leaveNewest();
    const double before = first();
    strip.setCursor(std::nullopt);
    EXPECT_EQ(first(), before);
}

TEST_F(SignalStripTest, FollowingDoesNotPushTheCursorOut)
{
    strip.setCursor(at(905));
    setDataUntil(1204);
    EXPECT_EQ(first(), 904);
    setDataUntil(1300);
    EXPECT_EQ(first(), 905);
    EXPECT_FALSE(strip.isFollowing());
}

TEST_F(SignalStripTest, AShiftClickSetsTheSecondCursorAndEscapeTakesIt)
{
    click(1000);
    click(1100, Qt::ShiftModifier);
    EXPECT_THAT(cursor(), near(1000));
    EXPECT_THAT(secondCursor(), near(1100));
    EXPECT_EQ(moments.size(), 1U);
    key(Qt::Key_Escape);
    EXPECT_EQ(strip.secondCursor(), std::nullopt);
    EXPECT_THAT(cursor(), near(1000));
}

TEST_F(SignalStripTest, ADragMovesTheSecondCursor)
{
    click(1000);
    click(1100, Qt::ShiftModifier);
    drag(placeOf(1100), placeOf(1050));
    EXPECT_THAT(secondCursor(), near(1050));
    EXPECT_THAT(cursor(), near(1000));
}

TEST_F(SignalStripTest, EscapeWithoutASecondCursorIsForOthers)
{
    click(1000);
    QKeyEvent escape(QEvent::KeyPress, Qt::Key_Escape, Qt::NoModifier);
    QCoreApplication::sendEvent(&strip, &escape);
    EXPECT_FALSE(escape.isAccepted());
}

// Keys

TEST_F(SignalStripTest, ArrowsGoToThePointsOfAnyLine)
{
    strip.setCursor(at(1000));
    key(Qt::Key_Right);
    EXPECT_THAT(cursor(), Optional(1010));
    key(Qt::Key_Left);
    key(Qt::Key_Left);
    EXPECT_THAT(cursor(), Optional(995)) << "a point of RSRQ";
    key(Qt::Key_Left);
    EXPECT_THAT(cursor(), Optional(990));
    EXPECT_EQ(moments.back(), at(990));
}

TEST_F(SignalStripTest, TheFirstArrowGoesBackFromThePresent)
{
    key(Qt::Key_Left);
    EXPECT_THAT(cursor(), Optional(1190));
}

TEST_F(SignalStripTest, ArrowsStayAtTheEnds)
{
    strip.setCursor(at(0));
    key(Qt::Key_Left);
    EXPECT_THAT(cursor(), Optional(0));
    strip.setCursor(at(1190));
    key(Qt::Key_Right);
    EXPECT_THAT(cursor(), Optional(1190));
}

TEST_F(SignalStripTest, ArrowsBringTheCursorIntoView)
{
    strip.setCursor(at(900));
    key(Qt::Key_Left);
    EXPECT_THAT(cursor(), Optional(890));
    EXPECT_LT(first(), 890);
}

TEST_F(SignalStripTest, ShiftAndArrowsMoveTheSecondCursor)
{
    strip.setCursor(at(1000));
    key(Qt::Key_Right, Qt::ShiftModifier);
    EXPECT_THAT(secondCursor(), Optional(1010));
    key(Qt::Key_Right, Qt::ShiftModifier);
    EXPECT_THAT(secondCursor(), Optional(1020));
    EXPECT_THAT(cursor(), Optional(1000));
    EXPECT_THAT(moments, IsEmpty());
}

TEST_F(SignalStripTest, TheLetterXSetsTheSecondCursorAtTheFirst)
{
    strip.setCursor(at(1000));
    key(Qt::Key_X);
    EXPECT_THAT(secondCursor(), Optional(1000));
}

TEST_F(SignalStripTest, ControlAndArrowsMoveByAQuarter)
{
    key(Qt::Key_Left, Qt::ControlModifier);
    EXPECT_EQ(first(), 825);
    key(Qt::Key_Right, Qt::ControlModifier);
    EXPECT_EQ(first(), 900);
    EXPECT_TRUE(strip.isFollowing());
}

TEST_F(SignalStripTest, PlusAndMinusZoom)
{
    key(Qt::Key_Plus);
    EXPECT_NEAR(length(), 200, 0.01);
    EXPECT_EQ(last(), 1200) << "the newest stays in view";
    key(Qt::Key_Minus);
    EXPECT_NEAR(length(), 300, 0.01);
}

TEST_F(SignalStripTest, PlusZoomsAroundTheCursor)
{
    strip.setCursor(at(1000));
    const double before = strip.xOf(at(1000));
    key(Qt::Key_Plus);
    EXPECT_NEAR(strip.xOf(at(1000)), before, 0.01);
}

TEST_F(SignalStripTest, TheLetterFShowsAllAndHomeTheNewest)
{
    key(Qt::Key_F);
    EXPECT_EQ(first(), 0);
    strip.setCursor(at(500));
    key(Qt::Key_Home);
    EXPECT_EQ(strip.cursor(), std::nullopt);
    EXPECT_EQ(last(), 1200);
    EXPECT_EQ(livesAsked, 1);
}

TEST_F(SignalStripTest, KeysWithAltAreForOthers)
{
    QKeyEvent back(QEvent::KeyPress, Qt::Key_Left, Qt::AltModifier);
    QCoreApplication::sendEvent(&strip, &back);
    EXPECT_FALSE(back.isAccepted());
    EXPECT_EQ(strip.cursor(), std::nullopt);
}

// Fingers

TEST_F(SignalStripTest, AFingerDragsTheView)
{
    dragFinger(strip, {200, 150}, {300, 150});
    EXPECT_LT(last(), 1190);
    EXPECT_THAT(moments, IsEmpty());
}

TEST_F(SignalStripTest, ATapChoosesAMoment)
{
    tap(placeOf(1000));
    EXPECT_THAT(cursor(), near(1000));
}

TEST_F(SignalStripTest, TwoTapsShowAll)
{
    tap(placeOf(1000));
    tap(placeOf(1000));
    EXPECT_EQ(first(), 0);
    EXPECT_EQ(strip.cursor(), std::nullopt);
}

TEST_F(SignalStripTest, TwoFingersZoomAroundTheirMiddle)
{
    leaveNewest();
    const double before = secondAt(250);
    pinch({200, 150}, {300, 150}, {150, 150}, {350, 150});
    EXPECT_NEAR(length(), 150, 1);
    EXPECT_NEAR(secondAt(250), before, 1);
    EXPECT_THAT(moments, IsEmpty());
    EXPECT_EQ(strip.cursor(), std::nullopt);
}

TEST_F(SignalStripTest, AFingerThatComesBackElsewhereDoesNotZoom)
{
    QTest::touchEvent(&strip, touchScreen()).press(0, {200, 150}, &strip);
    QTest::touchEvent(&strip, touchScreen())
        .move(0, {200, 150}, &strip)
        .press(1, {300, 150}, &strip);
    QTest::touchEvent(&strip, touchScreen()).stationary(0).release(1, {300, 150}, &strip);
    const double before = length();
    QTest::touchEvent(&strip, touchScreen()).stationary(0).press(1, {500, 150}, &strip);
    EXPECT_EQ(length(), before);
    QTest::touchEvent(&strip, touchScreen()).stationary(0).move(1, {350, 150}, &strip);
    EXPECT_GT(length(), before);
}

TEST_F(SignalStripTest, ATouchPadPinches)
{
    leaveNewest();
    const QPointF place(250, 150);
    QNativeGestureEvent event(Qt::ZoomNativeGesture, QPointingDevice::primaryPointingDevice(), 2,
                              place, place, strip.mapToGlobal(place), 0.25, {});
    const double before = secondAt(250);
    QCoreApplication::sendEvent(&strip, &event);
    EXPECT_NEAR(length(), 240, 0.01);
    EXPECT_NEAR(secondAt(250), before, 0.01);
}

// Nothing to show

TEST_F(SignalStripTest, WithoutDataNothingCanBeChosen)
{
    strip.setData({});
    QTest::mouseClick(&strip, Qt::LeftButton, {}, {300, 100});
    dragBy(100);
    wheel({300, 100}, {0, 120});
    key(Qt::Key_Left);
    key(Qt::Key_Home);
    EXPECT_EQ(strip.cursor(), std::nullopt);
    EXPECT_THAT(moments, IsEmpty());
    EXPECT_EQ(livesAsked, 0);
    EXPECT_EQ(strip.accessibleDescription(), "Nothing to show yet");
}

// Pictures

TEST_F(SignalStripTest, ColorsFollowThePalette)
{
    EXPECT_GT(background().lightness(), 200);
    QPalette dark;
    dark.setColor(QPalette::Base, QColor(20, 30, 40));
    dark.setColor(QPalette::Text, Qt::white);
    strip.setPalette(dark);
    EXPECT_EQ(background(), QColor(20, 30, 40));
    EXPECT_THAT(strip.svg(), testing::HasSubstr("#7cc4ff")) << "a line for dark grounds";
    strip.setPalette({});
    EXPECT_THAT(strip.svg(), testing::HasSubstr("#0b5394"));
}

TEST_F(SignalStripTest, APictureHasTheStripsSize)
{
    EXPECT_EQ(QImage::fromData(strip.png(), "PNG").size(),
              QSize(600, 300) * strip.devicePixelRatioF());
}

TEST_F(SignalStripTest, SvgIsWellFormedWhateverTheNames)
{
    const std::vector<SeriesPoint> points{point(0, 1200, -90)};
    setLines({{"<&\"", "dBm", points}}, 1200);
    const std::string svg = strip.svg();
    QXmlStreamReader reader(QByteArray::fromStdString(svg));
    while (!reader.atEnd())
        reader.readNext();
    EXPECT_EQ(reader.errorString(), "");
    EXPECT_THAT(svg, testing::HasSubstr(">&lt;&amp;\"</text>"));
    EXPECT_THAT(svg, testing::HasSubstr("width=\"600\" height=\"300\""));
}

} // namespace ventrik
