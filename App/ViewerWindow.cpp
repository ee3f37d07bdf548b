#include "App/ViewerWindow.h"

#include "App/Toolkit/Separator.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QPainter>

#include <utility>

namespace ventrik
{

namespace
{

class SeparatorLine : public QWidget
{
  public:
    explicit SeparatorLine(QWidget* parent) : QWidget(parent) { setFixedWidth(1); }

  protected:
    void paintEvent(QPaintEvent*) override
    {
        QPainter(this).fillRect(rect(), separatorColor(palette()));
    }
};

} // namespace

ViewerWindow::ViewerWindow() : _layout(new QHBoxLayout(this)), _separator(new SeparatorLine(this))
{
    _layout->setContentsMargins(0, 0, 0, 0);
    _layout->setSpacing(0);
    // What needs more room than there is gives way, not the window.
    _layout->setSizeConstraint(QLayout::SetNoConstraint);
    _separator->hide();
}

void ViewerWindow::addPanes(QWidget* panes)
{
    _panes = panes;
    _layout->addWidget(panes);
    layOut();
}

void ViewerWindow::addTimeLine(QWidget* timeLine)
{
    _timeLine = timeLine;
    takeBackTimeLine();
}

void ViewerWindow::takeBackTimeLine()
{
    if (!_timeLine)
        return;
    _layout->addWidget(_separator);
    _layout->addWidget(_timeLine, 1);
    layOut();
}

void ViewerWindow::setTimeLineWanted(bool isWanted)
{
    _isTimeLineWanted = isWanted;
    layOut();
}

void ViewerWindow::layOut()
{
    const bool isBeside = showsTimeLine() && _timeLine && _timeLine->parentWidget() == this;
    if (_panes) {
        _panes->setMinimumWidth(isBeside ? paneWidth : 0);
        _panes->setMaximumWidth(isBeside ? paneWidth : QWIDGETSIZE_MAX);
    }
    _separator->setVisible(isBeside);
    if (_timeLine && _timeLine->parentWidget() == this)
        _timeLine->setVisible(isBeside);
    _layout->activate();
}

void ViewerWindow::resizeEvent(QResizeEvent*)
{
    if (std::exchange(_wasWide, isWide()) == isWide())
        return;
    layOut();
    if (_widthChanged)
        _widthChanged();
}

void ViewerWindow::keyPressEvent(QKeyEvent* event)
{
    const bool isSpace = event->key() == Qt::Key_Space && event->modifiers() == Qt::NoModifier;
    if (isSpace && !event->isAutoRepeat() && _spacePressed)
        _spacePressed();
    else
        QWidget::keyPressEvent(event);
}

} // namespace ventrik
