#include "App/Toolkit/PushButton.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/TableRow.h"

#include <QPainter>

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr int leastHeight = 32;
constexpr int leastWidth = 60;
constexpr int besideTextAsARule = 16;
constexpr int besideTextAtLeast = 8;

} // namespace

PushButton::PushButton(QWidget* parent) : PushButton(QString(), parent) {}

PushButton::PushButton(const QString& text, QWidget* parent) : QPushButton(text, parent)
{
    setAutoDefault(true); // Enter presses it as Space does
    setMinimumHeight(leastHeight);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
}

int PushButton::widthWith(int besideText) const
{
    return measured(text(), font()).width() + 2 * besideText;
}

QSize PushButton::sizeHint() const
{
    return {std::max(leastWidth, widthWith(besideTextAsARule)), QPushButton::sizeHint().height()};
}

QSize PushButton::minimumSizeHint() const
{
    return {widthWith(besideTextAtLeast), sizeHint().height()};
}

// The style's own mark is easily overlooked.
void PushButton::paintEvent(QPaintEvent* event)
{
    QPushButton::paintEvent(event);
    if (!hasFocus())
        return;
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    drawKeyboardFrame(painter, rect(), palette());
}

} // namespace ventrik
