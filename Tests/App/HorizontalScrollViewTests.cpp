#include "App/Toolkit/HorizontalScrollView.h"
#include "Tests/App/TestScreen.h"

#include <QTest>
#include <QWheelEvent>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

class HorizontalScrollViewTest : public testing::Test
{
  protected:
    HorizontalScrollViewTest()
    {
        showAt(view, 200, 50);
        view.setContentSize({500, 50});
    }
    // True when the view used the turn.
    bool wheel(QPoint delta, Qt::KeyboardModifiers modifiers = {})
    {
        QWheelEvent event({10, 10}, view.mapToGlobal(QPointF(10, 10)), {}, delta, Qt::NoButton,
                          modifiers, Qt::NoScrollPhase, false);
        QCoreApplication::sendEvent(&view, &event);
        return event.isAccepted();
    }

    HorizontalScrollView view;
};

} // namespace

TEST_F(HorizontalScrollViewTest, TheOffsetStaysWithinTheContent)
{
    view.setContentOffset(1'000);
    EXPECT_EQ(view.contentOffset(), 300);
    view.setContentOffset(-5);
    EXPECT_EQ(view.contentOffset(), 0);
}

TEST_F(HorizontalScrollViewTest, SmallerContentScrollsBack)
{
    view.setContentOffset(300);
    view.setContentSize({250, 50});
    EXPECT_EQ(view.contentOffset(), 50);
}

TEST_F(HorizontalScrollViewTest, ASidewaysWheelScrolls)
{
    EXPECT_TRUE(wheel({-120, 0}));
    EXPECT_EQ(view.contentOffset(), 60);
    EXPECT_TRUE(wheel({0, -120}, Qt::ShiftModifier));
    EXPECT_EQ(view.contentOffset(), 120);
}

TEST_F(HorizontalScrollViewTest, AnUprightWheelIsLeftToTheTable)
{
    EXPECT_FALSE(wheel({0, -120}));
    EXPECT_EQ(view.contentOffset(), 0);
}

TEST_F(HorizontalScrollViewTest, ContentThatFitsUsesNoWheel)
{
    view.setContentSize({200, 50});
    EXPECT_FALSE(wheel({-120, 0}));
}

TEST_F(HorizontalScrollViewTest, ADragMovesTheContent)
{
    QTest::mousePress(&view, Qt::LeftButton, {}, {180, 20});
    QTest::mouseMove(&view, {80, 20});
    EXPECT_EQ(view.contentOffset(), 100);
    QTest::mouseRelease(&view, Qt::LeftButton, {}, {80, 20});
    EXPECT_EQ(view.contentOffset(), 100);
}

} // namespace ventrik
