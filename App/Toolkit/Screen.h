#pragma once

#include "App/Toolkit/ToolBar.h"

#include <QPointer>
#include <QWidget>

#include <vector>

namespace ventrik
{

class NavigationStack;

/// One screen of a navigation stack. Its title is its window title.
class Screen : public QWidget
{
  public:
    Screen();
    ~Screen() override;

    QString title() const { return windowTitle(); }
    void setTitle(const QString& title) { setWindowTitle(title); }

    /// The stack that holds the screen; null while none does.
    NavigationStack* navigationStack() const { return _stack; }

    void setToolbarItems(std::vector<ToolBarItem> items, bool animated);
    ToolBar& toolbar() const { return *_toolbar; }

    /// Who has the keyboard when the screen is presented; the screen itself as a rule.
    virtual QWidget& firstFocus() { return *this; }

    /// Called before the screen comes into view and before it goes out of it.
    virtual void viewWillAppear(bool animated);
    virtual void viewWillDisappear(bool animated);

  private:
    friend class NavigationStack;

    NavigationStack* _stack = nullptr;
    // Lives among the stack's bars while the screen is on a stack.
    QPointer<ToolBar> _toolbar;
};

} // namespace ventrik
