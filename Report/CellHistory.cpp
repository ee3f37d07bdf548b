#include "Report/CellHistory.h"

#include "Charts/ChartLine.h"
#include "Model/CellPlaces.h"

#include <algorithm>
#include <array>
#include <tuple>

namespace ventrik
{

namespace
{

// What is told again changes nothing, but its time.
constexpr std::chrono::seconds longestUnseen{5};

// Beyond so many places looked at, a second passes between looks, then two, and so on.
constexpr std::size_t mostSpent = 40'000'000;

bool isBelow(std::string_view path, std::string_view holder)
{
    return path.size() > holder.size() && path.starts_with(holder) && path[holder.size()] == '/';
}

bool isName(std::string_view path, std::string_view name)
{
    if (name.starts_with('/'))
        return path == name;
    return !name.empty() && path.substr(path.rfind('/') + 1) == name;
}

bool isOfCells(std::string_view path, const CellPlaces& places)
{
    const CellNames& names = places.names;
    const bool isInside = isBelow(path, places.path);
    if (isInside && places.shape == CellShape::Strengths)
        return true;
    const std::array all{names.channel, names.identity, names.level,
                         names.quality, names.kind,     names.band};
    return std::ranges::any_of(all, [&](std::string_view name) {
        return (isInside || name.starts_with('/')) && isName(path, name);
    });
}

/// Where something changed.
class ChangedPlaces : public StoreVisitor
{
  public:
    void changed(const StoredChange& change) override
    {
        places.push_back(change.place);
        hasGroups = hasGroups || change.kind != DisplayChange::Kind::Shown;
    }

    std::vector<PlaceId> places;
    bool hasGroups = false;
};

void takeLevel(CellLevels& levels, const std::optional<CellLevel>& level)
{
    if (level)
        levels.take(*level);
}

} // namespace

void CellLevels::take(const CellLevel& level)
{
    best = name.empty() ? level.number : std::max(best, level.number);
    last = level.number;
    name = level.name;
    unit = level.unit;
}

void CellLevels::stay(std::chrono::nanoseconds duration)
{
    const double added = std::chrono::duration<double>(duration).count();
    sum += last * added;
    seconds += added;
}

void CellHistory::update()
{
    if (_store.isEmpty() && !_time)
        return; // nothing shows yet
    const Clock::TimePoint now = _store.lastTime();
    pass(now);
    if (now - _lastLook >= longestUnseen || (_next != _store.present() && isRelevant()))
        _isOutdated = true;
    _next = _store.present();
    if (_isOutdated && (_step.count() == 0 || now - _lastLook >= _step))
        look(now);
}

// The time since the last message.
void CellHistory::pass(Clock::TimePoint now)
{
    const Clock::TimePoint before = _time.value_or(now);
    _time = now;
    _whole += now - before;
    if (now - before > longestHold) {
        _silence += now - before;
        return;
    }
    for (const Present& present : _present) {
        // Another system may serve by now.
        if (before - present.told > longestHold)
            continue;
        SeenCell& cell = _cells[present.cell];
        if (present.isServing) {
            cell.served += now - before;
            cell.last = now;
        }
        if (present.hasLevel)
            cell.level.stay(now - before);
        if (present.hasQuality)
            cell.quality.stay(now - before);
    }
}

bool CellHistory::isRelevant()
{
    if (_generation != _store.generation())
        _matters.clear();
    _generation = _store.generation();
    ChangedPlaces changes;
    _store.visit(std::max(_next, _store.firstMoment()), changes);
    return changes.hasGroups ||
           std::ranges::any_of(changes.places, [&](PlaceId place) { return matters(place); });
}

bool CellHistory::matters(PlaceId place)
{
    if (place >= _matters.size())
        _matters.resize(_store.places().size());
    std::optional<bool>& known = _matters[place];
    if (!known) {
        const std::string path = _store.places().pathOf(place);
        known =
            std::ranges::any_of(cellPlacesOf(_store.technologyAt(_store.present())),
                                [&](const CellPlaces& cells) { return isOfCells(path, cells); });
    }
    return *known;
}

void CellHistory::look(Clock::TimePoint now)
{
    DisplayMoment display = _store.at(_store.present());
    _present.clear();
    for (const CellRow& row : cellsOf(display, now))
        take(row, now);
    _isOutdated = false;
    _lastLook = now;
    spend();
}

void CellHistory::take(const CellRow& row, Clock::TimePoint now)
{
    const auto found = find(row, now);
    if (!found)
        return;
    SeenCell& cell = _cells[*found];
    cell.kind = std::min(cell.kind, row.kind);
    cell.last = std::max(cell.last, row.told);
    if (!row.band.empty())
        cell.band = row.band;
    takeLevel(cell.level, row.level);
    takeLevel(cell.quality, row.quality);
    _present.push_back({*found, row.kind == CellKind::Serving, row.level.has_value(),
                        row.quality.has_value(), row.told});
}

std::optional<std::size_t> CellHistory::find(const CellRow& row, Clock::TimePoint now)
{
    const auto found = std::ranges::find_if(_cells, [&](const SeenCell& cell) {
        return cell.system == row.system && cell.channel == row.channel &&
               cell.identity == row.identity;
    });
    if (found != _cells.end())
        return static_cast<std::size_t>(found - _cells.begin());
    if (_cells.size() >= mostCells) {
        _isFull = true;
        return std::nullopt;
    }
    _cells.push_back({.system = row.system,
                      .kind = row.kind,
                      .channel = row.channel,
                      .identity = row.identity,
                      .first = now});
    return _cells.size() - 1;
}

void CellHistory::spend()
{
    _spent += _store.places().size() + _present.size() * _cells.size();
    if (_spent < mostSpent)
        return;
    _step = std::max<std::chrono::nanoseconds>(std::chrono::seconds(1), _step * 2);
    _spent = 0;
}

std::vector<SeenCell> CellHistory::cells() const
{
    std::vector<SeenCell> cells = _cells;
    std::ranges::stable_sort(cells, {}, [](const SeenCell& cell) {
        return std::tuple(-cell.served.count(), cell.first.time_since_epoch().count());
    });
    return cells;
}

} // namespace ventrik
