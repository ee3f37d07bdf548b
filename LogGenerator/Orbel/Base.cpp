#include "LogGenerator/Orbel/Base.h"

#include "LogGenerator/Orbel/ArrayLock.h"
#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

struct EcnoStep {
    std::uint32_t from;
    std::int16_t value;
};

// From the top; the first step that the raw value reaches counts. The last two rungs are both -31.
constexpr std::array<EcnoStep, 33> ecnoSteps{{
    {524288, 0},  {417648, -1}, {331809, -2}, {263625, -3}, {209464, -4}, {166442, -5},
    {132269, -6}, {105124, -7}, {83563, -8},  {66436, -9},  {52831, -10}, {42024, -11},
    {33441, -12}, {26622, -13}, {21206, -14}, {16904, -15}, {13487, -16}, {10772, -17},
    {8616, -18},  {6903, -19},  {5543, -20},  {4462, -21},  {3604, -22},  {2922, -23},
    {2241, -24},  {1950, -25},  {1608, -26},  {1337, -27},  {1121, -28},  {950, -29},
    {814, -30},   {757, -31},   {706, -31},
}};

// The same parts of a record by another of its layouts: groups and lists have the same places.
ShownRecord shownBy(const Record& layout, const ShownRecord& shown)
{
    const Record& base = *shown.record;
    ShownRecord other = shown;
    other.record = &layout;
    for (std::size_t i = 0; i < base.groups.size(); ++i)
        if (!shown.fields.empty() && base.groups[i].data() == shown.fields.data())
            other.fields = layout.groups[i];
    for (std::size_t i = 0; i < base.lists.size(); ++i)
        for (ShownList& list : other.lists)
            if (list.list && list.list == base.lists[i])
                list.list = layout.lists[i];
    return other;
}

} // namespace

Base::Base(SystemLog& log, const SectionTable& table) : _log(log), _table(table)
{
    readRecords(RecordsMode::Newer);
}

void Base::readRecords(RecordsMode mode)
{
    _records.clear();
    for (const ShownRecord& shown : _table.shownRecords()) {
        if (shown.record->isExtension && mode != RecordsMode::Extended)
            continue;
        KnownRecord& known = _records.emplace_back(KnownRecord{shown, {}, {}, {}});
        if (mode == RecordsMode::Base)
            continue;
        known.layouts = layoutsOf(shown.record->logCode);
        for (const Layout& layout : known.layouts)
            if (layout.record != shown.record)
                known.newer.push_back(shownBy(*layout.record, shown));
    }
}

void Base::initWithDict(ClassDictionary& classDictionary, CodeDictionary& codeDictionary)
{
    classDictionary[getSectionName()] = this;
    updateLogCodeDict(codeDictionary);
}

void Base::updateSectionRef(const PlistValue& container)
{
    sectionRef = WeakContainer(container);
    _fields.forgetAll();
    _rows.forgetAll();
    _keyedRows.clear();
    log().warning("{}", getSectionName());
}

void Base::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    _log.log(_table.tracePriority, "{}", _table.trace.empty() ? _table.name : _table.trace);
    _lastRead = nullptr;
    const auto known = std::ranges::find(
        _records, logCode, [](const KnownRecord& record) { return record.shown.record->logCode; });
    if (known == _records.end()) {
        if (_table.unknownCode == UnknownCode::Reported)
            logUnknownMessage(logCode);
        return;
    }
    const Record& base = *known->shown.record;
    if (packet.size() < base.minimumSize && !_table.decodesShortRecords)
        return;
    const ChosenLayout chosen = chooseLayout(base, known->layouts, packet);
    // Number by number, as it was read: one block of them would wait until all have been written.
    ReadLayout& last = known->last.emplace();
    last.logCode = logCode;
    last.version = chosen.version;
    last.size = packet.size();
    last.kind = chosen.kind;
    if (base.isExtension && chosen.kind == LayoutKind::NotKnown)
        return; // it has no base layout to fall back on
    _lastRead = &last;
    _current = chosen.record;
    const auto newer = std::ranges::find(known->newer, chosen.record, &ShownRecord::record);
    decode(newer == known->newer.end() ? known->shown : *newer, packet);
}

std::vector<std::uint32_t> Base::getLogCodeArray() const
{
    std::vector<std::uint32_t> codes;
    for (const KnownRecord& known : _records)
        codes.push_back(known.shown.record->logCode);
    return codes;
}

void Base::updateLogCodeDict(CodeDictionary& codeDictionary)
{
    const auto codes = getLogCodeArray();
    log().warning("Array Count: {}", codes.size());
    for (const std::uint32_t code : codes)
        codeDictionary.append(code, *this);
}

void Base::clearElementsInArray(PlistArray& array)
{
    const ArrayLock::Scope locked;
    array.clear();
}

void Base::replaceArray(PlistArray& array, const PlistArray& newElements)
{
    const ArrayLock::Scope locked;
    array.clear();
    array.reserve(newElements.size());
    for (const PlistValue& element : newElements)
        array.append(element);
}

std::int16_t Base::lookUpECNO(std::uint32_t rawValue)
{
    const auto* step = std::ranges::find_if(
        ecnoSteps, [&](std::uint32_t from) { return rawValue >= from; }, &EcnoStep::from);
    return step == ecnoSteps.end() ? std::int16_t{0} : step->value;
}

std::optional<ValueOrigin> Base::originOf(std::string_view key) const
{
    return withVersion(_fields.originOf(key));
}

std::optional<ValueOrigin> Base::originOf(std::string_view listKey, std::size_t row,
                                          std::string_view key) const
{
    const RowList* rows = rowsUnder(listKey);
    return rows ? withVersion(rows->originOf(row, key)) : std::nullopt;
}

std::optional<ShownCell> Base::cellAt(CellPlace& place) const
{
    if (!place.row)
        return _fields.cellOf(place.key, place.slot);
    const RowList* rows = rowsUnder(place.list);
    return rows ? rows->cellOf(*place.row, place.key, place.slot) : std::nullopt;
}

std::vector<ReadLayout> Base::layouts() const
{
    std::vector<ReadLayout> layouts;
    for (const KnownRecord& known : _records)
        if (known.last)
            layouts.push_back(*known.last);
    return layouts;
}

void Base::decode(const ShownRecord& shown, const LogPacket& packet)
{
    showFields(shown, packet);
    for (const auto& [list, isKeptWhileEmpty] : shown.lists) {
        if (!list || (isKeptWhileEmpty && list->elementsOf(packet).count == 0))
            continue;
        if (list->key.empty())
            showRows(*shown.record, *list, packet);
        else
            showKeyedRows(*shown.record, *list, packet);
    }
    if (shown.cells)
        showMonitoredCells(shown, packet);
    if (shown.emptiesRows)
        rewriteRows(*shown.record);
}

void Base::show(const Field& field, std::int64_t raw, std::size_t start)
{
    if (auto dictionary = beginFields())
        _fields.show(*dictionary, field, raw, start);
}

void Base::showNumber(const Field& field, double number)
{
    if (auto dictionary = beginFields())
        _fields.showNumber(*dictionary, field, number);
}

void Base::showValue(std::string_view key, PlistValue value)
{
    if (auto dictionary = beginFields())
        _fields.showValue(*dictionary, key, std::move(value));
}

void Base::showFields(const ShownRecord& shown, const LogPacket& packet)
{
    if (shown.fields.empty())
        return;
    if (shown.record->carrier && numberAt(packet, *shown.record->carrier) != 0)
        return; // an added carrier's are not the serving cell's
    if (!shown.superseded.empty())
        withdraw(shown.superseded);
    if (auto dictionary = beginFields())
        _fields.show(*dictionary, shown.fields, packet);
}

void Base::withdraw(std::string_view key)
{
    if (auto dictionary = sectionRef.dictionary())
        dictionary->remove(key);
}

std::optional<PlistDictionary> Base::beginFields()
{
    auto dictionary = sectionRef.dictionary();
    if (dictionary)
        _fields.begin(*dictionary, _current);
    return dictionary;
}

RowList::Rewrite Base::rewriteRows(const Record& record)
{
    return {_rows, sectionRef.array(), record};
}

void Base::showRows(const Record& record, const List& list, const LogPacket& packet)
{
    rewriteRows(record).showElements(list, packet);
}

void Base::showKeyedRows(const Record& record, const List& list, const LogPacket& packet)
{
    auto dictionary = sectionRef.dictionary();
    if (!dictionary)
        return;
    auto keyed = std::ranges::find(_keyedRows, list.key, &KeyedRows::key);
    if (keyed == _keyedRows.end())
        keyed = _keyedRows.insert(keyed, {list.key, {}, {}});
    keyed->array = RowList::Rewrite(keyed->rows, keyed->array, record, RowList::Containers::Copied)
                       .showElements(list, packet);
    const PlistValue* present = dictionary->find(list.key);
    if (!present || !present->array() || !present->array()->isSameContainer(keyed->array))
        dictionary->set(list.key, keyed->array);
}

void Base::showMonitoredCells(const ShownRecord& shown, const LogPacket& packet)
{
    const MonitoredCells& monitored = *shown.cells;
    const bool areNeighbors = monitored.kind == MonitoredCells::Kind::Neighbors;
    const auto cells = parseCellMonitorArray(packet, _log);
    if (!cells) {
        _log.error("Failed to get Cell Array\n");
        if (areNeighbors)
            rewriteRows(*shown.record);
        return;
    }
    if (areNeighbors)
        return showNeighbors(shown, *cells);
    const PlistDictionary* serving = servingCell(*cells, monitored.technologies);
    if (!serving)
        return;
    for (const CellField& field : monitored.fields)
        if (const auto number = cellFieldNumber(*serving, field, monitored.nameInLog, _log))
            show(field.field, *number);
}

void Base::showNeighbors(const ShownRecord& shown, const PlistArray& cells)
{
    const MonitoredCells& monitored = *shown.cells;
    RowList::Rewrite rows = rewriteRows(*shown.record);
    for (const PlistValue& element : cells) {
        const PlistDictionary* cell = element.dictionary();
        if (!cell || !isCell(*cell, monitored.technologies, kQXCellMonitorCellTypeNeighbor))
            continue;
        rows.nextRow();
        for (const CellField& field : monitored.fields)
            if (const auto number = cellFieldNumber(*cell, field, monitored.nameInLog, _log))
                rows.show(field.field, *number);
    }
}

const RowList* Base::rowsUnder(std::string_view listKey) const
{
    if (listKey.empty())
        return &_rows;
    const auto keyed = std::ranges::find(_keyedRows, listKey, &KeyedRows::key);
    return keyed == _keyedRows.end() ? nullptr : &keyed->rows;
}

std::optional<ValueOrigin> Base::withVersion(std::optional<ValueOrigin> origin) const
{
    if (!origin)
        return origin;
    for (const KnownRecord& known : _records)
        if (known.last && known.last->logCode == origin->record->logCode)
            origin->version = known.last->version;
    return origin;
}

void Base::logUnknownMessage(std::uint32_t logCode) const
{
    log().error("Received an unknown log message: {}", static_cast<std::int32_t>(logCode));
}

} // namespace ventrik
