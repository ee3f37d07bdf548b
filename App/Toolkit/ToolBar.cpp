#include "App/Toolkit/ToolBar.h"

#include "App/Toolkit/Separator.h"

#include <QAbstractButton>
#include <QHBoxLayout>
#include <QPainter>

#include <algorithm>

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
    if (QAbstractButton* pressed = pressedButton()) {
        setItemsOnRelease(*pressed, std::move(items), animated);
        return;
    }
    const std::size_t focused = placeOfFocus();
    const bool fades = animated && isVisible();
    QPixmap before;
    if (fades)
        before = grab();
    delete _transition;
    clear();
    for (ToolBarItem& item : items)
        add(std::move(item));
    if (focused < _items.size())
        giveFocus(_items[focused]);
    _layout->activate();
    if (fades)
        _transition = new Transition(Transition::Kind::Fade, *this, std::move(before), grab());
}

QAbstractButton* ToolBar::pressedButton() const
{
    for (QWidget* widget : _items)
        if (auto* button = qobject_cast<QAbstractButton*>(widget); button && button->isDown())
            return button;
    return nullptr;
}

// The press is meant for the button that it began on.
void ToolBar::setItemsOnRelease(QAbstractButton& pressed, std::vector<ToolBarItem> items,
                                bool animated)
{
    _waitingItems = std::move(items);
    pressed.disconnect(this);
    connect(&pressed, &QAbstractButton::released, this,
            [this, animated] { setItems(std::move(_waitingItems), animated); });
}

// The number of items where the keyboard is elsewhere.
std::size_t ToolBar::placeOfFocus() const
{
    const auto focused =
        std::ranges::find_if(_items, [](QWidget* item) { return item && item->hasFocus(); });
    return static_cast<std::size_t>(focused - _items.begin());
}

void ToolBar::giveFocus(QWidget* item)
{
    if (item && item->focusPolicy() != Qt::NoFocus)
        item->setFocus();
}

void ToolBar::clear()
{
    while (QLayoutItem* item = _layout->takeAt(0)) {
        // Later, since the change may come from the click of one of these.
        if (QWidget* widget = item->widget()) {
            widget->disconnect(this);
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
    // The layout would show it only later.
    if (!widget->testAttribute(Qt::WA_WState_ExplicitShowHide))
        widget->show();
    _items.push_back(widget);
}

void ToolBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.fillRect(0, 0, width(), 1, separatorColor(palette()));
}

} // namespace ventrik
