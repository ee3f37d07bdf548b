#pragma once

#include "App/Strip/StripRange.h"
#include "Charts/SignalChart.h"

#include <QPointF>
#include <QWidget>

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <utility>
#include <vector>

class QNativeGestureEvent;
class QTouchEvent;

namespace ventrik
{

/// What there is to show. The lines' points belong to somebody else and live until the next
/// setData.
struct StripData {
    std::vector<ChartLine> lines;
    std::vector<ChartMark> marks;
    Clock::TimePoint first; ///< from when on and until when there is anything
    Clock::TimePoint last;
};

/// What the strip tells its owner.
struct StripListener {
    std::function<void(Clock::TimePoint)> onMoment = {}; ///< the user chose a moment
    std::function<void()> onLive = {};                   ///< the user wants the present
};

/// Signals over time in a window. It follows the newest, five minutes at most; wheel, pinch, drags
/// and keys show others. A click chooses a moment, which the cursor marks; a second cursor tells
/// differences.
class SignalStrip : public QWidget
{
  public:
    explicit SignalStrip(QWidget* parent = nullptr);

    void setListener(StripListener listener) { _listener = std::move(listener); }
    void setData(StripData shown);
    /// The moment that is shown elsewhere; none for the present, which is followed from then on.
    /// The listener is not told.
    void setCursor(std::optional<Clock::TimePoint> cursor);
    std::optional<Clock::TimePoint> cursor() const { return _cursor; }
    std::optional<Clock::TimePoint> secondCursor() const { return _secondCursor; }
    /// Of the times' labels; see Clock::timeZone.
    void setSecondsFromUtc(std::int32_t seconds);
    void setBands(const QualityBands& bands);

    /// Shows all that there is, also of what comes.
    void fit();
    std::pair<Clock::TimePoint, Clock::TimePoint> shownRange() const;
    bool isFollowing() const { return _range.isFollowing(); }

    /// What is shown, at its size, as a file's content.
    QByteArray png() const;
    std::string svg() const;

    /// What a line tells without a picture: the value at the cursor, or now, and the least and the
    /// greatest of those shown.
    struct Row {
        std::string name;
        std::string value;
        std::string unit;
        std::string minimum;
        std::string maximum;
    };
    std::size_t rowCount() const { return _data.lines.size(); }
    Row row(std::size_t line) const;

    /// Where a time stands, in the widget's coordinates.
    double xOf(Clock::TimePoint time) const { return chart().times().x(time); }

    QSize sizeHint() const override { return {640, 240}; }
    QSize minimumSizeHint() const override { return {200, 120}; }

  protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

  private:
    enum class Grip { None, View, Cursor, SecondCursor };
    enum class Which { First, Second };

    const SignalChart& chart() const;
    ChartPalette chartPalette() const;
    ChartContent chartContent() const;
    ChartLooks chartLooks() const;
    void showAnew();
    void tellMeaning();
    bool hasData() const;
    Clock::TimePoint timeAt(double x) const;
    double lengthOfPixel() const;

    void press(const QPointF& position, double reach);
    void moveTo(const QPointF& position);
    void release(const QPointF& position, bool isSecond);
    void clickedTwice();
    Grip gripAt(double x, double reach) const;
    void zoomAt(double factor, double x);
    bool useTouch(QTouchEvent& event);
    void usePinch(const QTouchEvent& event);
    void tap(const QTouchEvent& event);
    bool useGesture(const QNativeGestureEvent& event);
    bool useKey(const QKeyEvent& event);
    bool useSidewaysKey(const QKeyEvent& event);
    bool dropSecondCursor();
    void zoomByKey(double factor);
    void goLive();

    void choose(Which which, Clock::TimePoint time);
    void step(Which which, bool isForward);
    std::optional<Clock::TimePoint> neighbor(Clock::TimePoint time, bool isForward) const;

    StripListener _listener;
    StripData _data;
    StripRange _range;
    std::optional<Clock::TimePoint> _cursor;
    std::optional<Clock::TimePoint> _secondCursor;
    std::optional<Clock::TimePoint> _cursorBeforeClick;
    std::int32_t _secondsFromUtc = 0;
    QualityBands _bands;
    // Laid out when it is needed; refers to the data.
    mutable std::optional<SignalChart> _chart;

    Grip _grip = Grip::None;
    bool _isDragging = false;
    QPointF _pressPosition;
    Clock::TimePoint _pressFirst;
    double _pinchWidth = 0;
    bool _wasPinched = false;
    std::optional<std::uint64_t> _lastTap; ///< milliseconds
    QPointF _lastTapPosition;
    bool _showsKeyboardFrame = false;
};

} // namespace ventrik
