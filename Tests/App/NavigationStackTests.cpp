#include "Tests/App/TestScreen.h"

#include <QApplication>
#include <QMenu>
#include <QTest>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

class NavigationStackTest : public testing::Test, public NavigationStackDelegate
{
  protected:
    NavigationStackTest() { stack.setAnimationEnabled(false); }

    std::unique_ptr<TestScreen> screen(const QString& title)
    {
        return std::make_unique<TestScreen>(title, events);
    }
    void push(const QString& title) { stack.push(screen(title), true); }
    std::string top() const { return stack.topScreen().title().toStdString(); }
    void willShowScreen(NavigationStack&, Screen& shown, bool animated) override
    {
        events.push_back("will show " + shown.title().toStdString() +
                         (animated ? " animated" : ""));
    }

    Events events;
    NavigationStack stack{screen("Root")};
};

} // namespace

TEST_F(NavigationStackTest, TheRootHasNoWayBack)
{
    showAt(stack, 400, 600);
    EXPECT_EQ(stack.titleBar().title(), "Root");
    EXPECT_FALSE(stack.titleBar().backButton().isVisible());
}

TEST_F(NavigationStackTest, TheRootsFirstAppearanceIsNotToldToTheDelegate)
{
    stack.setDelegate(this);
    showAt(stack, 400, 600);
    EXPECT_THAT(events, ElementsAre("Root appears"));
}

TEST_F(NavigationStackTest, TheRootAppearsOnlyOnceByShowingTheWindow)
{
    showAt(stack, 400, 600);
    stack.hide();
    stack.show();
    EXPECT_THAT(events, ElementsAre("Root appears"));
}

TEST_F(NavigationStackTest, APushTellsBothScreensThenTheDelegate)
{
    stack.setDelegate(this);
    push("Child");
    EXPECT_THAT(events,
                ElementsAre("Root disappears", "Child appears", "will show Child animated"));
}

TEST_F(NavigationStackTest, TheBackButtonCarriesThePreviousTitle)
{
    showAt(stack, 400, 600);
    push("Child");
    EXPECT_EQ(stack.titleBar().title(), "Child");
    EXPECT_TRUE(stack.titleBar().backButton().isVisible());
    EXPECT_EQ(stack.titleBar().backButton().text(), "Root");
}

TEST_F(NavigationStackTest, TheTitleBarFollowsTheScreensTitles)
{
    push("Child");
    stack.topScreen().setTitle("New child");
    stack.screens().front()->setTitle("New root");
    EXPECT_EQ(stack.titleBar().title(), "New child");
    EXPECT_EQ(stack.titleBar().backButton().text(), "New root");
}

TEST_F(NavigationStackTest, AClickOnTheBackButtonPops)
{
    showAt(stack, 400, 600);
    push("Child");
    QTest::mouseClick(&stack.titleBar().backButton(), Qt::LeftButton);
    EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationStackTest, EscapeBackspaceAndAltLeftPop)
{
    showAt(stack, 400, 600);
    for (int i = 0; i < 3; ++i)
        push("Child");
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    EXPECT_EQ(stack.screens().size(), 3U);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Backspace);
    EXPECT_EQ(stack.screens().size(), 2U);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Left);
    EXPECT_EQ(stack.screens().size(), 2U);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Left, Qt::AltModifier);
    EXPECT_EQ(stack.screens().size(), 1U);
}

TEST_F(NavigationStackTest, TheRootIsNeverPopped)
{
    showAt(stack, 400, 600);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    stack.pop(true);
    EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationStackTest, PoppingToAScreenDropsAllAboveIt)
{
    stack.setDelegate(this);
    push("A");
    push("B");
    push("C");
    events.clear();
    stack.popTo(*stack.screens()[1], false);
    EXPECT_EQ(top(), "A");
    EXPECT_THAT(events, ElementsAre("C disappears", "A appears", "will show A"));
    events.clear();
    deletePopped();
    EXPECT_THAT(events, testing::UnorderedElementsAre("B deleted", "C deleted"));
}

TEST_F(NavigationStackTest, PoppingToTheTopOrToAStrangerDoesNothing)
{
    const auto stranger = screen("Stranger");
    push("A");
    events.clear();
    stack.popTo(stack.topScreen(), false);
    stack.popTo(*stranger, false);
    EXPECT_EQ(top(), "A");
    EXPECT_THAT(events, IsEmpty());
}

TEST_F(NavigationStackTest, OnlyTheTopScreenAndItsToolbarAreSeen)
{
    showAt(stack, 400, 600);
    stack.setToolbarHidden(false);
    push("Child");
    const Screen& root = *stack.screens()[0];
    EXPECT_FALSE(root.isVisible());
    EXPECT_FALSE(root.toolbar().isVisible());
    EXPECT_TRUE(stack.topScreen().isVisible());
    EXPECT_TRUE(stack.topScreen().toolbar().isVisible());
}

TEST_F(NavigationStackTest, TheToolbarIsHiddenUntilAScreenAsksForIt)
{
    showAt(stack, 400, 600);
    EXPECT_TRUE(stack.isToolbarHidden());
    stack.setToolbarHidden(false);
    EXPECT_FALSE(stack.isToolbarHidden());
}

TEST_F(NavigationStackTest, APresentedScreenCoversEverything)
{
    showAt(stack, 400, 600);
    const auto sheet = screen("Sheet");
    events.clear();
    stack.present(*sheet, true);
    EXPECT_EQ(stack.presentedScreen(), sheet.get());
    EXPECT_THAT(events, ElementsAre("Sheet appears"));
    EXPECT_EQ(sheet->geometry(), stack.rect());
    EXPECT_TRUE(sheet->isVisible());
    EXPECT_FALSE(stack.topScreen().isVisible());
    EXPECT_FALSE(stack.titleBar().isVisible());
}

TEST_F(NavigationStackTest, ADismissedScreenIsLeftToItsOwner)
{
    showAt(stack, 400, 600);
    const auto sheet = screen("Sheet");
    stack.present(*sheet, true);
    events.clear();
    stack.dismiss(true);
    EXPECT_THAT(events, ElementsAre("Sheet disappears"));
    EXPECT_EQ(stack.presentedScreen(), nullptr);
    EXPECT_EQ(sheet->parentWidget(), nullptr);
    EXPECT_EQ(sheet->navigationStack(), nullptr);
    EXPECT_TRUE(stack.topScreen().isVisible());
    EXPECT_TRUE(stack.topScreen().hasFocus());
}

TEST_F(NavigationStackTest, APresentedScreenThatIsDeletedUncoversTheStack)
{
    showAt(stack, 400, 600);
    auto sheet = screen("Sheet");
    stack.present(*sheet, true);
    sheet.reset();
    EXPECT_EQ(stack.presentedScreen(), nullptr);
    EXPECT_TRUE(stack.topScreen().isVisible());
}

TEST_F(NavigationStackTest, TheKeysForTheWayBackDoNotReachBelowAPresentedScreen)
{
    showAt(stack, 400, 600);
    push("Child");
    const auto sheet = screen("Sheet");
    stack.present(*sheet, true);
    QTest::keyClick(sheet.get(), Qt::Key_Escape);
    QTest::keyClick(sheet.get(), Qt::Key_Backspace);
    EXPECT_EQ(top(), "Child");
}

TEST_F(NavigationStackTest, AChangeBelowAPresentedScreenLeavesItTheKeyboard)
{
    showAt(stack, 400, 600);
    push("Child");
    const auto sheet = screen("Sheet");
    sheet->setFocusPolicy(Qt::StrongFocus);
    stack.present(*sheet, true);
    ASSERT_TRUE(sheet->hasFocus());
    stack.pop(true);
    EXPECT_EQ(top(), "Root");
    EXPECT_TRUE(sheet->hasFocus());
    EXPECT_TRUE(sheet->isVisible());
}

TEST_F(NavigationStackTest, AnAnimatedPresentationEndsWithTheScreenUncovered)
{
    stack.setAnimationEnabled(true);
    showAt(stack, 400, 600);
    const auto children = [this] { return stack.children().size(); };
    const auto before = children();
    const auto sheet = screen("Sheet");
    stack.present(*sheet, true);
    EXPECT_EQ(children(), before + 2); // the sheet and the moving pictures
    EXPECT_TRUE(QTest::qWaitFor([&] { return children() == before + 1; }));
    stack.dismiss(true);
    EXPECT_EQ(children(), before + 1);
    EXPECT_TRUE(QTest::qWaitFor([&] { return children() == before; }));
}

TEST_F(NavigationStackTest, AnAnimatedPushChangesTheStackAtOnceAndItsCoverGoesAway)
{
    stack.setAnimationEnabled(true);
    showAt(stack, 400, 600);
    const auto covers = [this] { return stack.topScreen().parentWidget()->children().size(); };
    const auto before = covers();
    ASSERT_TRUE(stack.canAnimate());
    push("Child");
    EXPECT_EQ(top(), "Child");
    EXPECT_TRUE(stack.topScreen().isVisible());
    EXPECT_EQ(covers(), before + 2); // the child and the moving pictures
    EXPECT_TRUE(QTest::qWaitFor([&] { return covers() == before + 1; }));
}

TEST_F(NavigationStackTest, AnimationsThatInterruptEachOtherLeaveTheRightScreen)
{
    stack.setAnimationEnabled(true);
    showAt(stack, 400, 600);
    push("A");
    push("B");
    stack.pop(true);
    deletePopped();
    EXPECT_EQ(top(), "A");
    EXPECT_TRUE(stack.topScreen().isVisible());
}

TEST_F(NavigationStackTest, ASwipeFromTheLeftEdgePopsOnce)
{
    showAt(stack, 400, 600);
    push("A");
    push("B");
    dragFinger(stack, {5, 300}, {300, 310});
    EXPECT_EQ(top(), "A");
}

TEST_F(NavigationStackTest, ADragOfTheMouseFromTheLeftEdgePopsToo)
{
    showAt(stack, 400, 600);
    push("Child");
    QTest::mousePress(&stack.topScreen(), Qt::LeftButton, {}, {23, 300});
    QTest::mouseMove(&stack.topScreen(), {70, 300});
    EXPECT_EQ(top(), "Child");
    QTest::mouseMove(&stack.topScreen(), {71, 300});
    EXPECT_EQ(top(), "Root");
    QTest::mouseRelease(&stack.topScreen(), Qt::LeftButton, {}, {71, 300});
}

TEST_F(NavigationStackTest, OtherDragsDoNotPop)
{
    showAt(stack, 400, 600);
    push("Child");
    dragFinger(stack, {24, 300}, {300, 300}); // not from the edge
    dragFinger(stack, {5, 100}, {100, 400});  // more down than right
    dragFinger(stack, {5, 300}, {52, 300});   // too short
    dragFinger(stack, {300, 300}, {5, 300});  // the other way
    EXPECT_EQ(top(), "Child");
}

TEST_F(NavigationStackTest, APopTakesTheScreensMenuAlongAndTheEscapeMeantForIt)
{
    showAt(stack, 400, 600);
    push("A");
    push("B");
    auto* menu = new QMenu(&stack.topScreen());
    menu->addAction("Copy");
    menu->popup({10, 10});
    ASSERT_TRUE(menu->isVisible());
    stack.pop(false);
    EXPECT_FALSE(menu->isVisible());
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    EXPECT_EQ(top(), "A");
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationStackTest, APopWithoutAMenuLeavesEscapeItsMeaning)
{
    showAt(stack, 400, 600);
    push("A");
    push("B");
    stack.pop(false);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationStackTest, ASwipeDoesNotReachBelowAPresentedScreen)
{
    showAt(stack, 400, 600);
    push("Child");
    const auto sheet = screen("Sheet");
    stack.present(*sheet, true);
    dragFinger(*sheet, {5, 300}, {300, 300});
    EXPECT_EQ(top(), "Child");
}

} // namespace ventrik
