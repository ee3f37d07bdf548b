#include "App/Lists/EventsModel.h"
#include "App/Lists/EventsView.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Tests/Support/IdleGenerator.h"

#include <QApplication>
#include <QClipboard>
#include <QListView>
#include <QScrollBar>
#include <QtTest>

#include <ctime>

#include <fmt/format.h>
#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// Events of a phone that goes from cell to cell, one a second from 06:10:28 UTC on.
class EventsViewTest : public testing::Test
{
  protected:
    EventsViewTest()
    {
        qputenv("TZ", "UTC");
        tzset();
        store.useGenerator(&generator, "lte");
        view.setOnEvent([this](const Event& event) { opened.push_back(event.text); });
        view.resize(450, 300);
        view.show();
        QCoreApplication::processEvents();
    }

    /// The next so many cells; the very first event tells the technology.
    void goOn(int cells)
    {
        for (int i = 0; i < cells; ++i) {
            state.set(StateKey::display,
                      PlistDictionary{
                          {"Serving Cell Info",
                           PlistDictionary{{"Physical Cell ID", fmt::format("{}", _cell++)}}}});
            store.messageTaken(time, {}, state);
            time += 1s;
        }
        log.update();
        view.setEvents(log);
        QCoreApplication::processEvents();
    }

    std::string textAt(int row) { return view.model().eventAt(row).text; }
    QPoint middleOf(int row) { return view.list().visualRect(view.model().index(row, 0)).center(); }
    /// The text of the row at the top, and how far of it is out of view.
    std::pair<std::string, int> atTop()
    {
        const QModelIndex index = view.list().indexAt({1, 1});
        return {textAt(index.row()), view.list().visualRect(index).top()};
    }
    void press(Qt::Key key) { QTest::keyClick(&view.list(), key); }

    std::vector<std::string> opened;
    IdleGenerator generator;
    ChangeStore store{RecordsMode::Base};
    EventLog log{store};
    PlistDictionary state;
    Clock::TimePoint time = FixedClock().now();
    EventsView view;

  private:
    int _cell = 0;
};

} // namespace

TEST_F(EventsViewTest, ShowsTheNewestEventOnTop)
{
    goOn(3);
    ASSERT_EQ(view.model().rowCount(), 3);
    EXPECT_EQ(textAt(0), "PCI 1 → 2");
    EXPECT_EQ(textAt(1), "PCI 0 → 1");
    EXPECT_EQ(textAt(2), "LTE");
}

TEST_F(EventsViewTest, TellsTimeKindAndText)
{
    goOn(2);
    EXPECT_EQ(view.model().index(0, 0).data().toString().toStdString(),
              "06:10:29  Cell  PCI 0 → 1");
    EXPECT_EQ(view.model().index(0, 0).data(Qt::AccessibleTextRole).toString().toStdString(),
              "Cell, PCI 0 → 1, 06:10:29");
    EXPECT_EQ(view.list().accessibleName(), "Events");
}

TEST_F(EventsViewTest, CallsBackWithTheEventThatIsClicked)
{
    goOn(4);
    QTest::mouseClick(view.list().viewport(), Qt::LeftButton, {}, middleOf(1));
    EXPECT_THAT(opened, ElementsAre("PCI 1 → 2"));
}

TEST_F(EventsViewTest, WalksByArrowsAndCallsBackByEnter)
{
    goOn(4);
    view.list().setCurrentIndex(view.model().index(0, 0));
    press(Qt::Key_Down);
    EXPECT_THAT(opened, IsEmpty());
    press(Qt::Key_Return);
    press(Qt::Key_Down);
    press(Qt::Key_Enter);
    EXPECT_THAT(opened, ElementsAre("PCI 1 → 2", "PCI 0 → 1"));
}

TEST_F(EventsViewTest, ShowsNewEventsAtOnceWhereTheTopIsInView)
{
    goOn(50);
    goOn(3);
    EXPECT_EQ(view.list().verticalScrollBar()->value(), 0);
    EXPECT_EQ(atTop().first, "PCI 51 → 52");
}

TEST_F(EventsViewTest, KeepsWhatOneReadsInItsPlaceWhenNewEventsCome)
{
    goOn(50);
    view.list().verticalScrollBar()->setValue(517);
    const auto before = atTop();
    ASSERT_NE(before.second, 0);
    goOn(7);
    EXPECT_EQ(atTop(), before);
    EXPECT_EQ(view.list().verticalScrollBar()->value(), 517 + 7 * 50);
}

TEST_F(EventsViewTest, KeepsTheSelectionAtItsEvent)
{
    goOn(5);
    view.list().setCurrentIndex(view.model().index(1, 0));
    goOn(2);
    EXPECT_EQ(view.list().currentIndex().row(), 3);
    EXPECT_EQ(textAt(3), "PCI 2 → 3");
}

TEST_F(EventsViewTest, DropsWhatTheLogDrops)
{
    goOn(static_cast<int>(EventLog::mostEvents));
    ASSERT_EQ(view.model().rowCount(), static_cast<int>(EventLog::mostEvents));
    EXPECT_EQ(textAt(view.model().rowCount() - 1), "LTE");
    goOn(2);
    EXPECT_EQ(view.model().rowCount(), static_cast<int>(EventLog::mostEvents));
    EXPECT_EQ(textAt(view.model().rowCount() - 1), "PCI 1 → 2");
    EXPECT_EQ(textAt(0), "PCI 10000 → 10001");
}

TEST_F(EventsViewTest, ShowsAnotherLogAnew)
{
    goOn(5);
    ChangeStore other(RecordsMode::Base);
    other.channelChanged(time, true, "");
    EventLog otherLog(other);
    otherLog.update();
    view.setEvents(otherLog);
    ASSERT_EQ(view.model().rowCount(), 1);
    EXPECT_EQ(textAt(0), "Opened");
}

TEST_F(EventsViewTest, BringsIntoViewWhatHappenedUntilTheMomentThatIsShown)
{
    goOn(60);
    const auto moment = view.model().eventAt(40).time + 500ms;
    view.setMoment(moment);
    EXPECT_TRUE(view.list().viewport()->rect().contains(middleOf(40)));
    view.setMoment(std::nullopt);
    EXPECT_EQ(atTop(), std::pair(textAt(0), 0));
}

TEST_F(EventsViewTest, WhatOneReadsStaysWhileTheMomentIsTheSame)
{
    goOn(60);
    const auto moment = view.model().eventAt(40).time;
    view.setMoment(moment);
    view.list().scrollToTop();
    view.setMoment(moment);
    EXPECT_EQ(atTop().first, textAt(0));
}

TEST_F(EventsViewTest, WhatHappenedLaterIsFainter)
{
    goOn(3);
    const auto darkest = [this](int row) {
        const QImage image = view.list()
                                 .viewport()
                                 ->grab(view.list().visualRect(view.model().index(row, 0)))
                                 .toImage();
        int lightness = 255;
        for (int y = 0; y < image.height(); ++y)
            for (int x = 0; x < image.width(); ++x)
                lightness = std::min(lightness, image.pixelColor(x, y).lightness());
        return lightness;
    };
    view.setMoment(view.model().eventAt(1).time);
    EXPECT_GT(darkest(0), darkest(1) + 30);
    view.setMoment(view.model().eventAt(0).time);
    EXPECT_EQ(darkest(0), darkest(1));
}

TEST_F(EventsViewTest, ShowsAnEventOnOneLineWhereThereIsRoom)
{
    goOn(2);
    EXPECT_EQ(view.list().visualRect(view.model().index(0, 0)).height(), 50);
    view.resize(800, 300);
    QCoreApplication::processEvents();
    EXPECT_EQ(view.list().visualRect(view.model().index(0, 0)).height(), 36);
}

TEST_F(EventsViewTest, KeepsTheTopmostRowWhereAnotherWidthChangesTheHeights)
{
    goOn(50);
    view.list().verticalScrollBar()->setValue(500);
    const std::string top = atTop().first;
    view.resize(800, 300);
    QCoreApplication::processEvents();
    EXPECT_EQ(atTop(), std::pair(top, 0));
}

TEST_F(EventsViewTest, CopiesAnEvent)
{
    goOn(2);
    view.list().setCurrentIndex(view.model().index(0, 0));
    QTest::keySequence(&view.list(), QKeySequence::Copy);
    EXPECT_EQ(QApplication::clipboard()->text().toStdString(), "06:10:29  Cell  PCI 0 → 1");
}

TEST_F(EventsViewTest, IsDrawnInThePaletteOfTheMoment)
{
    goOn(2);
    QPalette dark = view.palette();
    dark.setColor(QPalette::Base, QColor(20, 20, 20));
    dark.setColor(QPalette::Text, Qt::white);
    view.setPalette(dark);
    const QImage image = view.grab().toImage();
    EXPECT_EQ(image.pixelColor(2, 4), QColor(20, 20, 20));
    EXPECT_EQ(image.pixelColor(2, 290), QColor(20, 20, 20)); // below the rows
}

TEST_F(EventsViewTest, SaysThatThereAreNoEventsYet)
{
    const QImage image = view.grab().toImage();
    const QRgb base = view.palette().color(QPalette::Base).rgb();
    bool isBlank = true;
    for (int x = 0; x < image.width(); ++x)
        isBlank = isBlank && image.pixel(x, image.height() / 2) == base;
    EXPECT_FALSE(isBlank);
}

} // namespace ventrik
