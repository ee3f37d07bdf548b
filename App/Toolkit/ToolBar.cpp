#include "App/Toolkit/ToolBar.h"

#include "App/Toolkit/Separator.h"

#include <QHBoxLayout>
#include <QPainter>

namespace ventrik
{

ToolBarItem ToolBarItem::widget(std::unique_ptr<QWidget> widget)
{
    ToolBarItem item;
    item._widget = std::move(widget);
    return item;
}

ToolBar::ToolBar(QWidget* parent) : QWidget(parent), _layout(new QHBoxLayout(this))
{
    setFixedHeight(barHeight);
    setAutoFillBackground(true);
    _layout->setContentsMargins(12, 0, 12, 0);
    _layout->setSpacing(8);
}

void ToolBar::setItems(std::vector<ToolBarItem> items, bool animated)
{
    const bool fades = animated && isVisible();
    QPixmap before;
    if (fades)
        before = grab();
    delete _transition;
    clear();
    for (ToolBarItem& item : items)
        add(std::move(item));
    if (fades)
        _transition = new Transition(Transition::Kind::Fade, *this, std::move(before));
}

void ToolBar::clear()
{
    while (QLayoutItem* item = _layout->takeAt(0)) {
        // Later, since the change may come from the click of one of these.
        if (QWidget* widget = item->widget()) {
            widget->hide();
            widget->deleteLater();
        }
        delete item;
    }
    _items.clear();
}

void ToolBar::add(ToolBarItem item)
{
    if (item.isFlexibleSpace()) {
        _layout->addStretch(1);
        _items.push_back(nullptr);
        return;
    }
    QWidget* widget = item.takeWidget().release();
    _layout->addWidget(widget);
    _items.push_back(widget);
}

void ToolBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.fillRect(0, 0, width(), 1, separatorColor(palette()));
}

} // namespace ventrik
