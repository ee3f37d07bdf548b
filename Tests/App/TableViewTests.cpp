#include "App/Toolkit/TableView.h"
#include "App/Toolkit/ThinScrollBar.h"
#include "Tests/App/TestScreen.h"

#include <QAccessible>
#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QMenu>
#include <QScrollBar>
#include <QTest>
#include <QWheelEvent>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

/// Rows that know what they were last made for.
class NumberedRow : public TableRow
{
  public:
    explicit NumberedRow(const QString& identifier) : TableRow(Style::Default, identifier) {}
    bool scrollSideways(int steps) override
    {
        sidewaysSteps += steps;
        return true;
    }
    int number = -1;
    int sidewaysSteps = 0;
};

/// A table of 8 rows' height and any number of rows.
class TableViewTest : public testing::Test, public TableViewDataSource
{
  protected:
    int rowsInSection(int) override { return count; }
    std::unique_ptr<TableRow> rowForIndexPath(TableView& asking, IndexPath indexPath) override
    {
        const QString identifier = indexPath.row % 2 == 1 && twoKinds ? "odd" : "plain";
        ++asked;
        auto row = asking.dequeueReusableRow(identifier);
        if (!row) {
            row = std::make_unique<NumberedRow>(identifier);
            ++made;
        }
        static_cast<NumberedRow&>(*row).number = indexPath.row;
        return row;
    }
    QString textForCopying(IndexPath indexPath) override
    {
        return QString("row %1").arg(indexPath.row);
    }
    void rowSelected(TableView&, std::optional<IndexPath> indexPath) override
    {
        selections.push_back(indexPath->row);
    }

    void show(int rows)
    {
        count = rows;
        showAt(table, 300, 8 * 50);
        table.reloadData();
    }
    void reloadWith(int rows)
    {
        count = rows;
        table.reloadData();
    }
    int numberAt(int row) const
    {
        const TableRow* widget = table.rowAt({0, row});
        return widget ? static_cast<const NumberedRow*>(widget)->number : -1;
    }
    // Reloads after a row was added above the others.
    void reloadWithOneAbove()
    {
        ++count;
        table.reloadData([](int row) { return row + 1; });
    }
    static QString clipboard() { return QGuiApplication::clipboard()->text(); }
    void openContextMenu(QPoint position)
    {
        QContextMenuEvent event(QContextMenuEvent::Mouse, position,
                                table.viewport()->mapToGlobal(position));
        QCoreApplication::sendEvent(table.viewport(), &event);
    }
    QMenu* contextMenu() const { return table.findChild<QMenu*>(); }
    void click(int y) { QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, {20, y}); }
    void key(Qt::Key pressed) { QTest::keyClick(&table, pressed); }
    std::optional<int> framedRow() const
    {
        for (int row = 0; row < count; ++row)
            if (table.rowAt({0, row}) && table.rowAt({0, row})->hasKeyboardFrame())
                return row;
        return std::nullopt;
    }

    int count = 0;
    int made = 0;
    int asked = 0;
    bool twoKinds = false;
    std::vector<int> selections;
    TableView table{*this};
};

} // namespace

TEST_F(TableViewTest, AnEmptyTableHasNoRows)
{
    show(0);
    EXPECT_THAT(table.visibleRows(), IsEmpty());
    click(10);
    key(Qt::Key_Down);
    key(Qt::Key_Return);
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, RowsAreFiftyHighAndAsWideAsTheTable)
{
    show(3);
    EXPECT_EQ(table.rowAt({0, 0})->geometry(), QRect(0, 0, 300, 50));
    EXPECT_EQ(table.rowAt({0, 2})->geometry(), QRect(0, 100, 300, 50));
}

TEST_F(TableViewTest, TenThousandRowsMakeOnlyThoseInView)
{
    show(10'000);
    EXPECT_EQ(table.visibleRows().size(), 8U);
    EXPECT_EQ(made, 8);
}

TEST_F(TableViewTest, ScrollingThroughAllReusesTheRowsThatLeft)
{
    show(10'000);
    QScrollBar& bar = *table.verticalScrollBar();
    for (int value = 0; value <= bar.maximum(); value += 70)
        bar.setValue(value);
    bar.setValue(bar.maximum());
    EXPECT_EQ(numberAt(9'999), 9'999);
    EXPECT_EQ(made, 9); // 8 heights show a part of 9 rows
}

TEST_F(TableViewTest, TheScrollRangeIsTheHeightThatDoesNotFit)
{
    show(20);
    EXPECT_EQ(table.verticalScrollBar()->maximum(), 20 * 50 - 8 * 50);
    reloadWith(8);
    EXPECT_EQ(table.verticalScrollBar()->maximum(), 0);
}

TEST_F(TableViewTest, AReloadGivesEveryRowItsOwnFormerRow)
{
    show(6);
    const auto before = table.visibleRows();
    table.reloadData();
    EXPECT_EQ(table.visibleRows(), before);
}

TEST_F(TableViewTest, AReloadAfterScrollingGivesEveryRowItsOwnFormerRow)
{
    show(100);
    for (const int value : {130, 2'015, 780})
        table.verticalScrollBar()->setValue(value);
    const auto before = table.visibleRows();
    table.reloadData();
    EXPECT_EQ(table.visibleRows(), before);
}

TEST_F(TableViewTest, AReloadOfTwoKindsOfRowsKeepsThemToo)
{
    twoKinds = true;
    show(7);
    const auto before = table.visibleRows();
    table.reloadData();
    EXPECT_EQ(table.visibleRows(), before);
    EXPECT_EQ(made, 7);
}

TEST_F(TableViewTest, AnAddedRowLeavesTheOthersTheirOwn)
{
    show(3);
    const auto before = table.visibleRows();
    reloadWith(4);
    auto after = table.visibleRows();
    ASSERT_EQ(after.size(), 4U);
    after.pop_back();
    EXPECT_EQ(after, before);
}

TEST_F(TableViewTest, RowsThatAreNotNeededAreHiddenAndUsedAgain)
{
    show(5);
    const auto before = table.visibleRows();
    reloadWith(2);
    EXPECT_FALSE(before[4]->isVisible());
    reloadWith(5);
    EXPECT_EQ(table.visibleRows(), before);
    EXPECT_TRUE(before[4]->isVisible());
    EXPECT_EQ(made, 5);
}

TEST_F(TableViewTest, AReloadKeepsTheScrollPosition)
{
    show(100);
    table.verticalScrollBar()->setValue(1'234);
    table.reloadData();
    EXPECT_EQ(table.verticalScrollBar()->value(), 1'234);
}

TEST_F(TableViewTest, TheScrollBarTakesLittleOfTheWidth)
{
    show(8);
    EXPECT_EQ(table.viewport()->width(), 300);
    show(9);
    QCoreApplication::processEvents(); // the bar comes with the next layout
    EXPECT_EQ(table.viewport()->width(), 300 - ThinScrollBar::width);
}

TEST_F(TableViewTest, TheScrollBarFollowsThePalette)
{
    show(100);
    const auto colorAtTheEnd = [this] {
        const QImage picture = table.grab().toImage();
        return picture.pixelColor(picture.width() - 4, picture.height() - 4);
    };
    QPalette palette = table.palette();
    for (const QColor& base : {QColor(255, 255, 255), QColor(30, 30, 30)}) {
        palette.setColor(QPalette::Base, base);
        table.setPalette(palette);
        EXPECT_EQ(colorAtTheEnd(), base);
    }
}

TEST_F(TableViewTest, AShrunkenTableScrollsBackToItsEnd)
{
    show(100);
    table.verticalScrollBar()->setValue(4'000);
    reloadWith(10);
    EXPECT_EQ(table.verticalScrollBar()->value(), 10 * 50 - 8 * 50);
    EXPECT_EQ(numberAt(9), 9);
}

TEST_F(TableViewTest, ATallerWindowShowsMoreRows)
{
    show(100);
    table.resize(300, 20 * 50);
    EXPECT_EQ(table.visibleRows().size(), 20U);
}

TEST_F(TableViewTest, AClickSelectsTheRowUnderIt)
{
    show(100);
    table.verticalScrollBar()->setValue(75);
    click(80); // 155 from the top of the content
    EXPECT_THAT(selections, ElementsAre(3));
    EXPECT_EQ(table.indexPathForSelectedRow(), (IndexPath{0, 3}));
    EXPECT_TRUE(table.rowAt({0, 3})->isSelected());
}

TEST_F(TableViewTest, AClickBelowTheLastRowSelectsNothing)
{
    show(2);
    click(120);
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, APressedRowIsHighlightedUntilItIsADrag)
{
    show(5);
    QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {20, 60});
    EXPECT_TRUE(table.rowAt({0, 1})->isSelected());
    QTest::mouseMove(table.viewport(), {20, 90});
    EXPECT_FALSE(table.rowAt({0, 1})->isSelected());
    QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {20, 60});
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, OtherButtonsSelectNothing)
{
    show(5);
    QTest::mouseClick(table.viewport(), Qt::RightButton, {}, {20, 60});
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, DeselectingTakesTheHighlightAway)
{
    show(5);
    click(60);
    table.deselectRow({0, 1});
    EXPECT_FALSE(table.indexPathForSelectedRow());
    EXPECT_FALSE(table.rowAt({0, 1})->isSelected());
}

TEST_F(TableViewTest, ASelectionSurvivesAReloadUnlessItsRowIsGone)
{
    show(5);
    click(160);
    table.reloadData();
    EXPECT_TRUE(table.rowAt({0, 3})->isSelected());
    reloadWith(2);
    EXPECT_FALSE(table.indexPathForSelectedRow());
}

TEST_F(TableViewTest, TheArrowKeysWalkAndEnterSelects)
{
    show(5);
    for (const Qt::Key pressed : {Qt::Key_Down, Qt::Key_Down, Qt::Key_Down, Qt::Key_Up})
        key(pressed);
    EXPECT_EQ(framedRow(), 1);
    EXPECT_THAT(selections, IsEmpty());
    key(Qt::Key_Return);
    EXPECT_THAT(selections, ElementsAre(1));
}

TEST_F(TableViewTest, TheArrowKeysStopAtTheEnds)
{
    show(2);
    for (int i = 0; i < 5; ++i)
        key(Qt::Key_Down);
    EXPECT_EQ(framedRow(), 1);
    for (int i = 0; i < 5; ++i)
        key(Qt::Key_Up);
    EXPECT_EQ(framedRow(), 0);
}

TEST_F(TableViewTest, EndAndHomeGoToTheLastAndTheFirstRow)
{
    show(100);
    key(Qt::Key_End);
    EXPECT_EQ(framedRow(), 99);
    EXPECT_EQ(table.verticalScrollBar()->value(), table.verticalScrollBar()->maximum());
    key(Qt::Key_Home);
    EXPECT_EQ(framedRow(), 0);
    EXPECT_EQ(table.verticalScrollBar()->value(), 0);
}

TEST_F(TableViewTest, PageKeysGoAsFarAsIsInView)
{
    show(100);
    key(Qt::Key_PageDown);
    EXPECT_EQ(framedRow(), 8);
    key(Qt::Key_PageDown);
    EXPECT_EQ(framedRow(), 16);
    key(Qt::Key_PageUp);
    EXPECT_EQ(framedRow(), 8);
}

TEST_F(TableViewTest, EnterWithoutAPlaceSelectsNothing)
{
    show(5);
    key(Qt::Key_Enter);
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, ATouchDragScrolls)
{
    show(100);
    dragFinger(*table.viewport(), {100, 300}, {100, 100});
    EXPECT_TRUE(QTest::qWaitFor([&] { return table.verticalScrollBar()->value() > 100; }));
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, ATapSelects)
{
    show(100);
    QWidget* viewport = table.viewport();
    QTest::touchEvent(viewport, touchScreen()).press(0, {100, 60}, viewport);
    QTest::touchEvent(viewport, touchScreen()).release(0, {100, 60}, viewport);
    EXPECT_TRUE(QTest::qWaitFor([&] { return !selections.empty(); }));
    EXPECT_THAT(selections, ElementsAre(1));
}

TEST_F(TableViewTest, AReloadOfTenThousandRowsAsksForThoseInViewOnly)
{
    show(10'000);
    asked = 0;
    table.reloadData();
    EXPECT_EQ(asked, 8);
    EXPECT_EQ(made, 8);
}

TEST_F(TableViewTest, WithoutADataSourceItIsEmpty)
{
    TableView empty;
    showAt(empty, 300, 100);
    empty.reloadData();
    EXPECT_EQ(empty.contentHeight(), 0);
    EXPECT_THAT(empty.visibleRows(), IsEmpty());
}

TEST_F(TableViewTest, TheContentIsAsHighAsAllItsRows)
{
    show(20);
    EXPECT_EQ(table.contentHeight(), 1'000);
}

TEST_F(TableViewTest, SelectionAndCurrentRowGoAlongWithARowThatMoves)
{
    show(5);
    click(160);
    reloadWithOneAbove();
    EXPECT_EQ(table.indexPathForSelectedRow(), (IndexPath{0, 4}));
    EXPECT_EQ(table.indexPathForCurrentRow(), (IndexPath{0, 4}));
    EXPECT_TRUE(table.rowAt({0, 4})->isSelected());
    EXPECT_FALSE(table.rowAt({0, 3})->isSelected());
}

TEST_F(TableViewTest, ASelectedRowThatIsGoneIsNoLongerSelected)
{
    show(5);
    click(160);
    table.reloadData([](int) { return std::nullopt; });
    EXPECT_FALSE(table.indexPathForSelectedRow());
    EXPECT_EQ(table.indexPathForCurrentRow(), (IndexPath{0, 3}));
}

TEST_F(TableViewTest, AScrolledTableFollowsItsTopmostRow)
{
    show(100);
    table.verticalScrollBar()->setValue(1'234);
    reloadWithOneAbove();
    EXPECT_EQ(table.verticalScrollBar()->value(), 1'284);
}

TEST_F(TableViewTest, ATableAtItsTopShowsARowThatIsAddedThere)
{
    show(100);
    reloadWithOneAbove();
    EXPECT_EQ(table.verticalScrollBar()->value(), 0);
}

TEST_F(TableViewTest, AReloadUnderThePressedButtonLeavesTheRowToTheClick)
{
    show(5);
    QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {20, 60});
    table.reloadData();
    EXPECT_TRUE(table.rowAt({0, 1})->isSelected());
    QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {20, 60});
    EXPECT_THAT(selections, ElementsAre(1));
}

TEST_F(TableViewTest, ARowThatMovesAwayFromUnderThePressedButtonIsNotSelected)
{
    show(5);
    QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {20, 60});
    reloadWithOneAbove();
    QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {20, 60});
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, AReloadUnderTheFingerDoesNotEndTheTap)
{
    show(100);
    QWidget* viewport = table.viewport();
    QTest::touchEvent(viewport, touchScreen()).press(0, {100, 160}, viewport);
    table.reloadData();
    QTest::touchEvent(viewport, touchScreen()).release(0, {100, 160}, viewport);
    EXPECT_TRUE(QTest::qWaitFor([&] { return !selections.empty(); }));
    EXPECT_THAT(selections, ElementsAre(3));
}

TEST_F(TableViewTest, TheWheelScrolls)
{
    show(100);
    QWheelEvent event({20, 20}, table.mapToGlobal(QPointF(20, 20)), {}, {0, -120}, Qt::NoButton, {},
                      Qt::NoScrollPhase, false);
    QCoreApplication::sendEvent(table.viewport(), &event);
    EXPECT_GT(table.verticalScrollBar()->value(), 0);
}

TEST_F(TableViewTest, LeftAndRightMoveTheCurrentRowSideways)
{
    show(5);
    key(Qt::Key_Down);
    for (const Qt::Key pressed : {Qt::Key_Right, Qt::Key_Right, Qt::Key_Right, Qt::Key_Left})
        key(pressed);
    EXPECT_EQ(static_cast<NumberedRow*>(table.rowAt({0, 0}))->sidewaysSteps, 2);
    EXPECT_EQ(static_cast<NumberedRow*>(table.rowAt({0, 1}))->sidewaysSteps, 0);
}

TEST_F(TableViewTest, CopyTakesTheCurrentRow)
{
    show(5);
    QGuiApplication::clipboard()->setText("before");
    QTest::keySequence(&table, QKeySequence::Copy);
    EXPECT_EQ(clipboard(), "before");
    click(160);
    QTest::keySequence(&table, QKeySequence::Copy);
    EXPECT_EQ(clipboard(), "row 3");
}

TEST_F(TableViewTest, TheContextMenuCopiesTheRowUnderThePointerAndLeavesItsLook)
{
    show(5);
    openContextMenu({20, 110});
    ASSERT_NE(contextMenu(), nullptr);
    EXPECT_FALSE(table.rowAt({0, 2})->isSelected());
    EXPECT_FALSE(table.rowAt({0, 2})->hasKeyboardFrame());
    ASSERT_EQ(contextMenu()->actions().size(), 1);
    contextMenu()->actions().front()->trigger();
    EXPECT_EQ(clipboard(), "row 2");
    EXPECT_THAT(selections, IsEmpty());
    contextMenu()->close();
}

TEST_F(TableViewTest, BelowTheLastRowThereIsNoContextMenu)
{
    show(2);
    openContextMenu({20, 150});
    EXPECT_EQ(contextMenu(), nullptr);
}

TEST_F(TableViewTest, IsAListOfItemsToAssistiveTechnology)
{
    show(3);
    table.rowAt({0, 1})->setAccessibleName("Cell");
    table.rowAt({0, 1})->setAccessory(TableRowAccessory::DisclosureIndicator);
    QAccessibleInterface* list = QAccessible::queryAccessibleInterface(&table);
    ASSERT_EQ(list->role(), QAccessible::List);
    ASSERT_EQ(list->childCount(), 3);
    EXPECT_EQ(list->child(3), nullptr);
    QAccessibleInterface* item = list->child(1);
    EXPECT_EQ(item->role(), QAccessible::ListItem);
    EXPECT_EQ(item->text(QAccessible::Name), "Cell");
    EXPECT_EQ(item->text(QAccessible::Description), "opens a list");
    EXPECT_EQ(item->parent(), list);
    EXPECT_EQ(list->indexOfChild(item), 1);
    EXPECT_EQ(list->child(0)->text(QAccessible::Description), "");
}

TEST_F(TableViewTest, TellsAssistiveTechnologyWhichRowIsSelectedAndWhichHasTheKeyboard)
{
    show(3);
    click(60);
    key(Qt::Key_Down);
    const auto state = [this](int row) {
        return QAccessible::queryAccessibleInterface(table.rowAt({0, row}))->state();
    };
    EXPECT_TRUE(state(1).selected);
    EXPECT_FALSE(state(1).focused);
    EXPECT_FALSE(state(2).selected);
    EXPECT_TRUE(state(2).focused);
}

TEST_F(TableViewTest, TheSecondOfTwoQuickTapsBelongsToTheFirst)
{
    show(5);
    QWidget* viewport = table.viewport();
    for (int i = 0; i < 2; ++i) {
        QTest::touchEvent(viewport, touchScreen()).press(0, {100, 210}, viewport);
        QTest::touchEvent(viewport, touchScreen()).release(0, {100, 210}, viewport);
    }
    QTest::touchEvent(viewport, touchScreen()).press(0, {100, 60}, viewport);
    QTest::touchEvent(viewport, touchScreen()).release(0, {100, 60}, viewport);
    EXPECT_TRUE(QTest::qWaitFor([this] { return selections.size() >= 2; }));
    EXPECT_THAT(selections, ElementsAre(4, 1));
}

TEST_F(TableViewTest, TheTabKeyShowsWhereTheKeyboardIs)
{
    show(5);
    table.clearFocus();
    table.setFocus(Qt::MouseFocusReason);
    EXPECT_EQ(framedRow(), std::nullopt);
    table.clearFocus();
    table.setFocus(Qt::TabFocusReason);
    EXPECT_EQ(framedRow(), 0);
}

TEST_F(TableViewTest, TheTabKeyShowsTheKeyboardOnAnEmptyTableToo)
{
    show(0);
    table.clearFocus();
    const QImage without = table.grab().toImage();
    table.setFocus(Qt::TabFocusReason);
    EXPECT_NE(table.grab().toImage(), without);
}

TEST_F(TableViewTest, AnEmptyTableSaysWhyInItsMiddle)
{
    show(0);
    const QImage blank = table.grab().toImage();
    table.setPlaceholder("no data yet");
    const QImage worded = table.grab().toImage();
    EXPECT_NE(worded.copy(0, 150, 300, 100), blank.copy(0, 150, 300, 100));
    EXPECT_EQ(worded.copy(0, 0, 300, 150), blank.copy(0, 0, 300, 150));
    EXPECT_EQ(table.accessibleDescription(), "no data yet");
}

TEST_F(TableViewTest, ATableWithRowsDoesNotSayWhyItIsEmpty)
{
    show(2);
    const QImage before = table.grab().toImage();
    table.setPlaceholder("no data yet");
    EXPECT_EQ(table.grab().toImage(), before);
}

} // namespace ventrik
