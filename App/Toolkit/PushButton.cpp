#include "App/Toolkit/PushButton.h"

#include "App/Toolkit/Fonts.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr int leastHeight = 32;
constexpr int besideText = 10;

} // namespace

PushButton::PushButton(QWidget* parent) : PushButton(QString(), parent) {}

PushButton::PushButton(const QString& text, QWidget* parent) : QPushButton(text, parent)
{
    setAutoDefault(true); // Enter presses it as Space does
    setMinimumHeight(leastHeight);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
}

QSize PushButton::minimumSizeHint() const
{
    const QSize wanted = sizeHint();
    const int least = measured(text(), font()).width() + 2 * besideText;
    return {std::min(wanted.width(), least), wanted.height()};
}

} // namespace ventrik
