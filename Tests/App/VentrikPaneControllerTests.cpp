#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/HorizontalScrollView.h"
#include "App/VentrikCell.h"
#include "App/VentrikPaneController.h"
#include "Tests/App/TestScreen.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QLabel>
#include <QPushButton>
#include <QScrollBar>
#include <QTest>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

ModelNodePointer leaf(std::string name, std::string value)
{
    return VentrikModelLeafNode::initWithName(std::move(name), std::move(value));
}

ModelNodePointer inner(std::string name, VentrikModelNode::Children children = {})
{
    return VentrikModelTreeNode::initWithName(std::move(name), std::move(children));
}

class PaneTest : public testing::Test, public VentrikPaneHost
{
  protected:
    ModelNodePointer topLevelNodes() override { return topLevel; }
    ModelNodePointer nodeAtPath(const std::string& path) override
    {
        const auto node = nodes.find(path);
        return node == nodes.end() ? nullptr : node->second;
    }
    bool allowSaveButton() const override { return savesAllowed; }
    void showSaveView() override { ++savePresses; }
    bool tintsChanges() const override { return changesTinted; }
    StatusNote statusNote() const override { return note; }
    std::string_view doubtAt(const std::string& path) const override
    {
        return path == doubtfulPath ? "Wrong" : "";
    }
    std::string reasonForNoData() const override { return noData; }

    void open(ModelNodePointer node, std::string path = "/")
    {
        auto made = VentrikPaneController::initWithNode(*this, std::move(node), std::move(path));
        root = made.get();
        stack = std::make_unique<NavigationStack>(std::move(made));
        stack->setAnimationEnabled(false);
        showAt(*stack, 480, 640);
    }
    VentrikPaneController& top() const
    {
        return static_cast<VentrikPaneController&>(stack->topScreen());
    }
    VentrikCell& cell(int row) const
    {
        return static_cast<VentrikCell&>(*top().table().rowAt({0, row}));
    }
    void click(int row) const { QTest::mouseClick(&cell(row), Qt::LeftButton, {}, {60, 25}); }
    std::string title() const { return top().title().toStdString(); }

    static ActivityIndicator& indicator(const Screen& pane)
    {
        return *dynamic_cast<ActivityIndicator*>(pane.toolbar().items().at(0));
    }
    static QLabel& status(const Screen& pane)
    {
        return *dynamic_cast<QLabel*>(pane.toolbar().items().at(1));
    }

    ModelNodePointer topLevel;
    std::map<std::string, ModelNodePointer> nodes;
    bool savesAllowed = false;
    bool changesTinted = true;
    int savePresses = 0;
    StatusNote note;
    std::string noData = "No service";
    std::string doubtfulPath;
    VentrikPaneController* root = nullptr;
    std::unique_ptr<NavigationStack> stack;
};

} // namespace

TEST_F(PaneTest, WithoutANodeThereAreNoRowsAndTheTitleIsTheProducts)
{
    open(nullptr);
    EXPECT_EQ(title(), "Ventrik");
    EXPECT_TRUE(top().table().visibleRows().empty());
}

TEST_F(PaneTest, WithoutANodeThePaneSaysWhyThereIsNoData)
{
    open(nullptr);
    EXPECT_EQ(top().table().placeholder(), "No service");
    noData = "No data yet";
    root->updateNotes();
    EXPECT_EQ(top().table().placeholder(), "No data yet");
}

TEST_F(PaneTest, TheRootReloadsTheWholeTreeAlsoWhenThereIsNone)
{
    open(inner("Ventrik", {leaf("A", "1")}));
    topLevel = inner("Ventrik", {leaf("A", "1"), leaf("B", "2")});
    EXPECT_TRUE(root->reload());
    EXPECT_EQ(root->rowsInSection(0), 2);
    topLevel = nullptr;
    EXPECT_TRUE(root->reload());
    EXPECT_EQ(root->rowsInSection(0), 0);
}

TEST_F(PaneTest, APaneReloadsTheNodeAtItsPath)
{
    open(inner("Ventrik", {inner("Cell", {leaf("A", "1")})}));
    click(0);
    nodes["/Cell"] = inner("Cell", {leaf("A", "1"), leaf("B", "2")});
    EXPECT_TRUE(top().reload());
    EXPECT_EQ(top().rowsInSection(0), 2);
}

TEST_F(PaneTest, APaneWhoseNodeIsGoneSaysSoAndStaysAsItIs)
{
    open(inner("Ventrik", {inner("Cell", {leaf("A", "1")})}));
    click(0);
    EXPECT_FALSE(top().reload());
    EXPECT_EQ(title(), "Cell");
    EXPECT_EQ(top().rowsInSection(0), 1);
}

TEST_F(PaneTest, AnEmptyListSaysThatItIs)
{
    open(inner("Ventrik", {inner("Empty")}));
    click(0);
    EXPECT_EQ(top().table().placeholder(), "This list is empty");
}

TEST_F(PaneTest, TheNoteOfTheHostStandsBesideTheStatus)
{
    open(nullptr);
    note = {"no\nservice", StatusLabel::NoteKind::Lasting};
    root->setStatus("Connecting...", true);
    auto& label = dynamic_cast<StatusLabel&>(status(*root));
    EXPECT_EQ(label.text(), "Connecting...");
    EXPECT_EQ(label.note(), "no service");
    note.text.clear();
    root->updateNotes();
    EXPECT_EQ(&status(*root), &label);
    EXPECT_EQ(label.note(), "");
}

TEST_F(PaneTest, ALeafAsNodeGivesNoRows)
{
    open(leaf("Ventrik", "(unknown)"));
    EXPECT_TRUE(top().table().visibleRows().empty());
}

TEST_F(PaneTest, ANewPaneIsLoadingWithAnEmptyStatus)
{
    open(nullptr);
    EXPECT_TRUE(indicator(top()).isAnimating());
    EXPECT_EQ(status(top()).text(), "");
}

TEST_F(PaneTest, RowsShowTheChildrenInTheirOrder)
{
    open(inner("Ventrik", {inner("Cell"), leaf("Mode", "Idle [3]")}));
    EXPECT_EQ(title(), "Ventrik");
    ASSERT_EQ(top().table().visibleRows().size(), 2U);
    EXPECT_EQ(cell(0).key().text(), "Cell");
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::DisclosureIndicator);
    EXPECT_EQ(cell(0).value(), nullptr);
    EXPECT_EQ(cell(1).key().text(), "Mode");
    EXPECT_EQ(cell(1).accessory(), TableRowAccessory::None);
    EXPECT_EQ(cell(1).value()->text(), "Idle [3]");
    EXPECT_EQ(cell(1).reuseIdentifier(), "VentrikPaneControllerCell");
}

TEST_F(PaneTest, AppearingShowsTheToolbar)
{
    open(nullptr);
    EXPECT_FALSE(stack->isToolbarHidden());
}

TEST_F(PaneTest, TheStatusStandsBesideTheIndicator)
{
    open(nullptr);
    root->setStatus("Connecting", true);
    EXPECT_TRUE(indicator(*root).isAnimating());
    EXPECT_TRUE(QTest::qWaitFor([&] { return indicator(*root).isTurning(); }));
    EXPECT_EQ(status(*root).text(), "Connecting");
    EXPECT_EQ(status(*root).font().pixelSize(), 14);
    EXPECT_EQ(status(*root).size(), status(*root).sizeHint());
    root->setStatus("Updated", false);
    EXPECT_FALSE(indicator(*root).isAnimating());
    EXPECT_EQ(status(*root).text(), "Updated");
}

TEST_F(PaneTest, EveryStatusChangeAndReloadBuildsTheToolbarAnew)
{
    open(nullptr);
    const auto* first = root->toolbar().items()[0];
    root->setStatus("Updated", false);
    const auto* second = root->toolbar().items()[0];
    root->reloadWithNode(nullptr);
    const auto* third = root->toolbar().items()[0];
    EXPECT_NE(first, second);
    EXPECT_NE(second, third);
    EXPECT_EQ(status(*root).text(), "Updated");
}

TEST_F(PaneTest, TheSaveButtonIsThereOnlyWhereItIsAllowed)
{
    open(nullptr);
    EXPECT_EQ(root->toolbar().items().size(), 3U);
    savesAllowed = true;
    root->createToolbarItems();
    const auto& items = root->toolbar().items();
    ASSERT_EQ(items.size(), 4U);
    EXPECT_EQ(items[2], nullptr);
    auto* save = dynamic_cast<QPushButton*>(items[3]);
    ASSERT_NE(save, nullptr);
    EXPECT_EQ(save->text(), "Save");
    QTest::mouseClick(save, Qt::LeftButton);
    EXPECT_EQ(savePresses, 1);
}

TEST_F(PaneTest, ATouchOnALeafOnlyRemovesTheHighlight)
{
    open(inner("Ventrik", {leaf("Mode", "Idle")}));
    QTest::mousePress(&cell(0), Qt::LeftButton, {}, {60, 25});
    EXPECT_TRUE(cell(0).isSelected());
    QTest::mouseRelease(&cell(0), Qt::LeftButton, {}, {60, 25});
    EXPECT_FALSE(cell(0).isSelected());
    EXPECT_EQ(stack->screens().size(), 1U);
}

TEST_F(PaneTest, AClickOnTheLabelsOfALeafReachesItsRow)
{
    open(inner("Ventrik", {leaf("Mode", "Idle")}));
    QTest::mousePress(cell(0).value(), Qt::LeftButton);
    EXPECT_TRUE(cell(0).isSelected());
    QTest::mouseRelease(cell(0).value(), Qt::LeftButton);
    EXPECT_FALSE(cell(0).isSelected());
}

TEST_F(PaneTest, ATouchOnAnInnerRowOpensItsPane)
{
    open(inner("Ventrik", {inner("Cell", {leaf("RSSI", "-70 dBm")})}));
    root->setStatus("Updated now", false);
    click(0);
    ASSERT_EQ(stack->screens().size(), 2U);
    EXPECT_EQ(title(), "Cell");
    EXPECT_EQ(top().path(), "/Cell");
    EXPECT_EQ(cell(0).key().text(), "RSSI");
    EXPECT_EQ(status(top()).text(), "Updated now");
    EXPECT_FALSE(indicator(top()).isAnimating());
}

TEST_F(PaneTest, EnterOpensAPaneAsATouchDoes)
{
    open(inner("Ventrik", {leaf("Mode", "Idle"), inner("Cell")}));
    for (const Qt::Key key : {Qt::Key_Down, Qt::Key_Down, Qt::Key_Return})
        QTest::keyClick(&top().table(), key);
    EXPECT_EQ(title(), "Cell");
}

TEST_F(PaneTest, PathsJoinTheNamesOnTheWay)
{
    open(inner("Ventrik", {inner("Cells", {inner("0", {inner("a/b")})})}));
    click(0);
    click(0);
    click(0);
    EXPECT_EQ(top().path(), "/Cells/0/a/b");
}

TEST_F(PaneTest, AnInnerNodeWithoutChildrenOpensAnEmptyPane)
{
    open(inner("Ventrik", {inner("Empty")}));
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::DisclosureIndicator);
    click(0);
    EXPECT_EQ(title(), "Empty");
    EXPECT_TRUE(top().table().visibleRows().empty());
}

TEST_F(PaneTest, ComingBackTakesTheSelectionAway)
{
    open(inner("Ventrik", {inner("Cell")}));
    click(0);
    EXPECT_TRUE(root->table().indexPathForSelectedRow().has_value());
    QTest::keyClick(&top().table(), Qt::Key_Escape);
    EXPECT_FALSE(root->table().indexPathForSelectedRow().has_value());
}

TEST_F(PaneTest, SelectingNoIndexPathDoesNothing)
{
    open(inner("Ventrik", {inner("Cell")}));
    root->rowSelected(root->table(), std::nullopt);
    EXPECT_EQ(stack->screens().size(), 1U);
}

TEST_F(PaneTest, AReloadShowsTheNewNodeAndItsTitle)
{
    open(nullptr);
    root->reloadWithNode(inner("Other", {leaf("Mode", "Idle")}));
    EXPECT_EQ(title(), "Other");
    EXPECT_EQ(cell(0).value()->text(), "Idle");
    root->reloadWithNode(nullptr);
    EXPECT_EQ(title(), "Ventrik");
    EXPECT_TRUE(top().table().visibleRows().empty());
}

TEST_F(PaneTest, AReloadOfAnUnchangedPaneKeepsValuesInMixedRows)
{
    const auto node = inner("Ventrik", {inner("A"), leaf("B", "1"), inner("C"), leaf("D", "2")});
    open(node);
    root->reloadWithNode(node);
    EXPECT_EQ(cell(1).value()->text(), "1");
    EXPECT_EQ(cell(3).value()->text(), "2");
    EXPECT_EQ(cell(0).value(), nullptr);
}

TEST_F(PaneTest, ALeafInARowFirstMadeForAnInnerNodeShowsNoValue)
{
    open(inner("Ventrik", {inner("A")}));
    root->reloadWithNode(inner("Ventrik", {leaf("B", "1")}));
    EXPECT_EQ(cell(0).key().text(), "B");
    EXPECT_EQ(cell(0).value(), nullptr);
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::None);
}

TEST_F(PaneTest, AnInnerNodeInARowFirstMadeForALeafShowsNoOldValue)
{
    open(inner("Ventrik", {leaf("B", "1")}));
    root->reloadWithNode(inner("Ventrik", {inner("A")}));
    EXPECT_EQ(cell(0).key().text(), "A");
    EXPECT_EQ(cell(0).value()->text(), "");
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::DisclosureIndicator);
}

TEST_F(PaneTest, ADoubtfulLeafIsMarkedByItsPath)
{
    doubtfulPath = "/Cell/a/b";
    open(inner("Ventrik", {inner("Cell", {leaf("a/b", "1"), leaf("c", "2")}), leaf("a/b", "3")}));
    EXPECT_EQ(cell(1).accessory(), TableRowAccessory::None);
    click(0);
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::Warning);
    EXPECT_EQ(cell(1).accessory(), TableRowAccessory::None);
}

TEST_F(PaneTest, AnInnerNodeInARowOfADoubtfulLeafIsNotInDoubt)
{
    doubtfulPath = "/B";
    open(inner("Ventrik", {leaf("B", "1")}));
    ASSERT_TRUE(cell(0).isInDoubt());
    root->reloadWithNode(inner("Ventrik", {inner("B")}));
    EXPECT_FALSE(cell(0).isInDoubt());
    EXPECT_EQ(cell(0).toolTip(), "");
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::DisclosureIndicator);
}

TEST_F(PaneTest, ADoubtfulLeafInARowWithoutAValueHasNoSign)
{
    doubtfulPath = "/B";
    open(inner("Ventrik", {inner("A")}));
    root->reloadWithNode(inner("Ventrik", {leaf("B", "1")}));
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::None);
}

TEST_F(PaneTest, ALongValueIsScrolledSidewaysByADragAndStaysSoOverAReload)
{
    const auto node = inner("Ventrik", {leaf("Mode", std::string(200, 'x'))});
    open(node);
    QTest::mousePress(cell(0).view(), Qt::LeftButton, {}, {300, 25});
    QTest::mouseMove(cell(0).view(), {100, 25});
    QTest::mouseRelease(cell(0).view(), Qt::LeftButton, {}, {100, 25});
    EXPECT_EQ(cell(0).view()->contentOffset(), 200);
    root->reloadWithNode(node);
    EXPECT_EQ(cell(0).view()->contentOffset(), 200);
}

TEST_F(PaneTest, AnUprightTouchDragOverLongValuesScrollsTheTable)
{
    VentrikModelNode::Children leaves;
    for (int i = 0; i < 40; ++i)
        leaves.push_back(leaf(std::to_string(i), std::string(200, 'x')));
    open(inner("Ventrik", std::move(leaves)));
    dragFinger(*root->table().viewport(), {200, 400}, {200, 100});
    const QScrollBar& bar = *root->table().verticalScrollBar();
    EXPECT_TRUE(QTest::qWaitFor([&] { return bar.value() > 100; }));
}

TEST_F(PaneTest, ASidewaysTouchDragScrollsTheLongValue)
{
    open(inner("Ventrik", {leaf("Mode", std::string(200, 'x'))}));
    HorizontalScrollView* view = cell(0).view();
    dragFinger(*view, {400, 25}, {100, 25});
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->contentOffset() > 100; }));
}

TEST_F(PaneTest, DisappearingGivesUpTheKeyboardFocus)
{
    open(inner("Ventrik", {inner("Cell")}));
    ASSERT_TRUE(root->table().hasFocus());
    root->viewWillDisappear(false);
    EXPECT_FALSE(root->table().hasFocus());
}

TEST_F(PaneTest, AnOpenedPaneHasTheKeyboardFocus)
{
    open(inner("Ventrik", {inner("Cell")}));
    click(0);
    EXPECT_TRUE(top().table().hasFocus());
}

TEST_F(PaneTest, ControlSPressesSaveWhereItIsAllowed)
{
    open(nullptr);
    QTest::keySequence(&root->table(), QKeySequence::Save);
    savesAllowed = true;
    root->createToolbarItems();
    QCoreApplication::processEvents();
    QTest::keySequence(&root->table(), QKeySequence::Save);
    EXPECT_TRUE(QTest::qWaitFor([this] { return savePresses == 1; }));
}

TEST_F(PaneTest, AReloadDuringAPressOfSaveDoesNotLoseThePress)
{
    savesAllowed = true;
    open(nullptr);
    QWidget* save = root->toolbar().items().at(3);
    QTest::mousePress(save, Qt::LeftButton);
    root->reloadWithNode(inner("Ventrik"));
    root->setStatus("Updated", false);
    QTest::mouseRelease(save, Qt::LeftButton);
    EXPECT_EQ(savePresses, 1);
    EXPECT_EQ(status(*root).text(), "Updated");
}

TEST_F(PaneTest, AReloadLeavesTheKeyboardWhereItIs)
{
    savesAllowed = true;
    open(inner("Ventrik", {leaf("A", "1")}));
    ASSERT_TRUE(root->table().hasFocus());
    root->reloadWithNode(inner("Ventrik", {leaf("A", "2")}));
    EXPECT_TRUE(root->table().hasFocus());
    QCoreApplication::processEvents();
    root->toolbar().items().at(3)->setFocus();
    ASSERT_TRUE(root->toolbar().items().at(3)->hasFocus());
    root->reloadWithNode(inner("Ventrik", {leaf("A", "3")}));
    EXPECT_TRUE(root->toolbar().items().at(3)->hasFocus());
}

TEST_F(PaneTest, CopyingARowGivesNameAndValue)
{
    open(inner("Ventrik", {leaf("Mode", "Idle [3]"), inner("Cell")}));
    QTest::keyClick(&root->table(), Qt::Key_Down);
    QTest::keySequence(&root->table(), QKeySequence::Copy);
    EXPECT_EQ(QGuiApplication::clipboard()->text(), "Mode: Idle [3]");
    QTest::keyClick(&root->table(), Qt::Key_Down);
    QTest::keySequence(&root->table(), QKeySequence::Copy);
    EXPECT_EQ(QGuiApplication::clipboard()->text(), "Cell");
}

TEST_F(PaneTest, TheCurrentRowKeepsItsNameWhenARowIsAddedAboveIt)
{
    open(inner("Ventrik", {leaf("A", "1"), leaf("B", "2")}));
    QTest::keyClick(&root->table(), Qt::Key_End);
    root->reloadWithNode(inner("Ventrik", {leaf("New", "0"), leaf("A", "1"), leaf("B", "2")}));
    EXPECT_EQ(root->table().indexPathForCurrentRow(), (IndexPath{0, 2}));
    EXPECT_TRUE(cell(2).hasKeyboardFrame());
}

TEST_F(PaneTest, AValueThatHasChangedIsTinted)
{
    open(inner("Ventrik", {leaf("A", "1"), leaf("B", "2")}));
    EXPECT_FALSE(cell(0).isTinted());
    root->reloadWithNode(inner("Ventrik", {leaf("A", "1"), leaf("B", "3")}));
    EXPECT_FALSE(cell(0).isTinted());
    EXPECT_TRUE(cell(1).isTinted());
}

TEST_F(PaneTest, AValueThatHasOnlyMovedIsNotTinted)
{
    open(inner("Ventrik", {leaf("A", "1"), leaf("B", "2")}));
    root->reloadWithNode(inner("Ventrik", {leaf("New", "0"), leaf("A", "1"), leaf("B", "2")}));
    for (const int row : {0, 1, 2})
        EXPECT_FALSE(cell(row).isTinted()) << row;
}

TEST_F(PaneTest, NothingIsTintedWhereThatIsSwitchedOff)
{
    changesTinted = false;
    open(inner("Ventrik", {leaf("A", "1")}));
    root->reloadWithNode(inner("Ventrik", {leaf("A", "2")}));
    EXPECT_FALSE(cell(0).isTinted());
}

TEST_F(PaneTest, AMovedLongValueKeepsItsPlaceWhileItsRowIsAwayAndLendsItToNone)
{
    VentrikModelNode::Children leaves;
    for (int i = 0; i < 100; ++i)
        leaves.push_back(leaf(std::to_string(i), std::string(200, 'x')));
    open(inner("Ventrik", leaves));
    cell(0).view()->setContentOffset(150);
    QScrollBar& bar = *root->table().verticalScrollBar();
    for (int value = 0; value < bar.maximum(); value += 300) {
        bar.setValue(value);
        for (int row = 1; row < 100; ++row) {
            if (root->table().rowAt({0, row})) {
                ASSERT_EQ(cell(row).view()->contentOffset(), 0) << row;
            }
        }
    }
    bar.setValue(0);
    EXPECT_EQ(cell(0).view()->contentOffset(), 150);
}

TEST_F(PaneTest, AMovedLongValueGoesAlongWithItsRow)
{
    const auto mode = leaf("Mode", std::string(200, 'x'));
    open(inner("Ventrik", {mode}));
    cell(0).view()->setContentOffset(150);
    root->reloadWithNode(inner("Ventrik", {leaf("New", std::string(200, 'y')), mode}));
    EXPECT_EQ(cell(0).view()->contentOffset(), 0);
    EXPECT_EQ(cell(1).view()->contentOffset(), 150);
}

TEST_F(PaneTest, TheArrowKeysMoveALongValueSideways)
{
    open(inner("Ventrik", {leaf("Mode", std::string(200, 'x'))}));
    for (const Qt::Key key : {Qt::Key_Down, Qt::Key_Right, Qt::Key_Right})
        QTest::keyClick(&root->table(), key);
    EXPECT_EQ(cell(0).view()->contentOffset(), 80);
}

TEST_F(PaneTest, ASwipeFromTheLeftEdgeOverRowsGoesBack)
{
    open(inner("Ventrik", {inner("Cell", {leaf("Mode", std::string(200, 'x'))})}));
    click(0);
    ASSERT_EQ(title(), "Cell");
    dragFinger(*stack, {5, 75}, {300, 80});
    EXPECT_EQ(title(), "Ventrik");
}

TEST_F(PaneTest, ADragFromTheLeftEdgeOnAMovedValueMovesItBack)
{
    open(inner("Ventrik", {inner("Cell", {leaf("Mode", std::string(200, 'x'))})}));
    click(0);
    cell(0).view()->setContentOffset(300);
    QTest::mousePress(cell(0).view(), Qt::LeftButton, {}, {5, 25});
    QTest::mouseMove(cell(0).view(), {105, 25});
    EXPECT_EQ(cell(0).view()->contentOffset(), 200);
    QTest::mouseMove(cell(0).view(), {455, 25});
    QTest::mouseRelease(cell(0).view(), Qt::LeftButton, {}, {455, 25});
    EXPECT_EQ(title(), "Cell");
    EXPECT_EQ(cell(0).view()->contentOffset(), 0);
}

TEST_F(PaneTest, ADragFromTheLeftEdgeOnAValueThatIsAtItsPlaceGoesBack)
{
    open(inner("Ventrik", {inner("Cell", {leaf("Mode", std::string(200, 'x'))})}));
    click(0);
    QTest::mousePress(cell(0).view(), Qt::LeftButton, {}, {5, 25});
    QTest::mouseMove(cell(0).view(), {105, 25});
    EXPECT_EQ(title(), "Ventrik");
    QTest::mouseRelease(root, Qt::LeftButton, {}, {105, 25});
}

TEST_F(PaneTest, ADoubleClickOpensOneLevel)
{
    open(inner("Ventrik", {inner("Cells", {inner("0", {inner("More")})})}));
    const QPoint place = cell(0).mapTo(stack.get(), QPoint(60, 25));
    QTest::mouseDClick(stack->windowHandle(), Qt::LeftButton, {}, place);
    EXPECT_EQ(title(), "Cells");
}

TEST_F(PaneTest, OfTenThousandRowsOnlyThoseInViewExistBeforeAndAfterAReload)
{
    const auto numbered = [](const std::string& value) {
        VentrikModelNode::Children leaves;
        for (int i = 0; i < 10'000; ++i)
            leaves.push_back(leaf(std::to_string(i), value));
        return inner("Ventrik", std::move(leaves));
    };
    open(numbered("before"));
    QTest::keyClick(&root->table(), Qt::Key_End);
    const auto rows = root->table().visibleRows();
    EXPECT_LT(rows.size(), 15U);
    EXPECT_EQ(cell(9'999).key().text(), "9999");
    root->reloadWithNode(numbered("after"));
    EXPECT_EQ(root->table().visibleRows(), rows);
    EXPECT_EQ(cell(9'999).value()->text(), "after");
}

} // namespace ventrik
