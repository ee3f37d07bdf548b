#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/ElidingLabel.h"
#include "App/Toolkit/PushButton.h"
#include "App/Toolkit/StatusLabel.h"
#include "App/Toolkit/ToolBar.h"
#include "Tests/App/TestScreen.h"

#include <QPainter>
#include <QPushButton>
#include <QTest>

#include <algorithm>

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

/// A widget of one colour.
class Filled : public QWidget
{
  public:
    explicit Filled(QColor color) : _color(color) {}

  protected:
    void paintEvent(QPaintEvent*) override { QPainter(this).fillRect(rect(), _color); }

  private:
    QColor _color;
};

bool holdsMixture(const QImage& picture)
{
    for (int y = 0; y < picture.height(); ++y)
        for (int x = 0; x < picture.width(); ++x) {
            const QColor color = picture.pixelColor(x, y);
            if (color.red() < 255 && color.blue() < 255)
                return true;
        }
    return false;
}

bool hasTransition(const QWidget& widget)
{
    return std::ranges::any_of(widget.children(), [](const QObject* child) {
        return dynamic_cast<const Transition*>(child) != nullptr;
    });
}

std::vector<ToolBarItem> textAndButton(const QString& text)
{
    auto label = std::make_unique<ElidingLabel>();
    label->setText(text);
    std::vector<ToolBarItem> items;
    items.push_back(ToolBarItem::widget(std::move(label)));
    items.push_back(ToolBarItem::flexibleSpace());
    items.push_back(ToolBarItem::widget(std::make_unique<PushButton>("Save")));
    return items;
}

} // namespace

TEST(Transition, AFadeNeverShowsBothLooksAtOnce)
{
    Filled widget(Qt::blue);
    QPalette palette;
    palette.setColor(QPalette::Window, Qt::white);
    widget.setPalette(palette);
    showAt(widget, 60, 20);
    QPixmap red(60, 20);
    red.fill(Qt::red);
    new Transition(Transition::Kind::Fade, widget, red, widget.grab());
    int steps = 0;
    const auto isOver = [&] {
        EXPECT_FALSE(holdsMixture(widget.grab().toImage()));
        ++steps;
        return !hasTransition(widget);
    };
    EXPECT_TRUE(QTest::qWaitFor(isOver));
    EXPECT_GT(steps, 2);
}

TEST(Transition, AFadeCoversOnlyWhatDiffers)
{
    ToolBar bar;
    bar.setItems(textAndButton("Updated 1"), false);
    showAt(bar, 400, ToolBar::barHeight);
    bar.setItems(textAndButton("Updated 2"), true);
    ASSERT_TRUE(hasTransition(bar));
    for (const QObject* child : bar.children())
        if (const auto* fade = dynamic_cast<const Transition*>(child)) {
            EXPECT_LT(fade->width(), 40);
            EXPECT_LT(fade->geometry().right(), bar.items()[2]->x());
        }
}

TEST(Transition, WhatLooksTheSameIsNotCovered)
{
    ToolBar bar;
    bar.setItems(textAndButton("Updated 1"), false);
    showAt(bar, 400, ToolBar::barHeight);
    bar.setItems(textAndButton("Updated 1"), true);
    deletePopped();
    EXPECT_FALSE(hasTransition(bar));
}

TEST(ToolBar, ALongTextAndAButtonGiveWayInANarrowBar)
{
    ToolBar bar;
    const QString text = "Updated 2026-11-16 at 06:10:28";
    bar.setItems(textAndButton(text), false);
    showAt(bar, 200, ToolBar::barHeight);
    EXPECT_EQ(bar.width(), 200);
    EXPECT_LE(bar.items()[2]->geometry().right(), 200 - 12);
    const auto& label = dynamic_cast<ElidingLabel&>(*bar.items()[0]);
    EXPECT_TRUE(label.isElided());
    EXPECT_EQ(label.toolTip(), text);
    showAt(bar, 600, ToolBar::barHeight);
    EXPECT_FALSE(label.isElided());
    EXPECT_EQ(label.toolTip(), "");
    EXPECT_EQ(label.size(), label.sizeHint());
}

class StatusLabelTest : public testing::Test
{
  protected:
    StatusLabelTest()
    {
        auto made = std::make_unique<StatusLabel>();
        label = made.get();
        label->setText("Connecting...");
        std::vector<ToolBarItem> items;
        items.push_back(ToolBarItem::widget(std::move(made)));
        items.push_back(ToolBarItem::flexibleSpace());
        bar.setItems(std::move(items), false);
    }
    void showBar(int width) { showAt(bar, width, ToolBar::barHeight); }

    ToolBar bar;
    StatusLabel* label;
};

TEST_F(StatusLabelTest, InAVeryNarrowBarTheEndOfTheStatusStays)
{
    const auto rightHalf = [this] {
        const QImage picture = label->grab().toImage();
        return picture.copy(picture.width() / 2, 0, picture.width(), picture.height());
    };
    label->setText("Updated 2026-11-16 at 06:10:28");
    showBar(110);
    ASSERT_TRUE(label->isElided());
    const QImage morning = rightHalf();
    label->setText("Updated 2026-11-16 at 21:10:28");
    EXPECT_NE(rightHalf(), morning);
    label->setText("Different 2026-11-16 at 06:10:28");
    EXPECT_EQ(rightHalf(), morning);
}

TEST_F(StatusLabelTest, ANoteIsASecondLineInAWideBar)
{
    showBar(600);
    const QSize before = label->size();
    label->setNote("last update 14:54:14 · no service", StatusLabel::NoteKind::Lasting);
    QCoreApplication::processEvents();
    EXPECT_TRUE(label->showsNoteBelow());
    EXPECT_GT(label->height(), before.height());
    EXPECT_GT(label->width(), before.width());
    EXPECT_EQ(label->size(), label->sizeHint());
}

TEST_F(StatusLabelTest, ANoteLeavesANarrowBarAsItIs)
{
    showBar(400);
    const QImage before = bar.grab().toImage();
    label->setNote("last update 14:54:14 · no service", StatusLabel::NoteKind::Lasting);
    QCoreApplication::processEvents();
    EXPECT_EQ(bar.grab().toImage(), before);
    EXPECT_EQ(label->toolTip(), "last update 14:54:14 · no service");
    EXPECT_EQ(label->accessibleDescription(), "last update 14:54:14 · no service");
}

TEST_F(StatusLabelTest, ANoteComesAndGoesWithTheWidthOfTheBar)
{
    showBar(400);
    label->setNote("no service", StatusLabel::NoteKind::Lasting);
    showBar(600);
    EXPECT_TRUE(label->showsNoteBelow());
    EXPECT_EQ(label->size(), label->sizeHint());
    showBar(400);
    EXPECT_FALSE(label->showsNoteBelow());
    EXPECT_EQ(label->size(), label->sizeHint());
}

TEST_F(StatusLabelTest, APassingNoteStandsInPlaceOfTheStatusInANarrowBar)
{
    showBar(400);
    const QImage before = bar.grab().toImage();
    label->setNote("Saved to /tmp/a.ventrik", StatusLabel::NoteKind::Passing);
    QCoreApplication::processEvents();
    EXPECT_TRUE(label->showsNoteInstead());
    EXPECT_EQ(label->text(), "Connecting...");
    EXPECT_NE(bar.grab().toImage(), before);
    label->setNote({}, StatusLabel::NoteKind::Lasting);
    QCoreApplication::processEvents();
    EXPECT_EQ(bar.grab().toImage(), before);
}

TEST(ElidingLabel, ItsToolTipIsNoMarkup)
{
    ElidingLabel label;
    label.setText("<b>far too long for that room</b>");
    showAt(label, 30, 20);
    EXPECT_TRUE(label.toolTip().contains("&lt;b&gt;"));
}

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

TEST(PushButton, HasAFrameWhileItHasTheKeyboard)
{
    PushButton button("Go");
    const auto edge = [&button] { return button.grab().toImage().pixelColor(1, 16); };
    const QColor frame = button.palette().color(QPalette::Highlight);
    showAt(button, 80, 32);
    button.clearFocus();
    EXPECT_NE(edge(), frame);
    button.setFocus();
    EXPECT_EQ(edge(), frame);
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
