#pragma once

#include <QPixmap>
#include <QPointer>
#include <QWidget>

namespace ventrik
{

/// A short animation from an old look of a widget to its new one. What the widget is changes at
/// once; this covers it with moving pictures for a moment and is gone then.
class Transition : public QWidget
{
  public:
    enum class Kind {
        Fade, ///< where the looks differ, the old one fades away, then the new one comes
        Push, ///< the new look comes in from the right
        Pop,  ///< the old look goes away to the right
        Rise, ///< the new look comes up over the old one
        Sink, ///< the old look goes down off the new one
    };

    /// False where the platform asks for less motion.
    static bool isWanted(const QWidget& widget);

    /// Deletes itself at the end.
    Transition(Kind kind, QWidget& covered, QPixmap before, QPixmap after);

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    void start();
    void draw(QPainter& painter) const;
    void drawFade(QPainter& painter) const;
    /// Draws the look away from its place by parts of the widget's size, 1 being the whole of it.
    void drawMoved(QPainter& painter, const QPixmap& look, qreal right, qreal down) const;

    Kind _kind;
    QPixmap _before;
    QPixmap _after;
    qreal _progress = 0;
};

} // namespace ventrik
