#include "App/Toolkit/TableView.h"
#include "Tests/App/TestScreen.h"

#include <QApplication>
#include <QScrollBar>
#include <QTest>

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
    int number = -1;
};

/// A table of 8 rows' height and any number of rows.
class TableViewTest : public testing::Test, public TableViewDataSource
{
  protected:
    int rowsInSection(int) override { return count; }
    std::unique_ptr<TableRow> rowForIndexPath(TableView& asking, IndexPath indexPath) override
    {
        const QString identifier = indexPath.row % 2 == 1 && twoKinds ? "odd" : "plain";
        auto row = asking.dequeueReusableRow(identifier);
        if (!row) {
            row = std::make_unique<NumberedRow>(identifier);
            ++made;
        }
        static_cast<NumberedRow&>(*row).number = indexPath.row;
        return row;
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
    auto* device = QTest::createTouchDevice();
    QWidget* viewport = table.viewport();
    QTest::touchEvent(viewport, device).press(0, {100, 300}, viewport);
    for (int y = 290; y >= 100; y -= 10) {
        QTest::qWait(5); // the scroller works with the speed
        QTest::touchEvent(viewport, device).move(0, {100, y}, viewport);
    }
    QTest::touchEvent(viewport, device).release(0, {100, 100}, viewport);
    EXPECT_TRUE(QTest::qWaitFor([&] { return table.verticalScrollBar()->value() > 100; }));
    EXPECT_THAT(selections, IsEmpty());
}

TEST_F(TableViewTest, ATapSelects)
{
    show(100);
    auto* device = QTest::createTouchDevice();
    QWidget* viewport = table.viewport();
    QTest::touchEvent(viewport, device).press(0, {100, 60}, viewport);
    QTest::touchEvent(viewport, device).release(0, {100, 60}, viewport);
    EXPECT_TRUE(QTest::qWaitFor([&] { return !selections.empty(); }));
    EXPECT_THAT(selections, ElementsAre(1));
}

} // namespace ventrik
