#pragma once

#include "App/Toolkit/Transition.h"

#include <QPointer>
#include <QWidget>

#include <memory>
#include <vector>

class QAbstractButton;
class QHBoxLayout;

namespace ventrik
{

/// One item of a tool bar: a widget, or a space that takes what is left.
class ToolBarItem
{
  public:
    static ToolBarItem widget(std::unique_ptr<QWidget> widget);
    static ToolBarItem flexibleSpace() { return {}; }

    bool isFlexibleSpace() const { return !_widget; }
    std::unique_ptr<QWidget> takeWidget() { return std::move(_widget); }

  private:
    std::unique_ptr<QWidget> _widget;
};

/// The bar along the bottom of a screen.
class ToolBar : public QWidget
{
  public:
    static constexpr int barHeight = 44;

    explicit ToolBar(QWidget* parent = nullptr);

    /// Replaces all items; a bar that nobody sees does so without animation. The keyboard stays at
    /// its place in the bar. While one of the bar's buttons is held down, the new items wait.
    void setItems(std::vector<ToolBarItem> items, bool animated);

    /// The widgets in their order, null for a flexible space.
    const std::vector<QWidget*>& items() const { return _items; }

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    QAbstractButton* pressedButton() const;
    void setItemsOnRelease(QAbstractButton& pressed, std::vector<ToolBarItem> items, bool animated);
    std::size_t placeOfFocus() const;
    static void giveFocus(QWidget* item);
    void clear();
    void add(ToolBarItem item);

    QHBoxLayout* _layout;
    std::vector<QWidget*> _items;
    std::vector<ToolBarItem> _waitingItems;
    QPointer<Transition> _transition;
};

} // namespace ventrik
