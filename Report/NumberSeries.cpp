#include "Report/NumberSeries.h"

#include "Model/PinnedSeries.h"

#include <algorithm>

namespace ventrik
{

NumberSeries::NumberSeries(const ChangeStore& store)
    : _places(store.places()), _lineAt(store.places().size(), none)
{
    for (const StoredChange& change : store.standing())
        take(change.place, change);
    store.visit(store.firstMoment(), *this);
    for (std::size_t line = 0; line < _lines.size(); ++line) {
        if (const auto last = store.lastHeard(_codes[line]))
            heard(*last, _codes[line]);
        settle(line);
    }
}

// With a group goes what it holds.
void NumberSeries::changed(const StoredChange& change)
{
    if (change.kind == DisplayChange::Kind::Gone) {
        std::vector<PlaceId> pending{_places[change.place].below};
        while (!pending.empty()) {
            const PlaceId gone = pending.back();
            pending.pop_back();
            pending.insert(pending.end(), _places[gone].below.begin(), _places[gone].below.end());
            take(gone, change);
        }
    }
    take(change.place, change);
}

void NumberSeries::heard(Clock::TimePoint time, std::uint32_t logCode)
{
    const auto [known, isFirst] = _heard.emplace(logCode, time);
    if (!isFirst && time - known->second > longestHold)
        beginBehindGap(logCode, time);
    known->second = time;
}

// Only here the lines of all places are gone through: else what is heard can wait for `settle`.
void NumberSeries::beginBehindGap(std::uint32_t logCode, Clock::TimePoint time)
{
    for (std::size_t line = 0; line < _lines.size(); ++line) {
        if (_codes[line] != logCode)
            continue;
        settle(line);
        hear(_lines[line].points, time);
    }
}

void NumberSeries::hear(std::vector<SeriesPoint>& points, Clock::TimePoint time)
{
    const std::size_t before = points.size();
    if (_pointsBehindGaps < mostBehindGaps)
        hearAgain(points, time);
    else if (!points.empty())
        points.back().isEnd = true;
    _pointsBehindGaps += points.size() - before;
}

void NumberSeries::take(PlaceId place, const StoredChange& change)
{
    if (_lineAt[place] == none) {
        if (!change.value.number)
            return;
        _lineAt[place] = static_cast<std::uint32_t>(_lines.size());
        _lines.push_back({place, {}, 0, {}});
        _codes.push_back(change.logCode);
        _leaveOutSign.push_back(isLevelWithoutSign(_places.pathOf(place)));
    }
    const std::size_t index = _lineAt[place];
    NumberLine& line = _lines[index];
    settle(index);
    _codes[index] = change.logCode;
    _heard.emplace(change.logCode, change.time);
    if (_leaveOutSign[index])
        line.unit = "dBm";
    else if (!change.value.unit.empty())
        line.unit = change.value.unit;
    std::optional<double> number = change.value.number;
    if (number && _leaveOutSign[index])
        number = drawnLevel(*number);
    if (number && !line.points.empty() && line.points.back().value != *number)
        ++line.changeCount;
    takeNumber(line.points, change.time, number);
}

// What its record told again, without a gap, before another one changes it.
void NumberSeries::settle(std::size_t line)
{
    std::vector<SeriesPoint>& points = _lines[line].points;
    const auto last = _heard.find(_codes[line]);
    if (last != _heard.end() && !points.empty() && !points.back().isEnd)
        points.back().until = std::max(points.back().until, last->second);
}

} // namespace ventrik
