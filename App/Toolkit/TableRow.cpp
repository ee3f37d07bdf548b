#include "App/Toolkit/TableRow.h"

#include "App/Toolkit/ElidingLabel.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/PlainText.h"
#include "App/Toolkit/Separator.h"

#include <QLabel>
#include <QPainter>

namespace ventrik
{

namespace
{

constexpr int textInset = 10;
constexpr int textPoints = 15;
constexpr int separatorInset = 10;

} // namespace

void drawKeyboardFrame(QPainter& painter, const QRect& around, const QPalette& palette)
{
    painter.setPen(QPen(palette.color(QPalette::Highlight), 2));
    painter.drawRect(around.adjusted(1, 1, -1, -1));
}

TableRow::TableRow(Style style, QString reuseIdentifier)
    : _style(style), _reuseIdentifier(std::move(reuseIdentifier)), _contentArea(new QWidget(this))
{
    setBackgroundRole(QPalette::Base);
}

QLabel& TableRow::textLabel()
{
    if (!_textLabel) {
        _textLabel = new ElidingLabel(_contentArea);
        _textLabel->setFont(systemFont(textPoints, FontWeight::Regular));
        layoutSubviews();
    }
    return *_textLabel;
}

void TableRow::setText(const QString& text)
{
    textLabel().setText(oneLine(text));
    _textLabel->updateTip();
    setAccessibleName(_textLabel->text());
}

void TableRow::setAccessory(TableRowAccessory accessory)
{
    if (_accessory == accessory)
        return;
    _accessory = accessory;
    layoutSubviews();
    update();
}

void TableRow::setSelected(bool selected)
{
    if (_isSelected == selected)
        return;
    _isSelected = selected;
    // The labels take their text colour from the background's role.
    setBackgroundRole(selected ? QPalette::Highlight : QPalette::Base);
    update();
}

void TableRow::setKeyboardFrame(bool visible)
{
    if (_hasKeyboardFrame == visible)
        return;
    _hasKeyboardFrame = visible;
    update();
}

bool TableRow::scrollSideways(int)
{
    return false;
}

void TableRow::layoutSubviews()
{
    const int taken = _accessory == TableRowAccessory::None ? rightMargin : accessoryWidth;
    _contentArea->setGeometry(0, 0, width() - taken, height());
    if (_textLabel)
        _textLabel->setGeometry(_contentArea->rect().adjusted(textInset, 0, 0, 0));
}

void TableRow::resizeEvent(QResizeEvent*)
{
    layoutSubviews();
}

void TableRow::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.fillRect(rect(), palette().color(backgroundRole()));
    painter.fillRect(separatorInset, height() - 1, width(), 1, separatorColor(palette()));
    painter.setRenderHint(QPainter::Antialiasing);
    paintAccessory(painter);
    if (_hasKeyboardFrame)
        drawKeyboardFrame(painter, rect().adjusted(0, 0, 0, -1), palette());
}

// A check mark and a warning say something; an indicator only hints.
QColor TableRow::accessoryColor() const
{
    if (_isSelected)
        return palette().color(QPalette::HighlightedText);
    if (_accessory == TableRowAccessory::CheckMark)
        return palette().color(QPalette::Link);
    QColor grey = palette().color(QPalette::Text);
    grey.setAlphaF(_accessory == TableRowAccessory::Warning ? 0.75F : 0.35F);
    return grey;
}

void TableRow::paintAccessory(QPainter& painter) const
{
    const QPointF middle(width() - accessoryWidth / 2.0, height() / 2.0);
    painter.setPen(QPen(accessoryColor(), 2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    switch (_accessory) {
    case TableRowAccessory::None:
        return;
    case TableRowAccessory::DisclosureIndicator:
        painter.drawPolyline(
            QPolygonF{middle + QPointF(-3, -6), middle + QPointF(3, 0), middle + QPointF(-3, 6)});
        return;
    case TableRowAccessory::CheckMark:
        painter.drawPolyline(
            QPolygonF{middle + QPointF(-6, 0), middle + QPointF(-2, 5), middle + QPointF(7, -6)});
        return;
    case TableRowAccessory::Warning:
        paintWarning(painter, middle);
        return;
    }
}

// Drawn, for not every font has the sign, and some have it in colours of their own. Its right edge
// stands where the texts of rows without an accessory end.
void TableRow::paintWarning(QPainter& painter, const QPointF& middle) const
{
    painter.setPen(QPen(accessoryColor(), 1.5, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.drawPolygon(
        QPolygonF{middle + QPointF(0, -6.5), middle + QPointF(6.5, 5), middle + QPointF(-6.5, 5)});
    painter.drawLine(middle + QPointF(0, -2.5), middle + QPointF(0, 1));
    painter.drawPoint(middle + QPointF(0, 3));
}

} // namespace ventrik
