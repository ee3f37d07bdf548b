#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/ToolBar.h"
#include "Tests/App/TestScreen.h"

#include <QPushButton>
#include <QTest>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

std::vector<ToolBarItem> buttonAtTheRight(std::unique_ptr<QPushButton> button)
{
    std::vector<ToolBarItem> items;
    items.push_back(ToolBarItem::flexibleSpace());
    items.push_back(ToolBarItem::widget(std::move(button)));
    return items;
}

} // namespace

TEST(ToolBar, AFlexibleSpacePushesTheRestToTheRight)
{
    ToolBar bar;
    bar.setItems(buttonAtTheRight(std::make_unique<QPushButton>("Go")), false);
    showAt(bar, 500, ToolBar::barHeight);
    ASSERT_EQ(bar.items().size(), 2U);
    EXPECT_EQ(bar.items()[0], nullptr);
    EXPECT_EQ(bar.items()[1]->geometry().right(), 500 - 12 - 1);
}

TEST(ToolBar, ItemsMayBeReplacedByTheClickOfOneOfThem)
{
    ToolBar bar;
    auto button = std::make_unique<QPushButton>("Go");
    QPushButton* pressed = button.get();
    QObject::connect(pressed, &QPushButton::clicked, [&bar] { bar.setItems({}, true); });
    bar.setItems(buttonAtTheRight(std::move(button)), false);
    showAt(bar, 500, ToolBar::barHeight);
    QTest::mouseClick(pressed, Qt::LeftButton);
    EXPECT_TRUE(bar.items().empty());
}

TEST(ActivityIndicator, IsHiddenWhileItIsStopped)
{
    QWidget window;
    ActivityIndicator indicator(&window);
    indicator.startAnimating();
    EXPECT_FALSE(indicator.isHidden());
    indicator.stopAnimating();
    EXPECT_TRUE(indicator.isHidden());
}

TEST(ActivityIndicator, IsNoWindowOnItsOwn)
{
    ActivityIndicator indicator;
    indicator.startAnimating();
    EXPECT_FALSE(indicator.isVisible());
}

TEST(ActivityIndicator, TurnsInABarThatIsOnTheScreen)
{
    ToolBar bar;
    showAt(bar, 500, ToolBar::barHeight);
    auto indicator = std::make_unique<ActivityIndicator>();
    const ActivityIndicator& turning = *indicator;
    indicator->startAnimating();
    std::vector<ToolBarItem> items;
    items.push_back(ToolBarItem::widget(std::move(indicator)));
    items.push_back(ToolBarItem::flexibleSpace());
    bar.setItems(std::move(items), false);
    EXPECT_TRUE(QTest::qWaitFor([&] { return turning.isTurning(); }));
    EXPECT_EQ(turning.x(), 12);
}

TEST(ActivityIndicator, TurnsOnlyWhileItIsSeen)
{
    QWidget window;
    auto* indicator = new ActivityIndicator(&window);
    indicator->startAnimating();
    EXPECT_FALSE(indicator->isTurning());
    window.show();
    EXPECT_TRUE(indicator->isTurning());
    window.hide();
    EXPECT_FALSE(indicator->isTurning());
    EXPECT_TRUE(indicator->isAnimating());
}

TEST(ToolBar, NewItemsWaitUntilAPressedButtonIsReleased)
{
    ToolBar bar;
    int clicks = 0;
    auto button = std::make_unique<QPushButton>("Go");
    QPushButton* pressed = button.get();
    QObject::connect(pressed, &QPushButton::clicked, [&clicks] { ++clicks; });
    bar.setItems(buttonAtTheRight(std::move(button)), false);
    showAt(bar, 500, ToolBar::barHeight);
    QTest::mousePress(pressed, Qt::LeftButton);
    bar.setItems(buttonAtTheRight(std::make_unique<QPushButton>("First")), false);
    bar.setItems(buttonAtTheRight(std::make_unique<QPushButton>("Second")), false);
    EXPECT_EQ(bar.items()[1], pressed);
    QTest::mouseRelease(pressed, Qt::LeftButton);
    EXPECT_EQ(clicks, 1);
    EXPECT_EQ(dynamic_cast<QPushButton&>(*bar.items()[1]).text(), "Second");
}

TEST(ToolBar, TheKeyboardStaysAtItsPlace)
{
    ToolBar bar;
    bar.setItems(buttonAtTheRight(std::make_unique<QPushButton>("Go")), false);
    showAt(bar, 500, ToolBar::barHeight);
    bar.items()[1]->setFocus();
    bar.setItems(buttonAtTheRight(std::make_unique<QPushButton>("Go")), false);
    EXPECT_TRUE(bar.items()[1]->hasFocus());
}

} // namespace ventrik
