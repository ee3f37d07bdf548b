#include "App/Toolkit/Alert.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/Separator.h"

#include <QApplication>
#include <QKeyEvent>
#include <QLayout>
#include <QPainter>

namespace ventrik
{

namespace
{

constexpr int titlePoints = 17;
constexpr int titleHeight = 44;
constexpr int margin = 16;

} // namespace

Alert::Alert(const QString& title, const QString& message, const QString& button, QWidget* window)
    : QMessageBox(QMessageBox::Warning, title, message, QMessageBox::NoButton, window)
{
    setWindowFlag(Qt::FramelessWindowHint);
    setAttribute(Qt::WA_DeleteOnClose);
    setTextFormat(Qt::PlainText);
    addButton(button, QMessageBox::RejectRole);
    layout()->setContentsMargins(margin, titleHeight, margin, margin);
    qApp->installEventFilter(this);
}

void Alert::openNow()
{
    open();
    activateWindow();
}

// The window below may have kept the keyboard; what it is sent never comes here then.
bool Alert::eventFilter(QObject* receiver, QEvent* event)
{
    const bool isEscape = event->type() == QEvent::KeyPress &&
                          static_cast<QKeyEvent*>(event)->key() == Qt::Key_Escape;
    if (!isEscape || !isVisible())
        return QMessageBox::eventFilter(receiver, event);
    close();
    return true;
}

QRect Alert::titleRect() const
{
    return rect().adjusted(margin, 0, -margin, titleHeight - height());
}

void Alert::paintEvent(QPaintEvent* event)
{
    QMessageBox::paintEvent(event);
    QPainter painter(this);
    painter.setPen(separatorColor(palette()));
    painter.drawRect(rect().adjusted(0, 0, -1, -1));
    painter.setPen(palette().color(QPalette::WindowText));
    painter.setFont(systemFont(titlePoints, FontWeight::Bold));
    painter.drawText(titleRect(), Qt::AlignCenter | Qt::TextSingleLine, windowTitle());
}

} // namespace ventrik
