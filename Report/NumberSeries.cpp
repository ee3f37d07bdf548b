#include "Report/NumberSeries.h"

namespace ventrik
{

NumberSeries::NumberSeries(const ChangeStore& store)
    : _places(store.places()), _lineAt(store.places().size(), none)
{
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
    _heard[logCode] = time;
}

void NumberSeries::take(PlaceId place, const StoredChange& change)
{
    if (_lineAt[place] == none) {
        if (!change.value.number)
            return;
        _lineAt[place] = static_cast<std::uint32_t>(_lines.size());
        _lines.push_back({place, {}, 0, {}});
        _codes.push_back(change.logCode);
    }
    const std::size_t index = _lineAt[place];
    NumberLine& line = _lines[index];
    settle(index);
    _codes[index] = change.logCode;
    if (!change.value.unit.empty())
        line.unit = change.value.unit;
    if (change.value.number && !line.points.empty() &&
        line.points.back().value != *change.value.number)
        ++line.changeCount;
    takeNumber(line.points, change.time, change.value.number);
}

// What its record told again before another one changes it.
void NumberSeries::settle(std::size_t line)
{
    if (const auto last = _heard.find(_codes[line]); last != _heard.end())
        hearAgain(_lines[line].points, last->second);
}

} // namespace ventrik
