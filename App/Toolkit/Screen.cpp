#include "App/Toolkit/Screen.h"

#include "App/Toolkit/NavigationStack.h"

namespace ventrik
{

Screen::Screen() : _toolbar(new ToolBar) {}

Screen::~Screen()
{
    delete _toolbar;
}

void Screen::setToolbarItems(std::vector<ToolBarItem> items, bool animated)
{
    _toolbar->setItems(std::move(items), animated && _stack && _stack->canAnimate());
}

bool Screen::isRoot() const
{
    return _stack && _stack->screens().front() == this;
}

void Screen::viewWillAppear(bool) {}

void Screen::viewWillDisappear(bool) {}

void Screen::setStatus(const std::string&, bool) {}

} // namespace ventrik
