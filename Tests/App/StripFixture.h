#pragma once

#include "App/Strip/SignalStrip.h"
#include "Tests/App/TestScreen.h"
#include "Tests/Charts/ChartTimes.h"

#include <QWheelEvent>

#include <gtest/gtest.h>

#include <deque>
#include <vector>

namespace ventrik
{

/// A strip of 600 by 300 with two lines over the 20 minutes from `morning` on: RSRP every ten
/// seconds (-100, -99, ..., and again from -80), RSRQ every 30 seconds, five seconds later.
class StripFixture : public testing::Test
{
  protected:
    static constexpr int minutes = 20;

    StripFixture()
    {
        strip.setListener(
            {[this](Clock::TimePoint time) { moments.push_back(time); }, [this] { ++livesAsked; }});
        showAt(strip, 600, 300);
        setDataUntil(minutes * 60);
    }

    void setDataUntil(double last)
    {
        std::vector<SeriesPoint> rsrp;
        for (int begin = 0; begin < last; begin += 10)
            rsrp.push_back(point(begin, begin + 9, -100 + begin / 10 % 20));
        std::vector<SeriesPoint> rsrq;
        for (int begin = 5; begin < last; begin += 30)
            rsrq.push_back(point(begin, begin + 25, -9.5));
        setLines({{"RSRP", "dBm", keep(std::move(rsrp))}, {"RSRQ", "dB", keep(std::move(rsrq))}},
                 last);
    }
    void setLines(std::vector<ChartLine> lines, double last)
    {
        strip.setData({std::move(lines), {{at(600), "301 → 302"}}, at(0), at(last)});
    }
    std::span<const SeriesPoint> keep(std::vector<SeriesPoint> points)
    {
        return kept.emplace_back(std::move(points));
    }

    /// Seconds after `morning`.
    static double seconds(Clock::TimePoint time)
    {
        return std::chrono::duration<double>(time - at(0)).count();
    }
    double first() const { return seconds(strip.shownRange().first); }
    double last() const { return seconds(strip.shownRange().second); }
    double length() const { return last() - first(); }
    std::optional<double> cursor() const { return secondsOf(strip.cursor()); }
    std::optional<double> secondCursor() const { return secondsOf(strip.secondCursor()); }

    QPoint placeOf(double second) const { return {qRound(strip.xOf(at(second))), 150}; }
    double secondAt(int x) const
    {
        const double start = strip.xOf(at(0));
        return (x - start) / (strip.xOf(at(1)) - start);
    }
    /// Of one pixel.
    double step() const { return secondAt(101) - secondAt(100); }

    void click(double second, Qt::KeyboardModifiers modifiers = {})
    {
        QTest::mouseClick(&strip, Qt::LeftButton, modifiers, placeOf(second));
    }
    void doubleClick(QPoint place)
    {
        QTest::mouseClick(&strip, Qt::LeftButton, {}, place);
        QTest::mouseDClick(&strip, Qt::LeftButton, {}, place);
    }
    void drag(QPoint from, QPoint to)
    {
        QTest::mousePress(&strip, Qt::LeftButton, {}, from);
        QTest::mouseMove(&strip, (from + to) / 2);
        QTest::mouseMove(&strip, to);
        QTest::mouseRelease(&strip, Qt::LeftButton, {}, to);
    }
    void wheel(QPoint place, QPoint angle)
    {
        QWheelEvent event(place, strip.mapToGlobal(place), {}, angle, Qt::NoButton, {},
                          Qt::NoScrollPhase, false);
        QCoreApplication::sendEvent(&strip, &event);
    }
    void key(int pressed, Qt::KeyboardModifiers modifiers = {})
    {
        QTest::keyClick(&strip, static_cast<Qt::Key>(pressed), modifiers);
    }

  private:
    static std::optional<double> secondsOf(const std::optional<Clock::TimePoint>& time)
    {
        return time ? std::optional(seconds(*time)) : std::nullopt;
    }

    std::deque<std::vector<SeriesPoint>> kept;

  protected:
    SignalStrip strip;
    std::vector<Clock::TimePoint> moments; ///< that the strip told
    int livesAsked = 0;
};

} // namespace ventrik
