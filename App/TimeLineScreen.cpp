#include "App/TimeLineScreen.h"

#include "App/StatusItems.h"
#include "App/Toolkit/NavigationStack.h"

#include <QVBoxLayout>

namespace ventrik
{

TimeLineScreen::TimeLineScreen(VentrikPaneHost& host, ViewerWindow& window, QWidget& timeLine)
    : _host(host), _window(window), _timeLine(timeLine)
{
    setTitle(QStringLiteral("Time Line"));
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
}

void TimeLineScreen::viewWillAppear(bool)
{
    layout()->addWidget(&_timeLine);
    _timeLine.show();
    setFocusProxy(_timeLine.focusProxy());
    if (navigationStack())
        navigationStack()->setToolbarHidden(false);
}

void TimeLineScreen::viewWillDisappear(bool)
{
    setFocusProxy(nullptr);
    _window.takeBackTimeLine();
}

void TimeLineScreen::setStatus(const std::string& status, bool isLoading)
{
    setToolbarItems(statusItems(status, isLoading, _host), true);
}

void TimeLineScreen::updateNotes()
{
    updateStatusNote(toolbar(), _host.statusNote());
}

} // namespace ventrik
