#include "LogGenerator/Orbel/RowList.h"

#include <algorithm>
#include <bit>
#include <utility>

namespace ventrik
{

namespace
{

PlistArray arrayOfTexts(std::size_t count)
{
    PlistArray texts;
    texts.reserve(count);
    for (std::size_t i = 0; i < count; ++i)
        texts.append("");
    return texts;
}

} // namespace

std::optional<ValueOrigin> RowList::originOf(std::size_t row, std::string_view key) const
{
    if (row >= _rows.size())
        return std::nullopt;
    for (const Cell& cell : _rows[row].cells)
        if (cell.field && !cell.isWorkedOut && cell.field->key == key)
            return ValueOrigin{_rows[row].record, std::nullopt, cell.field, _rows[row].start,
                               cell.raw};
    return std::nullopt;
}

std::optional<ShownCell> RowList::cellOf(std::size_t row, std::string_view& key,
                                         std::size_t& slot) const
{
    if (row >= _rows.size())
        return std::nullopt;
    const std::vector<Cell>& cells = _rows[row].cells;
    // Once found, the two are one text.
    const bool isThere = slot < cells.size() && cells[slot].field &&
                         cells[slot].field->key.data() == key.data() &&
                         cells[slot].field->key.size() == key.size();
    if (!isThere) {
        const auto found = std::ranges::find_if(
            cells, [key](const Cell& known) { return known.field && known.field->key == key; });
        if (found == cells.end())
            return std::nullopt;
        slot = static_cast<std::size_t>(found - cells.begin());
        key = found->field->key;
    }
    const Cell& cell = cells[slot];
    return ShownCell{cell.field, cell.raw,
                     cell.isWorkedOut ? std::optional(static_cast<double>(cell.raw))
                                      : std::nullopt};
}

const FieldBytes& RowList::tableOf(std::span<const Field> fields)
{
    for (const FieldBytes& table : _tables)
        if (table.areOf(fields))
            return table;
    return _tables.emplace_back(fields);
}

RowList::Rewrite::Rewrite(RowList& list, std::optional<PlistArray> array, const Record& record,
                          Containers containers)
    : _list(list),
      _isDetached(!array),
      _areCopied(containers == Containers::Copied),
      _isArrayToCopy(_areCopied),
      _array(_isDetached ? PlistArray() : std::move(*array)),
      _record(record)
{
    if (_array.size() == _list._rows.size())
        return;
    // Somebody else wrote the list since.
    _list.forgetAll();
    copyArray();
    _array.clear();
}

RowList::Rewrite::~Rewrite()
{
    endList();
    if (_isDetached)
        _list.forgetAll();
}

void RowList::Rewrite::nextRow(std::size_t start)
{
    beginRow(start);
    const bool isNew = _count > _array.size();
    _isRowToCopy = _areCopied && !isNew;
    if (isNew) {
        copyArray();
        _array.append(row().values);
    }
}

void RowList::Rewrite::nextText(const Field& field, std::int64_t raw, std::size_t start)
{
    beginRow(start);
    const bool isNew = _count > _array.size();
    if (!isNew && isShown(field, raw, false))
        return;
    copyArray();
    std::string text = _list._texts.textOf(field, raw).value_or("");
    if (isNew)
        _array.append(std::move(text));
    else
        _array.replace(_count - 1, std::move(text));
    row().cells.assign(1, {&field, raw, false});
    _cells = 1;
}

void RowList::Rewrite::beginRow(std::size_t start)
{
    endRow();
    if (_count == _list._rows.size())
        _list._rows.emplace_back();
    ++_count;
    _cells = 0;
    row().record = &_record;
    row().start = start;
}

void RowList::Rewrite::show(const Field& field, std::int64_t raw)
{
    if (isShown(field, raw, false))
        return;
    if (const auto& text = _list._texts.textOf(field, raw))
        nextValue(field.key, {&field, raw, false}).setText(*text);
}

void RowList::Rewrite::showWorkedOut(const Field& field, std::int64_t number)
{
    if (!isShown(field, number, true))
        nextValue(field.key, {&field, number, true}) =
            field.shown.textOfNumber(static_cast<double>(number));
}

void RowList::Rewrite::showValue(std::string_view key, PlistValue value)
{
    nextValue(key, {nullptr, 0, true}) = std::move(value);
}

void RowList::Rewrite::show(std::span<const Field> fields, const LogPacket& element)
{
    if (_cells != 0 || fields.size() > FieldBytes::maximumFields)
        return showAll(fields, element);
    const FieldBytes& table = _list.tableOf(fields);
    const std::uint64_t changed = table.changesIn(element, row().words);
    const bool isKnown = std::exchange(row().table, nullptr) == &table;
    if (!isKnown || !showChanged(fields, changed, element)) {
        _cells = 0;
        showAll(fields, element);
    }
    // A number that shows nothing has no cell.
    if (_cells == fields.size())
        row().table = &table;
}

bool RowList::Rewrite::showChanged(std::span<const Field> fields, std::uint64_t changed,
                                   const LogPacket& element)
{
    for (; changed != 0; changed &= changed - 1) {
        _cells = static_cast<std::size_t>(std::countr_zero(changed));
        const std::size_t cell = _cells;
        show(fields[cell], numberOf(element, fields[cell]));
        // It shows nothing now, or somebody else changed the row's keys.
        if (_cells == cell || row().cells.size() < fields.size())
            return false;
    }
    _cells = fields.size();
    return true;
}

void RowList::Rewrite::showAll(std::span<const Field> fields, const LogPacket& element)
{
    for (const Field& field : fields)
        show(field, numberOf(element, field));
}

void RowList::Rewrite::showTexts(const Field& field, std::int64_t raw, const Field& element)
{
    if (isShown(field, raw, false))
        return;
    const unsigned width = element.place.width;
    const std::size_t count = field.place.width / width;
    const auto part = [&](std::int64_t number, std::size_t i) {
        return number >> (width * i) & ((std::int64_t{1} << width) - 1);
    };
    const std::vector<Cell>& cells = row().cells;
    const bool wasShown = _cells < cells.size() && cells[_cells].field == &field;
    const std::int64_t before = wasShown ? cells[_cells].raw : 0;
    PlistValue& value = nextValue(field.key, {&field, raw, false});
    // Whoever else holds the texts keeps them as they were.
    const PlistArray* present = value.array();
    const bool isKept =
        wasShown && present && present->size() == count && present->handleCount() == 1;
    if (!isKept)
        value = arrayOfTexts(count);
    for (std::size_t i = 0; i < count; ++i)
        if (!isKept || part(raw, i) != part(before, i))
            value.array()->replace(i, _list._texts.textOf(element, part(raw, i)).value_or(""));
}

PlistArray RowList::Rewrite::showElements(const List& list, const LogPacket& packet)
{
    const RecordElements elements = list.elementsOf(packet);
    const std::size_t count = elements.completeIn(packet);
    const bool isOfTexts = list.fields.size() == 1 && list.fields.front().key.empty();
    for (std::size_t i = 0; i < count; ++i) {
        const LogPacket element = elements.element(packet, i);
        const std::size_t start = elements.offset + elements.stride * i;
        if (isOfTexts) {
            nextText(list.fields.front(), numberOf(element, list.fields.front()), start);
        } else {
            nextRow(start);
            show(list.fields, element);
        }
    }
    endList();
    return _array;
}

bool RowList::Rewrite::isShown(const Field& field, std::int64_t raw, bool isWorkedOut)
{
    const std::vector<Cell>& cells = row().cells;
    if (_cells == cells.size() || cells[_cells].field != &field || cells[_cells].raw != raw ||
        cells[_cells].isWorkedOut != isWorkedOut)
        return false;
    ++_cells;
    return true;
}

PlistValue& RowList::Rewrite::nextValue(std::string_view key, Cell cell)
{
    copyRow();
    Row& row = this->row();
    if (row.table && _cells < row.table->fieldCount())
        row.table = nullptr;
    PlistDictionary::Entry* entry = row.values.entryAt(_cells);
    if (!entry || entry->key != key) {
        // Another kind of row stood here.
        row.values.truncate(_cells);
        row.values.set(key, "");
        entry = row.values.entryAt(_cells);
    }
    row.cells.resize(row.values.size());
    row.cells[_cells++] = cell;
    return entry->value;
}

void RowList::Rewrite::endRow()
{
    if (_count == 0 || row().cells.size() == _cells)
        return;
    copyRow();
    row().values.truncate(_cells);
    row().cells.resize(_cells);
    if (row().table && _cells < row().table->fieldCount())
        row().table = nullptr;
}

void RowList::Rewrite::endList()
{
    endRow();
    if (_array.size() == _count)
        return;
    copyArray();
    _array.truncate(_count);
    _list._rows.resize(_count);
}

void RowList::Rewrite::copyArray()
{
    if (std::exchange(_isArrayToCopy, false))
        _array = _array.copy();
}

void RowList::Rewrite::copyRow()
{
    if (!std::exchange(_isRowToCopy, false))
        return;
    copyArray();
    row().values = row().values.copy();
    _array.replace(_count - 1, row().values);
}

} // namespace ventrik
