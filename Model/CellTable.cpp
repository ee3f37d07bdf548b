#include "Model/CellTable.h"

#include "Model/CellPlaces.h"
#include "Model/DisplayNames.h"
#include "Model/NodeRows.h"
#include "Model/PathIndex.h"
#include "Model/StoredNumber.h"
#include "Packets/ChannelNumbers.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cmath>
#include <tuple>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::string_view carrierIndex = "Carrier Index";
constexpr std::string_view servingPilotPath = "/EV-DO/Radio/Serving PN Offset";

// ---- Systems

struct SystemNames {
    std::string_view system;
    std::string_view identity;
    std::string_view level;
    std::string_view quality;
};
constexpr std::array<SystemNames, 6> systemNames{{
    {"LTE", "PCI", "RSRP", "RSRQ"},
    {"UMTS", "PSC", "RSCP", "Ec/Io"},
    {"TD-SCDMA", "CPI", "RSCP", ""},
    {"GSM", "BSIC", "RxLev", ""},
    {"1x", "PN", "", "Ec/Io"},
    {"EV-DO", "PN", "", "Ec/Io"},
}};

constexpr const SystemNames& namesOf(CellSystem system)
{
    return systemNames[static_cast<std::size_t>(system)];
}

// Codes of countries begin with a digit for the part of the world; in the south of America both
// bands are used.
GSMBandHint hintOfCountry(std::string_view code)
{
    if (code.size() != 3)
        return GSMBandHint::None;
    if (code.front() == '3')
        return GSMBandHint::PCS1900;
    return '2' <= code.front() && code.front() <= '6' ? GSMBandHint::DCS1800 : GSMBandHint::None;
}

ChannelFrequency frequencyOf(CellSystem system, std::int64_t channel, GSMBandHint hint)
{
    switch (system) {
    case CellSystem::LTE:
        return downlinkOfEARFCN(channel);
    case CellSystem::UMTS:
        return downlinkOfUARFCN(channel);
    case CellSystem::TimeDividedUMTS:
        return timeDividedUARFCN(channel);
    case CellSystem::GSM:
        return downlinkOfARFCN(channel, hint);
    case CellSystem::OneX:
    case CellSystem::EVDO:
        break;
    }
    return {};
}

// ---- Values

// Repetitions are noted so often; what is older than that by less may be as new.
constexpr std::chrono::seconds timeGrain{1};

// More cells than that nobody looks at, and each is compared with the others.
constexpr std::size_t mostCells = 500;

/// A cell as one place of the display tells it.
struct FoundCell {
    CellRow row;
    Clock::TimePoint namedAt; ///< when its channel was told last
};

/// Reads the cells of a display, place by place.
class CellReader
{
  public:
    explicit CellReader(DisplayMoment& display) : _display(display) { findHint(); }

    std::vector<FoundCell> read();

  private:
    void findHint();
    void readPlaces(const CellPlaces& place);
    void readCell(const CellPlaces& place, const std::string& path);
    void readStrength(const CellPlaces& place, const std::string& path);
    CellKind kindOf(const CellPlaces& place, const std::string& path, std::string_view text);
    const DisplayMoment::Value* valueOf(std::string_view name, const std::string& path) const;
    std::optional<CellLevel> levelOf(const DisplayMoment::Value& value, std::string_view name,
                                     CellRow& row) const;
    Clock::TimePoint readChannel(const CellPlaces& place, const std::string& path, CellRow& row);
    void readBand(const CellPlaces& place, const std::string& path, CellRow& row);
    void readLevels(const CellPlaces& place, const std::string& path, CellRow& row);
    bool isOfFormerChannel(const CellPlaces& place, const CellRow& row) const;
    std::string servingPilot() const;

    DisplayMoment& _display;
    GSMBandHint _hint = GSMBandHint::None;
    std::vector<FoundCell> _cells;
};

std::string_view textAt(const DisplayMoment& display, std::string_view path)
{
    const auto* value = display.valueAt(std::string(path));
    return value ? value->shown.text : std::string_view();
}

void CellReader::findHint()
{
    _hint = hintOfCountry(textAt(_display, countryPlaceOf(_display.technology())));
}

std::vector<FoundCell> CellReader::read()
{
    for (const CellPlaces& place : cellPlacesOf(_display.technology()))
        readPlaces(place);
    return std::move(_cells);
}

void CellReader::readPlaces(const CellPlaces& place)
{
    const std::string path(place.path);
    if (place.shape == CellShape::Group)
        return readCell(place, path);
    for (const ModelNodePointer& node : rowsOf(_display.nodeAtPath(path))) {
        if (_cells.size() >= mostCells)
            return;
        const std::string below = pathJoining(path, node->displayName());
        if (place.shape == CellShape::List)
            readCell(place, below);
        else
            readStrength(place, below);
    }
}

const DisplayMoment::Value* CellReader::valueOf(std::string_view name,
                                                const std::string& path) const
{
    if (name.empty())
        return nullptr;
    const auto* value =
        _display.valueAt(name.starts_with('/') ? std::string(name) : pathJoining(path, name));
    return value && !isPlaceholder(value->shown.text) ? value : nullptr;
}

Clock::TimePoint CellReader::readChannel(const CellPlaces& place, const std::string& path,
                                         CellRow& row)
{
    const auto* value = valueOf(place.names.channel, path);
    const auto number = value ? storedNumber(value->shown) : std::nullopt;
    if (!number)
        return {};
    row.channel = static_cast<std::int64_t>(number->number);
    const ChannelFrequency frequency = frequencyOf(place.system, *row.channel, _hint);
    row.band = frequency.band;
    row.megahertz = frequency.megahertz;
    return value->written;
}

// A label of ours is long; its number is what people call the band class by.
void CellReader::readBand(const CellPlaces& place, const std::string& path, CellRow& row)
{
    if (const auto* value = valueOf(place.names.band, path))
        row.band = value->shown.field ? fmt::format("BC {}", value->shown.raw)
                                      : std::string(value->shown.text);
}

// Levels are in dBm, whatever a record calls them. GSM's are all below 0, and some of its records
// leave the sign and the unit out.
std::optional<CellLevel> CellReader::levelOf(const DisplayMoment::Value& value,
                                             std::string_view name, CellRow& row) const
{
    const auto shown = storedNumber(value.shown);
    if (!shown || !std::isfinite(shown->number))
        return std::nullopt;
    row.told = value.written;
    if (row.system == CellSystem::GSM)
        return CellLevel{name, -std::abs(shown->number), "dBm"};
    const bool isLevel = name == namesOf(row.system).level && !shown->unit.empty();
    return CellLevel{name, shown->number, isLevel ? "dBm" : std::string(shown->unit)};
}

void CellReader::readLevels(const CellPlaces& place, const std::string& path, CellRow& row)
{
    const SystemNames& names = namesOf(place.system);
    if (const auto* quality = valueOf(place.names.quality, path))
        row.quality = levelOf(*quality, names.quality, row);
    if (const auto* level = valueOf(place.names.level, path))
        row.level = levelOf(*level, names.level, row);
}

CellKind CellReader::kindOf(const CellPlaces& place, const std::string& path, std::string_view text)
{
    for (const auto& [beginning, kind] : place.kinds)
        if (text.starts_with(beginning)) {
            const std::string_view carrier = textAt(_display, pathJoining(path, carrierIndex));
            const bool isFurther = !carrier.empty() && carrier != "0";
            return kind == CellKind::Serving && isFurther ? CellKind::Secondary : kind;
        }
    return place.kind;
}

// The list was told before the channel changed that stands elsewhere.
bool CellReader::isOfFormerChannel(const CellPlaces& place, const CellRow& row) const
{
    if (!place.names.channel.starts_with('/'))
        return false;
    const auto* channel = valueOf(place.names.channel, {});
    return channel && channel->changed > row.told + timeGrain;
}

void CellReader::readCell(const CellPlaces& place, const std::string& path)
{
    CellRow row{.system = place.system, .kind = place.kind, .path = path};
    const Clock::TimePoint namedAt = readChannel(place, path, row);
    // Several kinds of cells may stand in a list, each with names of its own.
    if (!row.channel)
        return;
    row.told = namedAt;
    if (const auto* identity = valueOf(place.names.identity, path)) {
        row.identity = identity->shown.text;
        row.told = identity->written;
    }
    readBand(place, path, row);
    readLevels(place, path, row);
    if (const auto* kind = valueOf(place.names.kind, path))
        row.kind = kindOf(place, path, kind->shown.text);
    if (!isOfFormerChannel(place, row))
        _cells.push_back({std::move(row), namedAt});
}

void CellReader::readStrength(const CellPlaces& place, const std::string& path)
{
    const auto* strength = valueOf(path, path);
    if (!strength)
        return;
    CellRow row{.system = place.system, .kind = place.kind, .path = std::string(place.path)};
    readChannel(place, path, row);
    readBand(place, path, row);
    row.identity = path.substr(place.path.size() + 1);
    row.told = strength->written;
    row.quality = levelOf(*strength, namesOf(place.system).quality, row);
    row.kind = kindOf(place, path, strength->shown.text);
    if (place.system == CellSystem::EVDO && row.identity == servingPilot())
        row.kind = CellKind::Serving;
    const Clock::TimePoint told = row.told;
    if (!isOfFormerChannel(place, row))
        _cells.push_back({std::move(row), told});
}

std::string CellReader::servingPilot() const
{
    const auto* pilot = valueOf(servingPilotPath, {});
    return pilot && pilot->shown.number ? fmt::format("{}", *pilot->shown.number) : std::string();
}

// ---- One row for each cell

// Where one place does not tell the identity, the channel is all there is to go by.
bool isSameCell(const CellRow& a, const CellRow& b)
{
    return a.system == b.system && a.channel == b.channel &&
           (a.identity == b.identity || a.identity.empty() || b.identity.empty());
}

/// The serving cell of that system that was named last, or null.
const FoundCell* servingOf(CellSystem system, const std::vector<FoundCell>& cells)
{
    const FoundCell* serving = nullptr;
    for (const FoundCell& cell : cells)
        if (cell.row.kind == CellKind::Serving && cell.row.system == system &&
            (!serving || cell.namedAt > serving->namedAt))
            serving = &cell;
    return serving;
}

/// Leaves out the serving cells that serve no more.
std::vector<CellRow> rowsOf(const std::vector<FoundCell>& cells)
{
    std::vector<CellRow> rows;
    for (const FoundCell& cell : cells)
        if (cell.row.kind != CellKind::Serving ||
            isSameCell(cell.row, servingOf(cell.row.system, cells)->row))
            rows.push_back(cell.row);
    return rows;
}

// The levels of one place belong together, and to the time at which they were told.
void takeOver(CellRow& row, const CellRow& other)
{
    if (row.identity.empty())
        row.identity = other.identity;
    if (other.kind < row.kind) {
        row.kind = other.kind;
        row.path = other.path;
    }
    const bool hasLevels = row.level || row.quality;
    const bool otherHasLevels = other.level || other.quality;
    if (hasLevels != otherHasLevels ? hasLevels : row.told >= other.told)
        return;
    row.level = other.level;
    row.quality = other.quality;
    row.told = other.told;
}

std::vector<CellRow> merged(const std::vector<CellRow>& cells)
{
    std::vector<CellRow> rows;
    for (const CellRow& cell : cells) {
        const auto known =
            std::ranges::find_if(rows, [&](const CellRow& row) { return isSameCell(row, cell); });
        if (known == rows.end())
            rows.push_back(cell);
        else
            takeOver(*known, cell);
    }
    return rows;
}

const std::optional<CellLevel>& strengthOf(const CellRow& row)
{
    return row.level ? row.level : row.quality;
}

void compareWithServing(std::vector<CellRow>& rows)
{
    for (CellRow& row : rows) {
        const auto serving = std::ranges::find_if(rows, [&](const CellRow& other) {
            return other.kind == CellKind::Serving && other.system == row.system;
        });
        if (row.kind == CellKind::Serving || serving == rows.end())
            continue;
        const auto& strength = strengthOf(row);
        const auto& ofServing = strengthOf(*serving);
        if (strength && ofServing && strength->name == ofServing->name)
            row.difference = strength->number - ofServing->number;
    }
}

// Of serving cells the one that was told last comes first.
auto orderOf(const CellRow& row)
{
    const auto& strength = strengthOf(row);
    const auto freshness = row.kind == CellKind::Serving ? -row.told.time_since_epoch().count() : 0;
    return std::tuple(row.kind, freshness, row.system, !strength, strength ? -strength->number : 0);
}

} // namespace

std::string_view nameOf(CellSystem system)
{
    return namesOf(system).system;
}

std::string_view identityNameOf(CellSystem system)
{
    return namesOf(system).identity;
}

std::string_view nameOf(CellKind kind)
{
    static constexpr std::array<std::string_view, 9> names{"Serving",   "Secondary", "Active",
                                                           "Monitored", "Measured",  "Detected",
                                                           "Ranked",    "Neighbor",  "Candidate"};
    return names[static_cast<std::size_t>(kind)];
}

std::vector<CellRow> cellsOf(DisplayMoment& display)
{
    return cellsOf(display, display.time());
}

std::vector<CellRow> cellsOf(DisplayMoment& display, Clock::TimePoint now)
{
    std::vector<CellRow> rows = merged(rowsOf(CellReader(display).read()));
    compareWithServing(rows);
    for (CellRow& row : rows)
        row.age = std::max(now - row.told, std::chrono::nanoseconds(0));
    std::ranges::stable_sort(rows, {}, orderOf);
    return rows;
}

} // namespace ventrik
