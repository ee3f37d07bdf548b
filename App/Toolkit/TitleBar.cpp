#include "App/Toolkit/TitleBar.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/Separator.h"

#include <QPainter>

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr int chevronSpace = 28;
constexpr int margin = 12;

QFont titleFont()
{
    return systemFont(17, FontWeight::Bold);
}

QFont backFont()
{
    return systemFont(15, FontWeight::Regular);
}

} // namespace

BackButton::BackButton(QWidget* parent) : QAbstractButton(parent)
{
    setFocusPolicy(Qt::NoFocus);
    setCursor(Qt::PointingHandCursor);
    setAccessibleName(QStringLiteral("Back"));
}

QSize BackButton::sizeHint() const
{
    return {chevronSpace + measured(text(), backFont()).width() + margin, TitleBar::barHeight - 1};
}

void BackButton::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setOpacity(isDown() ? 0.5 : 1.0);
    painter.setPen(
        QPen(palette().color(QPalette::Link), 2.2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    const QPointF tip(margin + 1, height() / 2.0);
    painter.drawPolyline(QPolygonF{tip + QPointF(7, -7), tip, tip + QPointF(7, 7)});
    painter.setFont(backFont());
    const QRect room = rect().adjusted(chevronSpace, 0, 0, 0);
    painter.drawText(room, Qt::AlignLeft | Qt::AlignVCenter | Qt::TextSingleLine,
                     painter.fontMetrics().elidedText(text(), Qt::ElideRight, room.width()));
}

TitleBar::TitleBar(QWidget* parent) : QWidget(parent), _back(new BackButton(this))
{
    setFixedHeight(barHeight);
    setAutoFillBackground(true);
    _back->hide();
}

void TitleBar::setTitle(const QString& title)
{
    _title = title;
    setAccessibleName(title);
    update();
}

void TitleBar::showBackButton(const QString& previousTitle)
{
    _back->setText(previousTitle);
    _back->setAccessibleDescription(previousTitle);
    placeBackButton();
    _back->show();
    update();
}

void TitleBar::hideBackButton()
{
    _back->hide();
    update();
}

void TitleBar::placeBackButton()
{
    const QSize wanted = _back->sizeHint();
    _back->setGeometry(0, 0, std::min(wanted.width(), width() / 3), wanted.height());
    _back->update();
}

void TitleBar::resizeEvent(QResizeEvent*)
{
    placeBackButton();
}

QRect TitleBar::titleRect() const
{
    const int side = margin + (_back->isHidden() ? 0 : _back->width());
    const QRect middle = rect().adjusted(side, 0, -side, -1);
    const bool fits = measured(_title, titleFont()).width() <= middle.width();
    return fits ? middle : rect().adjusted(side, 0, -margin, -1);
}

void TitleBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.fillRect(0, height() - 1, width(), 1, separatorColor(palette()));
    painter.setPen(palette().color(QPalette::WindowText));
    painter.setFont(titleFont());
    const QRect room = titleRect();
    painter.drawText(room, Qt::AlignCenter | Qt::TextSingleLine,
                     painter.fontMetrics().elidedText(_title, Qt::ElideMiddle, room.width()));
}

} // namespace ventrik
