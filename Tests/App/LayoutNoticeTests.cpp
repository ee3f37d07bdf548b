#include "App/VentrikPaneController.h"
#include "Tests/App/TestScreen.h"

#include <QLabel>
#include <QScrollBar>
#include <QTest>

#include <gtest/gtest.h>

#include <map>

namespace ventrik
{

namespace
{

const std::string first = "0xB17F version 7: layout not known, values may be wrong";
const std::string second = "0xB179 of 96 bytes: layout not known, values may be wrong";

/// Panes of a list with a hundred rows, about whose layouts something may be said.
class LayoutNoticeTest : public testing::Test, public VentrikPaneHost
{
  protected:
    LayoutNoticeTest()
    {
        VentrikModelNode::Children rows;
        for (int i = 0; i < 100; ++i)
            rows.push_back(
                inner(std::to_string(i), {VentrikModelLeafNode::initWithName("Level", "-90 dBm")}));
        list = inner("Cells", std::move(rows));
        root = inner("Ventrik", {list});
    }

    bool allowSaveButton() const override { return false; }
    void showSaveView() override {}
    bool tintsChanges() const override { return false; }
    ModelNodePointer topLevelNodes() override { return root; }
    ModelNodePointer nodeAtPath(const std::string& path) override
    {
        return path == "/Cells" ? list : list->childNodes()->front();
    }
    StatusNote statusNote() const override { return {"no service"}; }
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override
    {
        return path == "/" ? std::vector<std::string>() : warnings;
    }

    void openList(int width = 390)
    {
        stack = std::make_unique<NavigationStack>(
            VentrikPaneController::initWithNode(*this, root, "/"));
        stack->setAnimationEnabled(false);
        showAt(*stack, width, 640);
        clickFirstRow();
    }
    void clickFirstRow() const
    {
        QTest::mouseClick(top().table().rowAt({0, 0}), Qt::LeftButton, {}, {60, 25});
        QCoreApplication::processEvents();
    }
    void reloadWith(std::vector<std::string> lines)
    {
        warnings = std::move(lines);
        for (Screen* screen : stack->screens())
            screen->reload();
        QCoreApplication::processEvents();
    }
    VentrikPaneController& top() const
    {
        return static_cast<VentrikPaneController&>(stack->topScreen());
    }
    QScrollBar& bar() const { return *top().table().verticalScrollBar(); }
    std::string notice() const { return top().notice().toStdString(); }
    // Where the row is on the screen.
    int rowTop(int row) const
    {
        return top().table().rowAt({0, row})->mapTo(&top(), QPoint(0, 0)).y();
    }

    static ModelNodePointer inner(std::string name, VentrikModelNode::Children children)
    {
        return VentrikModelTreeNode::initWithName(std::move(name), std::move(children));
    }

    ModelNodePointer list;
    ModelNodePointer root;
    std::vector<std::string> warnings;
    std::unique_ptr<NavigationStack> stack;
};

class LayoutNoticeAtWidthTest : public LayoutNoticeTest, public testing::WithParamInterface<int>
{
  protected:
    QLabel& label() const
    {
        for (auto* found : top().findChildren<QLabel*>(Qt::FindDirectChildrenOnly))
            if (found->text().toStdString() == notice())
                return *found;
        throw std::logic_error("no label has the notice");
    }
};

} // namespace

TEST_F(LayoutNoticeTest, APaneAndThosePanesBelowItSayAtOnceWhichLayoutsAreNotKnown)
{
    warnings = {first};
    openList();
    EXPECT_EQ(notice(), first);
    clickFirstRow();
    EXPECT_EQ(top().title(), "0");
    EXPECT_EQ(notice(), first);
}

TEST_F(LayoutNoticeTest, ThePaneOfAllSectionsSaysNothing)
{
    warnings = {first};
    openList();
    QTest::keyClick(&top().table(), Qt::Key_Escape);
    EXPECT_EQ(notice(), "");
}

TEST_F(LayoutNoticeTest, WithoutANoticeTheRowsBeginAtTheTop)
{
    openList();
    EXPECT_EQ(notice(), "");
    EXPECT_EQ(rowTop(0), 0);
}

TEST_F(LayoutNoticeTest, ANoticeComesAndGoesWithTheReload)
{
    openList();
    warnings = {first};
    EXPECT_EQ(notice(), "");
    reloadWith({first, second});
    EXPECT_EQ(notice(), first + "\n" + second);
    EXPECT_GT(rowTop(0), 0);
    reloadWith({});
    EXPECT_EQ(notice(), "");
    EXPECT_EQ(rowTop(0), 0);
}

TEST_F(LayoutNoticeTest, APaneThatIsCoveredHasItsNoticeWhenItIsBack)
{
    openList();
    clickFirstRow();
    reloadWith({first});
    QTest::keyClick(&top().table(), Qt::Key_Escape);
    QCoreApplication::processEvents();
    EXPECT_EQ(top().title(), "Cells");
    EXPECT_EQ(notice(), first);
    EXPECT_GT(rowTop(0), 0);
}

TEST_F(LayoutNoticeTest, RowsThatAreScrolledStayWhereTheyAreOnTheScreen)
{
    openList();
    bar().setValue(1030);
    const int before = rowTop(25);
    reloadWith({first});
    EXPECT_EQ(rowTop(25), before);
    reloadWith({});
    EXPECT_EQ(rowTop(25), before);
    EXPECT_EQ(bar().value(), 1030);
}

TEST_F(LayoutNoticeTest, TheLastRowStaysAtTheBottom)
{
    openList();
    bar().setValue(bar().maximum());
    const int before = rowTop(99);
    reloadWith({first, second});
    EXPECT_EQ(rowTop(99), before);
    EXPECT_EQ(bar().value(), bar().maximum());
    reloadWith({});
    EXPECT_EQ(rowTop(99), before);
}

TEST_F(LayoutNoticeTest, AReloadWithTheSameNoticeMovesNothing)
{
    openList();
    reloadWith({first});
    bar().setValue(77);
    reloadWith({first});
    EXPECT_EQ(bar().value(), 77);
}

TEST_F(LayoutNoticeTest, StatusAndNoteKeepTheirPlaceAndTexts)
{
    openList(840);
    top().setStatus("Updated", false);
    QCoreApplication::processEvents();
    const auto label = [this] { return dynamic_cast<StatusLabel*>(top().toolbar().items().at(1)); };
    const QRect before = label()->geometry();
    reloadWith({first, second, "and 3 more"});
    EXPECT_EQ(label()->geometry(), before);
    EXPECT_EQ(label()->text(), "Updated");
    EXPECT_EQ(label()->note(), "no service");
}

TEST_P(LayoutNoticeAtWidthTest, ANoticeIsWholeAtEveryWidthAndLeavesTheWindowAsItIs)
{
    warnings = {first, second, "and 3 more"};
    openList(GetParam());
    EXPECT_EQ(stack->width(), GetParam());
    EXPECT_EQ(label().geometry().topLeft(), QPoint(0, 0));
    EXPECT_EQ(label().width(), GetParam());
    const QMargins margins = label().contentsMargins();
    const int room = GetParam() - margins.left() - margins.right();
    EXPECT_EQ(label().height() - margins.top() - margins.bottom(),
              label()
                  .fontMetrics()
                  .boundingRect(QRect(0, 0, room, 1000), Qt::TextWordWrap, label().text())
                  .height());
    EXPECT_EQ(rowTop(0), label().height());
    EXPECT_EQ(label().textFormat(), Qt::PlainText);
}

INSTANTIATE_TEST_SUITE_P(NarrowAndWide, LayoutNoticeAtWidthTest, testing::Values(320, 390, 840));

} // namespace ventrik
