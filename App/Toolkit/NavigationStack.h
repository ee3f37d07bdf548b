#pragma once

#include "App/Toolkit/Screen.h"
#include "App/Toolkit/TitleBar.h"
#include "App/Toolkit/Transition.h"

#include <QDeadlineTimer>
#include <QPointer>
#include <QWidget>

#include <memory>
#include <vector>

class QStackedLayout;

namespace ventrik
{

class NavigationStack;

class NavigationStackDelegate
{
  public:
    virtual ~NavigationStackDelegate() = default;
    /// A push or a pop is about to show the screen, which has been told that it will appear.
    virtual void willShowScreen(NavigationStack& stack, Screen& screen, bool animated) = 0;
};

/// Screens on top of each other, of which the top one is seen, between a title bar with the way
/// back and the top screen's tool bar. The way back is also on Escape, Backspace and Alt+Left, and
/// on a swipe from the left edge.
///
/// One more screen can be presented over all of that, bars included; until it is dismissed the
/// stack below is out of reach of touch and keys.
///
/// The stack changes at once; an animation only covers the change with moving pictures.
class NavigationStack : public QWidget
{
  public:
    explicit NavigationStack(std::unique_ptr<Screen> root, QWidget* parent = nullptr);

    /// The delegate outlives the stack, or is cleared with null. The root's first appearance is no
    /// push: the delegate is not told.
    void setDelegate(NavigationStackDelegate* delegate) { _delegate = delegate; }
    /// Off: every change shows at once, even an animated one.
    void setAnimationEnabled(bool enabled) { _animationEnabled = enabled; }
    /// Would an animated change be animated now?
    bool canAnimate() const;

    void push(std::unique_ptr<Screen> screen, bool animated);
    /// The root is never popped.
    void pop(bool animated);
    /// Pops what lies above that screen, if it is one of the stack's. Popped screens are deleted by
    /// the event loop.
    void popTo(Screen& screen, bool animated);

    /// Bottom first; never empty.
    const std::vector<Screen*>& screens() const { return _screens; }
    Screen& topScreen() const { return *_screens.back(); }

    /// Shows a screen over the stack; the caller keeps it. It replaces one that is presented.
    void present(Screen& screen, bool animated);
    /// Takes the presented screen away again and leaves it to its owner.
    void dismiss(bool animated);
    /// Null while none is presented.
    Screen* presentedScreen() const { return _presented; }

    void setToolbarHidden(bool hidden);
    bool isToolbarHidden() const { return _toolbarArea->isHidden(); }
    TitleBar& titleBar() const { return *_titleBar; }

  protected:
    void showEvent(QShowEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

  private:
    void goBack();
    void adopt(std::unique_ptr<Screen> screen);
    void release(Screen& screen);
    void replace(Screen& leaving, Transition::Kind kind, bool animated);
    void showTop();
    void uncover(Screen& presented);
    void cover(Transition::Kind kind, const QPixmap& before);
    void focusTop();
    void closePopupOf(const std::vector<Screen*>& popped);
    void updateTitleBar();

    NavigationStackDelegate* _delegate = nullptr;
    bool _animationEnabled = true;
    bool _hasAppeared = false;
    std::vector<Screen*> _screens;
    QPointer<Screen> _presented;
    QStackedLayout* _layout; // of the stack with its bars, and of what is presented
    QWidget* _bars;
    TitleBar* _titleBar;
    QWidget* _screenArea;
    QStackedLayout* _screenLayout;
    QWidget* _toolbarArea;
    QStackedLayout* _toolbarLayout;
    QDeadlineTimer _escapeForPopup;
    QPointer<Transition> _transition;
    QPointer<Transition> _toolbarTransition;
    QPointer<Transition> _presentTransition;
};

} // namespace ventrik
