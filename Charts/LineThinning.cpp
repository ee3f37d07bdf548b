#include "Charts/LineThinning.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <optional>
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

} // namespace

LineRuns thinnedLine(std::span<const SeriesPoint> points, const TimeScale& times,
                     const ValueScale& values)
{
    LineRuns runs;
    ColumnRun run;
    // What is outside ends just behind the edges.
    const auto xOf = [&](Clock::TimePoint time) {
        return std::clamp(times.x(time), times.left() - 1, times.right() + 1);
    };
    const SeriesPoint* before = nullptr;
    const auto near = pointsWithin(points, times.time(times.left()), times.time(times.right()));
    for (const SeriesPoint& point : near) {
        if (!std::isfinite(point.value))
            continue;
        const double x = xOf(point.from);
        const bool follows = before && leadsOn(*before, point);
        if (follows)
            run.add({x, values.y(before->value)});
        else if (before && !run.isIn(std::floor(x)))
            runs.push_back(run.finish());
        const double y = values.y(point.value);
        run.add({x, y});
        run.add({xOf(point.until), y});
        before = &point;
    }
    if (before)
        runs.push_back(run.finish());
    return runs;
}

} // namespace ventrik
