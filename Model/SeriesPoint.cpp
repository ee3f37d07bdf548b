#include "Model/SeriesPoint.h"

#include <algorithm>

namespace ventrik
{

void takeNumber(std::vector<SeriesPoint>& points, Clock::TimePoint time,
                std::optional<double> number)
{
    SeriesPoint* last = points.empty() ? nullptr : &points.back();
    if (!number) {
        if (last && !last->isEnd) {
            last->isEnd = true;
            last->until = time;
        }
        return;
    }
    // What stays is heard again.
    if (last && last->from == time)
        *last = {time, time, *number};
    else if (!last || last->isEnd || last->value != *number)
        points.push_back({time, time, *number});
}

void hearAgain(std::vector<SeriesPoint>& points, Clock::TimePoint time)
{
    if (points.empty() || points.back().isEnd)
        return;
    SeriesPoint& last = points.back();
    if (time - last.until > longestHold)
        points.push_back({time, time, last.value});
    else
        last.until = std::max(last.until, time);
}

} // namespace ventrik
