#include "App/Toolkit/NavigationStack.h"

#include "App/Toolkit/EdgeSwipe.h"

#include <QApplication>
#include <QKeyEvent>
#include <QStackedLayout>
#include <QVBoxLayout>

#include <algorithm>
#include <utility>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

// For so long an Escape may still be meant for a menu that has just gone.
constexpr auto escapeWait = 1s;

} // namespace

NavigationStack::NavigationStack(std::unique_ptr<Screen> root, QWidget* parent)
    : QWidget(parent),
      _layout(new QStackedLayout(this)),
      _bars(new QWidget(this)),
      _titleBar(new TitleBar(_bars)),
      _screenArea(new QWidget(_bars)),
      _screenLayout(new QStackedLayout(_screenArea)),
      _toolbarArea(new QWidget(_bars)),
      _toolbarLayout(new QStackedLayout(_toolbarArea))
{
    _layout->addWidget(_bars);
    auto* layout = new QVBoxLayout(_bars);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(_titleBar);
    layout->addWidget(_screenArea, 1);
    layout->addWidget(_toolbarArea);
    _toolbarArea->setFixedHeight(ToolBar::barHeight);
    _toolbarArea->hide();
    connect(&_titleBar->backButton(), &QAbstractButton::clicked, this, [this] { goBack(); });
    new EdgeSwipe(*this, [this] { goBack(); });
    adopt(std::move(root));
    showTop();
}

// The user's wish; it does not reach below a presented screen.
void NavigationStack::goBack()
{
    if (!_presented)
        pop(true);
}

void NavigationStack::adopt(std::unique_ptr<Screen> screen)
{
    Screen* adopted = screen.release();
    adopted->_stack = this;
    _screenLayout->addWidget(adopted);
    _toolbarLayout->addWidget(&adopted->toolbar());
    connect(adopted, &QWidget::windowTitleChanged, this, [this] { updateTitleBar(); });
    _screens.push_back(adopted);
}

void NavigationStack::release(Screen& screen)
{
    screen.disconnect(this);
    screen._stack = nullptr;
    _screenLayout->removeWidget(&screen);
    _toolbarLayout->removeWidget(&screen.toolbar());
    screen.hide();
    screen.toolbar().hide();
    screen.deleteLater();
}

void NavigationStack::push(std::unique_ptr<Screen> screen, bool animated)
{
    Screen& leaving = topScreen();
    adopt(std::move(screen));
    replace(leaving, Transition::Kind::Push, animated);
}

void NavigationStack::pop(bool animated)
{
    if (_screens.size() > 1)
        popTo(*_screens[_screens.size() - 2], animated);
}

void NavigationStack::popTo(Screen& screen, bool animated)
{
    if (screen.navigationStack() != this || &screen == &topScreen())
        return;
    std::vector<Screen*> popped;
    while (_screens.back() != &screen) {
        popped.push_back(_screens.back());
        _screens.pop_back();
    }
    closePopupOf(popped);
    replace(*popped.front(), Transition::Kind::Pop, animated);
    for (Screen* old : popped)
        release(*old);
}

// A menu of a screen that goes does not outlive it. Whoever was about to close it with Escape means
// nothing else by that.
void NavigationStack::closePopupOf(const std::vector<Screen*>& popped)
{
    QWidget* popup = QApplication::activePopupWidget();
    const QWidget* owner = popup ? popup->parentWidget() : nullptr;
    if (std::ranges::none_of(popped, [&](Screen* screen) { return screen->isAncestorOf(owner); }))
        return;
    popup->close();
    _escapeForPopup.setRemainingTime(escapeWait);
}

void NavigationStack::replace(Screen& leaving, Transition::Kind kind, bool animated)
{
    const bool moves = animated && canAnimate();
    QPixmap screenBefore;
    QPixmap toolbarBefore;
    if (moves) {
        screenBefore = _screenArea->grab();
        toolbarBefore = _toolbarArea->grab();
    }
    delete _transition;
    delete _toolbarTransition;
    leaving.viewWillDisappear(animated);
    topScreen().viewWillAppear(animated);
    if (_delegate)
        _delegate->willShowScreen(*this, topScreen(), animated);
    showTop();
    if (moves) {
        _transition = new Transition(kind, *_screenArea, screenBefore, topScreen().grab());
        _toolbarTransition = new Transition(Transition::Kind::Fade, *_toolbarArea,
                                            std::move(toolbarBefore), _toolbarArea->grab());
    }
}

void NavigationStack::showTop()
{
    _screenLayout->setCurrentWidget(&topScreen());
    _toolbarLayout->setCurrentWidget(&topScreen().toolbar());
    focusTop();
    updateTitleBar();
}

// A change below a presented screen leaves the keyboard where it is.
void NavigationStack::focusTop()
{
    if (!_presented)
        topScreen().setFocus();
}

void NavigationStack::present(Screen& screen, bool animated)
{
    dismiss(false);
    const bool moves = animated && canAnimate();
    const QPixmap before = moves ? grab() : QPixmap();
    _presented = &screen;
    screen._stack = this;
    _layout->addWidget(&screen);
    screen.viewWillAppear(animated);
    _layout->setCurrentWidget(&screen);
    screen.firstFocus().setFocus();
    if (moves)
        cover(Transition::Kind::Rise, before);
}

void NavigationStack::dismiss(bool animated)
{
    if (!_presented)
        return;
    const bool moves = animated && canAnimate();
    const QPixmap before = moves ? grab() : QPixmap();
    _presented->viewWillDisappear(animated);
    uncover(*_presented);
    focusTop();
    if (moves)
        cover(Transition::Kind::Sink, before);
}

void NavigationStack::uncover(Screen& presented)
{
    _presented = nullptr;
    presented._stack = nullptr;
    _layout->setCurrentWidget(_bars);
    _layout->removeWidget(&presented);
    presented.setParent(nullptr);
}

void NavigationStack::cover(Transition::Kind kind, const QPixmap& before)
{
    delete _presentTransition;
    _presentTransition = new Transition(kind, *this, before, _layout->currentWidget()->grab());
}

void NavigationStack::updateTitleBar()
{
    _titleBar->setTitle(topScreen().title());
    if (_screens.size() > 1)
        _titleBar->showBackButton(_screens[_screens.size() - 2]->title());
    else
        _titleBar->hideBackButton();
}

bool NavigationStack::canAnimate() const
{
    return _animationEnabled && isVisible() && Transition::isWanted(*this);
}

void NavigationStack::setToolbarHidden(bool hidden)
{
    _toolbarArea->setHidden(hidden);
}

void NavigationStack::showEvent(QShowEvent*)
{
    if (std::exchange(_hasAppeared, true))
        return;
    topScreen().viewWillAppear(false);
    focusTop();
}

void NavigationStack::keyPressEvent(QKeyEvent* event)
{
    const bool goesBack =
        event->key() == Qt::Key_Escape || event->key() == Qt::Key_Backspace ||
        event->key() == Qt::Key_Back ||
        (event->key() == Qt::Key_Left && event->modifiers().testFlag(Qt::AltModifier));
    const bool isForPopup = event->key() == Qt::Key_Escape &&
                            !std::exchange(_escapeForPopup, QDeadlineTimer()).hasExpired();
    if (goesBack && !isForPopup)
        goBack();
    else if (!goesBack)
        QWidget::keyPressEvent(event);
}

} // namespace ventrik
