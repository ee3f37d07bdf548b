#pragma once

#include "App/Toolkit/NavigationStack.h"

#include <QCoreApplication>
#include <QEvent>

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

inline void deletePopped()
{
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

} // namespace ventrik
