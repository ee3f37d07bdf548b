#include "App/Strip/SignalStrip.h"

#include "App/Strip/PainterCanvas.h"
#include "App/Strip/StripAccessibility.h"
#include "App/Toolkit/TableRow.h"
#include "Charts/ChartTexts.h"
#include "Charts/SvgCanvas.h"

#include <QBuffer>
#include <QEvent>
#include <QFocusEvent>
#include <QImage>
#include <QPainter>

#include <fmt/format.h>

#include <algorithm>

namespace ventrik
{

namespace
{

Color colorOf(const QColor& color)
{
    return {static_cast<std::uint8_t>(color.red()), static_cast<std::uint8_t>(color.green()),
            static_cast<std::uint8_t>(color.blue())};
}

} // namespace

SignalStrip::SignalStrip(QWidget* parent) : QWidget(parent)
{
    installStripAccessibility();
    setAccessibleName(QStringLiteral("Signal strip"));
    setFocusPolicy(Qt::StrongFocus);
    setAttribute(Qt::WA_AcceptTouchEvents);
    setAttribute(Qt::WA_OpaquePaintEvent);
    tellMeaning();
}

bool SignalStrip::hasData() const
{
    return std::ranges::any_of(_data.lines,
                               [](const ChartLine& line) { return !line.points.empty(); });
}

void SignalStrip::setData(StripData shown)
{
    _data = std::move(shown);
    if (_cursor)
        _range.setExtent(_data.first, _data.last, *_cursor);
    else
        _range.setExtent(_data.first, _data.last);
    showAnew();
}

void SignalStrip::setCursor(std::optional<Clock::TimePoint> cursor)
{
    if (cursor == _cursor)
        return;
    _cursor = cursor;
    if (_cursor)
        _range.reveal(*_cursor);
    else
        _range.follow();
    showAnew();
}

void SignalStrip::setSecondsFromUtc(std::int32_t seconds)
{
    _secondsFromUtc = seconds;
    showAnew();
}

void SignalStrip::setBands(const QualityBands& bands)
{
    _bands = bands;
    showAnew();
}

void SignalStrip::fit()
{
    _range.fit();
    showAnew();
}

std::pair<Clock::TimePoint, Clock::TimePoint> SignalStrip::shownRange() const
{
    return {_range.first(), _range.last()};
}

void SignalStrip::showAnew()
{
    _chart.reset();
    tellMeaning();
    update();
}

const SignalChart& SignalStrip::chart() const
{
    if (!_chart)
        _chart.emplace(chartContent(), chartLooks(), width(), height(), FontMeasure());
    return *_chart;
}

ChartContent SignalStrip::chartContent() const
{
    return {_data.lines, _data.marks, _range.first(), _range.last(), _cursor, _secondCursor};
}

ChartLooks SignalStrip::chartLooks() const
{
    return {.palette = chartPalette(),
            .bands = _bands,
            .secondsFromUtc = _secondsFromUtc,
            .textSize = width() >= 800 ? 12.0 : 11.0};
}

// What the desktop decides of the colors, it decides for the chart as well.
ChartPalette SignalStrip::chartPalette() const
{
    const QColor base = palette().color(QPalette::Base);
    ChartPalette colors = base.lightness() < 128 ? darkPalette : lightPalette;
    colors.background = colorOf(base);
    colors.text = colorOf(palette().color(QPalette::Text));
    return colors;
}

SignalStrip::Row SignalStrip::row(std::size_t line) const
{
    const ChartLine& shown = _data.lines.at(line);
    const auto value = valueAt(shown.points, _cursor.value_or(_data.last));
    const auto range = valuesWithin(shown.points, _range.first(), _range.last());
    const auto text = [](bool isThere, double number) {
        return isThere ? shortNumber(number) : std::string("–");
    };
    return {shown.name, text(value.has_value(), value.value_or(0)), shown.unit,
            text(range.has_value(), range ? range->least : 0),
            text(range.has_value(), range ? range->greatest : 0)};
}

// "at 14:03:27.5, RSRP -84 dBm, RSRQ -9.5 dB", for those who do not see the picture.
void SignalStrip::tellMeaning()
{
    std::string text = _cursor ? "at " + exactTimeText(*_cursor, _secondsFromUtc) : std::string();
    for (std::size_t line = 0; line < _data.lines.size(); ++line) {
        const ChartLine& shown = _data.lines[line];
        const auto value = valueAt(shown.points, _cursor.value_or(_data.last));
        text += fmt::format("{}{} {}", text.empty() ? "" : ", ", shown.name,
                            value ? shortNumber(*value) : "–");
        if (value && !shown.unit.empty())
            text += " " + shown.unit;
    }
    const auto told = QString::fromStdString(hasData() ? text : "Nothing to show yet");
    if (told != accessibleDescription())
        setAccessibleDescription(told);
}

void SignalStrip::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    PainterCanvas canvas(painter, size());
    chart().draw(canvas);
    if (_showsKeyboardFrame && hasFocus())
        drawKeyboardFrame(painter, rect(), palette());
}

void SignalStrip::resizeEvent(QResizeEvent*)
{
    showAnew();
}

void SignalStrip::changeEvent(QEvent* event)
{
    QWidget::changeEvent(event);
    if (event->type() == QEvent::PaletteChange || event->type() == QEvent::FontChange ||
        event->type() == QEvent::ApplicationFontChange)
        showAnew();
}

void SignalStrip::focusInEvent(QFocusEvent* event)
{
    _showsKeyboardFrame = event->reason() != Qt::MouseFocusReason;
    update();
}

void SignalStrip::focusOutEvent(QFocusEvent*)
{
    update();
}

QByteArray SignalStrip::png() const
{
    QImage image(size() * devicePixelRatioF(), QImage::Format_RGB32);
    image.setDevicePixelRatio(devicePixelRatioF());
    {
        QPainter painter(&image);
        PainterCanvas canvas(painter, size());
        chart().draw(canvas);
    }
    QBuffer bytes;
    image.save(&bytes, "PNG");
    return bytes.data();
}

std::string SignalStrip::svg() const
{
    SvgCanvas canvas(width(), height(), "Signals: " + accessibleDescription().toStdString());
    SignalChart(chartContent(), chartLooks(), width(), height(), canvas).draw(canvas);
    return canvas.document();
}

} // namespace ventrik
