#pragma once

#include "App/Toolkit/ToolBar.h"

#include <QPointer>
#include <QWidget>

#include <string>
#include <vector>

namespace ventrik
{

class NavigationStack;

/// One screen of a navigation stack. Its title is its window title. What the application tells its
/// screens, each kind takes up as far as it concerns it.
class Screen : public QWidget
{
  public:
    Screen();
    ~Screen() override;

    QString title() const { return windowTitle(); }
    void setTitle(const QString& title) { setWindowTitle(title); }

    /// The stack that holds the screen; null while none does.
    NavigationStack* navigationStack() const { return _stack; }
    /// Whether it lies at the bottom of its stack.
    bool isRoot() const;

    void setToolbarItems(std::vector<ToolBarItem> items, bool animated);
    ToolBar& toolbar() const { return *_toolbar; }

    /// Who has the keyboard when the screen is presented; the screen itself as a rule.
    virtual QWidget& firstFocus() { return *this; }

    /// Called before the screen comes into view and before it goes out of it.
    virtual void viewWillAppear(bool animated);
    virtual void viewWillDisappear(bool animated);

    /// There are new data. False when what the screen shows is no more: unless it is the root, it
    /// leaves the stack then, with those above it.
    virtual bool reload() { return true; }
    /// How it stands with the data: given to the top screen, and to one that comes into view.
    virtual void setStatus(const std::string& status, bool isLoading);
    /// What is said beside the status may have changed.
    virtual void updateNotes() {}

  private:
    friend class NavigationStack;

    NavigationStack* _stack = nullptr;
    // Lives among the stack's bars while the screen is on a stack.
    QPointer<ToolBar> _toolbar;
};

} // namespace ventrik
