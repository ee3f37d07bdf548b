#include "Charts/LineThinning.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <utility>

namespace ventrik
{

namespace
{

/// The corners of one run, of which it keeps few for each column of pixels.
class ColumnRun
{
  public:
    void add(Point corner)
    {
        const double column = std::floor(corner.x);
        if (_count == 0 || column != _column)
            begin(column);
        if (_count < _corners.size())
            _corners[_count] = corner;
        if (_count == 0 || corner.y < _top.y)
            take(_top, _topPlace, corner);
        if (_count == 0 || corner.y > _bottom.y)
            take(_bottom, _bottomPlace, corner);
        _last = corner;
        ++_count;
    }

    bool isEmpty() const { return _count == 0 && _kept.empty(); }
    bool isIn(double column) const { return _count > 0 && column == _column; }

    /// What has been kept; the next run begins.
    std::vector<Point> finish()
    {
        flush();
        _count = 0;
        return std::exchange(_kept, {});
    }

  private:
    void begin(double column)
    {
        flush();
        _count = 0;
        _column = column;
    }

    void take(Point& extreme, std::size_t& place, Point corner)
    {
        extreme = corner;
        place = _count;
    }

    void flush()
    {
        const auto few = std::min(_count, _corners.size());
        if (_count <= _corners.size()) {
            _kept.insert(_kept.end(), _corners.begin(), _corners.begin() + few);
            return;
        }
        const bool isTopFirst = _topPlace < _bottomPlace;
        for (const Point& corner :
             {_corners[0], isTopFirst ? _top : _bottom, isTopFirst ? _bottom : _top, _last})
            _kept.push_back(corner);
    }

    std::vector<Point> _kept;
    std::array<Point, 4> _corners;
    std::size_t _count = 0;
    double _column = 0;
    Point _top;
    Point _bottom;
    std::size_t _topPlace = 0;
    std::size_t _bottomPlace = 0;
    Point _last;
};

/// The column of pixels that the newest corner is in, as times and values. Most points of a dense
/// line are within, and tell nothing new.
class OpenColumn
{
  public:
    bool holds(const SeriesPoint& point) const
    {
        return point.until < _end && point.value >= _least && point.value <= _greatest;
    }
    void add(double x, double value, const TimeScale& times)
    {
        const double column = std::floor(x);
        if (column != _column) {
            _column = column;
            _end = times.time(column + 1);
            _least = _greatest = value;
        }
        _least = std::min(_least, value);
        _greatest = std::max(_greatest, value);
    }

  private:
    double _column = std::numeric_limits<double>::quiet_NaN();
    Clock::TimePoint _end = Clock::TimePoint::min();
    double _least = 0;
    double _greatest = 0;
};

/// Makes the runs of one line.
class Thinning
{
  public:
    Thinning(const TimeScale& times, const ValueScale& values) : _times(times), _values(values) {}

    void add(const SeriesPoint& point)
    {
        if (_column.holds(point)) {
            _before = _within = &point;
            return;
        }
        addWithin();
        if (std::isfinite(point.value))
            addCorners(point);
        _before = &point; // no line leads on from what is no number
    }

    LineRuns finish()
    {
        addWithin();
        endRun();
        return std::move(_runs);
    }

  private:
    // What is outside ends just behind the edges.
    double xOf(Clock::TimePoint time) const
    {
        return std::clamp(_times.x(time), _times.left() - 1, _times.right() + 1);
    }

    void endRun()
    {
        if (!_run.isEmpty())
            _runs.push_back(_run.finish());
    }

    void addCorners(const SeriesPoint& point)
    {
        const double from = xOf(point.from);
        if (_before && leadsOn(*_before, point))
            _run.add({from, _values.y(_before->value)});
        else if (_before && !_run.isIn(std::floor(from)))
            endRun();
        const double until = xOf(point.until);
        _run.add({from, _values.y(point.value)});
        _run.add({until, _values.y(point.value)});
        _column.add(until, point.value, _times);
    }

    // Of the points within a column only the newest is a corner: the line goes on from there.
    void addWithin()
    {
        if (_within)
            _run.add({xOf(_within->until), _values.y(_within->value)});
        _within = nullptr;
    }

    const TimeScale& _times;
    const ValueScale& _values;
    LineRuns _runs;
    ColumnRun _run;
    OpenColumn _column;
    const SeriesPoint* _before = nullptr;
    const SeriesPoint* _within = nullptr;
};

} // namespace

LineRuns thinnedLine(std::span<const SeriesPoint> points, const TimeScale& times,
                     const ValueScale& values)
{
    Thinning thinning(times, values);
    for (const SeriesPoint& point :
         pointsWithin(points, times.time(times.left()), times.time(times.right())))
        thinning.add(point);
    return thinning.finish();
}

} // namespace ventrik
