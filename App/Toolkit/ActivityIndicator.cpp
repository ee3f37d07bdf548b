#include "App/Toolkit/ActivityIndicator.h"

#include <QDeadlineTimer>
#include <QPainter>

namespace ventrik
{

namespace
{

constexpr int spokes = 12;
constexpr int millisecondsForOneSpoke = 83;

// Taken from the time, not counted: an indicator that replaces another one goes on where that was.
int currentSpoke()
{
    return static_cast<int>(QDeadlineTimer::current().deadline() / millisecondsForOneSpoke %
                            spokes);
}

} // namespace

ActivityIndicator::ActivityIndicator(QWidget* parent) : QWidget(parent)
{
    setFixedSize(ActivityIndicator::sizeHint());
    setAccessibleName(QStringLiteral("In progress"));
}

void ActivityIndicator::startAnimating()
{
    _isAnimating = true;
    // On its own it would become a window.
    if (parentWidget())
        show();
}

void ActivityIndicator::stopAnimating()
{
    _isAnimating = false;
    hide();
}

void ActivityIndicator::showEvent(QShowEvent*)
{
    if (_isAnimating)
        _timer.start(millisecondsForOneSpoke, this);
}

void ActivityIndicator::hideEvent(QHideEvent*)
{
    _timer.stop();
}

void ActivityIndicator::timerEvent(QTimerEvent*)
{
    update();
}

void ActivityIndicator::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.translate(width() / 2.0, height() / 2.0);
    const int leading = currentSpoke();
    for (int spoke = 0; spoke < spokes; ++spoke) {
        QColor grey = palette().color(QPalette::WindowText);
        const int age = (leading - spoke + spokes) % spokes;
        grey.setAlphaF(0.6F - 0.04F * static_cast<float>(age));
        painter.setPen(QPen(grey, 2.0, Qt::SolidLine, Qt::RoundCap));
        painter.save();
        painter.rotate(spoke * 360.0 / spokes);
        painter.drawLine(QPointF(0, -4.5), QPointF(0, -8.0));
        painter.restore();
    }
}

} // namespace ventrik
