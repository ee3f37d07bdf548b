#include "App/Toolkit/WindowKeys.h"

#include <QKeyEvent>
#include <QWidget>

namespace ventrik
{

namespace
{

class WindowKeys : public QObject
{
  public:
    using QObject::QObject;

    bool eventFilter(QObject*, QEvent* event) override
    {
        const bool asksFirst = event->type() == QEvent::ShortcutOverride;
        if (!asksFirst && event->type() != QEvent::KeyPress)
            return false;
        const auto& pressed = static_cast<const QKeyEvent&>(*event);
        if (pressed.modifiers() != Qt::NoModifier)
            return false;
        const bool isOfWindow =
            pressed.key() == Qt::Key_Space || (asksFirst && pressed.key() == Qt::Key_Home);
        if (isOfWindow)
            event->ignore(); // so that it goes on to the parents
        return isOfWindow;
    }
};

} // namespace

void leaveKeysToWindow(QWidget& widget)
{
    widget.installEventFilter(new WindowKeys(&widget));
}

} // namespace ventrik
