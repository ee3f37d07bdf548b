#pragma once

#include <QObject>
#include <QPointF>

#include <functional>

class QWidget;

namespace ventrik
{

/// Watches for a swipe from a widget's left edge to the right, by finger or mouse, anywhere on the
/// widget or its children; but where it begins on content that has been moved sideways it moves
/// that back and is no swipe. It only looks on: what lies below gets its events all the same.
class EdgeSwipe : public QObject
{
  public:
    static constexpr int edgeWidth = 24;
    static constexpr int shortestSwipe = 48;

    /// `swiped` is called once for each swipe, while the finger is still down.
    EdgeSwipe(QWidget& widget, std::function<void()> swiped);

  protected:
    bool eventFilter(QObject* receiver, QEvent* event) override;

  private:
    bool isMine(QObject* receiver) const;
    bool movesSomethingBack(const QPointF& position) const;
    void begin(const QPointF& position);
    void moveTo(const QPointF& position);
    void end() { _isWatching = false; }

    QWidget& _widget;
    std::function<void()> _swiped;
    QPointF _start; // in global coordinates
    bool _isWatching = false;
};

} // namespace ventrik
