#include "App/VentrikCell.h"

#include "App/Toolkit/EdgeFade.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/HorizontalScrollView.h"
#include "App/Toolkit/PlainText.h"
#include "App/Toolkit/Transition.h"

#include <QHelpEvent>
#include <QLabel>
#include <QPainter>
#include <QTimerEvent>
#include <QToolTip>

#include <algorithm>
#include <utility>

namespace ventrik
{

namespace
{

constexpr int textPoints = 15;
constexpr int leftMargin = 10;
constexpr int gapBesideKey = 50;
constexpr int scrolledHeight = 50;
constexpr int sidewaysStep = 40;
constexpr int tintMilliseconds = 900;
constexpr int tintMargin = 5;
constexpr float faintness = 0.6F;

QFont boldFont()
{
    return systemFont(textPoints, FontWeight::Bold);
}

int centredTop(const QRect& bounds, const QSize& size)
{
    return (bounds.height() - size.height()) / 2;
}

} // namespace

VentrikCell::VentrikCell(Style style, const QString& identifier)
    : TableRow(style, identifier), _fade(new EdgeFade(&contentArea()))
{
}

std::unique_ptr<VentrikCell> VentrikCell::initWithStyleKey(Style style, const QString& identifier)
{
    std::unique_ptr<VentrikCell> cell(new VentrikCell(style, identifier));
    cell->_key = makeLabel(boldFont(), &cell->contentArea());
    return cell;
}

std::unique_ptr<VentrikCell> VentrikCell::initWithStyle(Style style, const QString& identifier)
{
    std::unique_ptr<VentrikCell> cell(new VentrikCell(style, identifier));
    cell->_view = new HorizontalScrollView(&cell->contentArea());
    cell->_view->setScrolled([row = cell.get()] { row->updateFade(); });
    cell->_key = makeLabel(boldFont(), &cell->_view->content());
    cell->_value = makeLabel(systemFont(textPoints, FontWeight::Regular), &cell->_view->content());
    return cell;
}

void VentrikCell::setKeyText(const QString& text)
{
    const QString shown = oneLine(text);
    if (shown != _key->text())
        endTint(); // it was another node's value
    _key->setText(shown);
    updateAccessibleName();
}

void VentrikCell::setValueText(const QString& text)
{
    if (!_value)
        return;
    _value->setText(oneLine(text));
    updateAccessibleName();
}

void VentrikCell::setDoubt(const QString& line)
{
    if (!_value || line == accessibleDescription())
        return;
    setToolTip(plainToolTip(line));
    setAccessibleDescription(line);
}

void VentrikCell::setFaint(bool isFaint)
{
    if (_value && std::exchange(_isFaint, isFaint) != isFaint)
        colorValue();
}

// The label draws in the text's color, or in that of the highlight, which stays as it is.
void VentrikCell::colorValue()
{
    QPalette colors;
    if (_isFaint) {
        QColor color = palette().color(QPalette::Text);
        color.setAlphaF(faintness);
        colors.setColor(QPalette::Text, color);
    }
    _value->setPalette(colors);
}

void VentrikCell::changeEvent(QEvent* event)
{
    TableRow::changeEvent(event);
    if (event->type() == QEvent::PaletteChange && _isFaint)
        colorValue();
}

bool VentrikCell::event(QEvent* event)
{
    if (event->type() != QEvent::ToolTip || !_tipSource)
        return TableRow::event(event);
    const QString source = _tipSource();
    if (source.isEmpty())
        return TableRow::event(event);
    const QString tip = toolTip().isEmpty() ? source : toolTip() + u'\n' + source;
    QToolTip::showText(static_cast<QHelpEvent*>(event)->globalPos(), tip, this);
    return true;
}

void VentrikCell::tintValue()
{
    if (!_value || !Transition::isWanted(*this))
        return;
    _tintTimer.start(tintMilliseconds, this);
    update();
}

void VentrikCell::endTint()
{
    _tintTimer.stop();
    update();
}

void VentrikCell::timerEvent(QTimerEvent* event)
{
    if (event->timerId() == _tintTimer.timerId())
        endTint();
    else
        TableRow::timerEvent(event);
}

void VentrikCell::paintEvent(QPaintEvent* event)
{
    TableRow::paintEvent(event);
    if (!isTinted() || isSelected())
        return;
    QColor tint = palette().color(QPalette::Highlight);
    tint.setAlphaF(0.22F);
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(tint);
    const QRect text = _value->contentsRect();
    painter.drawRoundedRect(QRect(_value->mapTo(this, text.topLeft()), text.size())
                                .adjusted(-tintMargin, -tintMargin, tintMargin, tintMargin),
                            tintMargin, tintMargin);
}

bool VentrikCell::scrollSideways(int steps)
{
    if (!_view || _view->contentSize().width() <= _view->width())
        return false;
    _view->setContentOffset(_view->contentOffset() + steps * sidewaysStep);
    return true;
}

void VentrikCell::updateAccessibleName()
{
    const bool hasValue = _value && !_value->text().isEmpty();
    setAccessibleName(hasValue ? _key->text() + QStringLiteral(", ") + _value->text()
                               : _key->text());
}

void VentrikCell::setLayoutKey()
{
    _layout = Layout::Key;
    layoutSubviews();
}

void VentrikCell::setLayout()
{
    _layout = Layout::KeyAndValue;
    layoutSubviews();
}

void VentrikCell::layoutSubviews()
{
    TableRow::layoutSubviews();
    if (_layout == Layout::None)
        return;
    placeKey();
    if (_layout == Layout::KeyAndValue && _value)
        placeValue();
    _fade->layout();
    updateFade();
}

int VentrikCell::placeInRow(const QLabel& label, int x) const
{
    return label.mapTo(&contentArea(), QPoint(x, 0)).x();
}

// Half a letter beyond the edge is nothing: values keep some air on their right.
void VentrikCell::updateFade()
{
    const int edge = contentArea().width();
    const bool hasValue = _value && !_value->text().isEmpty();
    const QLabel& last = hasValue ? *_value : *_key;
    _fade->setVisible(placeInRow(last, last.width()) > edge + textPoints / 2);
    _fade->setDots(hasValue && placeInRow(last, textPoints) > edge);
    if (!_view)
        setToolTip(isFading() ? plainToolTip(_key->text()) : QString());
}

bool VentrikCell::isFading() const
{
    return !_fade->isHidden();
}

bool VentrikCell::showsDots() const
{
    return isFading() && _fade->hasDots();
}

void VentrikCell::placeKey()
{
    const QRect bounds = contentArea().rect();
    const QSize size = measured(_key->text(), boldFont());
    _key->setGeometry(bounds.x() + leftMargin, centredTop(bounds, size), size.width(),
                      size.height());
}

// What the key and the value need beside their own widths. A sign takes its room from the gap: what
// fits without it fits with it.
int VentrikCell::roomAroundKey() const
{
    const bool hasSign = accessory() == TableRowAccessory::Warning;
    return leftMargin + gapBesideKey - (hasSign ? accessoryWidth - rightMargin : 0);
}

void VentrikCell::placeValue()
{
    const QRect bounds = contentArea().rect();
    const int keyWidth = measured(_key->text(), boldFont()).width();
    // Measured in the key's font, which is the wider one: a value has some air.
    const QSize size = measured(_value->text(), boldFont());
    const int needed = keyWidth + roomAroundKey() + size.width();
    const int left = needed < bounds.width() ? bounds.width() - size.width()
                                             : bounds.x() + keyWidth + roomAroundKey();
    _value->setGeometry(left, centredTop(bounds, size), size.width(), size.height());
    // The air goes to the left as far as there is room, so that all values end at one line.
    const int textWidth = measured(_value->text(), _value->font()).width();
    const int air = std::max(0, size.width() - textWidth);
    _value->setContentsMargins(std::clamp(bounds.width() - left - textWidth, 0, air), 0, 0, 0);
    const int scrolledWidth =
        needed > bounds.width() ? bounds.width() + keyWidth + size.width() : bounds.width();
    _view->setGeometry(bounds.x(), bounds.y(), bounds.width(), scrolledHeight);
    _view->setContentSize({scrolledWidth, scrolledHeight});
}

} // namespace ventrik
