#pragma once

#include "App/Toolkit/NavigationStack.h"

#include <QCoreApplication>
#include <QEvent>
#include <QPointingDevice>
#include <QTest>

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

using Events = std::vector<std::string>;

/// A screen that writes down what it is told.
class TestScreen : public Screen
{
  public:
    TestScreen(const QString& title, Events& events) : _events(events) { setTitle(title); }
    ~TestScreen() override { note("deleted"); }

    void viewWillAppear(bool) override { note("appears"); }
    void viewWillDisappear(bool) override { note("disappears"); }

  private:
    void note(const char* event) { _events.push_back(title().toStdString() + " " + event); }

    Events& _events;
};

/// Shows a widget at a size and waits for its layout.
inline void showAt(QWidget& widget, int width, int height)
{
    widget.resize(width, height);
    widget.show();
    widget.activateWindow();
    QCoreApplication::processEvents();
}

/// The one touch screen of the tests: with several, a second finger would look like a first one.
inline QPointingDevice* touchScreen()
{
    static QPointingDevice* const device = QTest::createTouchDevice();
    return device;
}

/// A finger that goes from one place to another within a widget, slowly enough to be a drag.
inline void dragFinger(QWidget& widget, QPoint from, QPoint to)
{
    constexpr int steps = 30;
    QTest::touchEvent(&widget, touchScreen()).press(0, from, &widget);
    for (int step = 1; step <= steps; ++step) {
        QTest::qWait(5); // scrolling works with the speed
        QTest::touchEvent(&widget, touchScreen())
            .move(0, from + (to - from) * step / steps, &widget);
    }
    QTest::touchEvent(&widget, touchScreen()).release(0, to, &widget);
}

inline void deletePopped()
{
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

} // namespace ventrik
