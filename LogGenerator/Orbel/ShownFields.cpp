#include "LogGenerator/Orbel/ShownFields.h"

#include <algorithm>
#include <bit>
#include <utility>

namespace ventrik
{

void ShownFields::forgetAll()
{
    _memory.forgetNumbers();
    ++_handovers;
}

void ShownFields::begin(const PlistDictionary& dictionary, const Record* record)
{
    _record = record;
    if (_removals == dictionary.removalCount())
        return;
    _removals = dictionary.removalCount();
    forgetAll();
}

void ShownFields::show(PlistDictionary& dictionary, const Field& field, std::int64_t raw)
{
    show(dictionary, _memory.slotOf(field), field, raw, nullptr);
}

void ShownFields::show(PlistDictionary& dictionary, std::span<const Field> fields,
                       const LogPacket& packet)
{
    for (; fields.size() > FieldBytes::maximumFields;
         fields = fields.subspan(FieldBytes::maximumFields))
        show(dictionary, fields.first(FieldBytes::maximumFields), packet);
    Table& table = tableOf(fields);
    std::uint64_t changed = table.bytes.changesIn(packet, table.words);
    for (; table.handovers == _handovers && changed != 0; changed &= changed - 1)
        show(dictionary, table, static_cast<std::size_t>(std::countr_zero(changed)), packet);
    if (table.handovers == _handovers)
        return;
    // A key of these fields may show what another one wrote.
    for (std::size_t i = 0; i < fields.size(); ++i)
        show(dictionary, table, i, packet);
    table.handovers = table.hasKeyTwice ? 0 : _handovers;
}

void ShownFields::show(PlistDictionary& dictionary, const Table& table, std::size_t index,
                       const LogPacket& packet)
{
    const Field& field = table.fields[index];
    show(dictionary, table.slots[index], field, numberOf(packet, field), &table);
}

void ShownFields::show(PlistDictionary& dictionary, std::size_t slot, const Field& field,
                       std::int64_t raw, const Table* table)
{
    if (_memory.shows(slot, field, raw, false))
        return;
    if (const auto& text = _texts.textOf(field, raw)) {
        _memory.keep(slot, field, _record, raw, false);
        noteWriter(slot, table);
        store(dictionary, slot, field.key, *text);
    }
}

void ShownFields::showNumber(PlistDictionary& dictionary, const Field& field, double number)
{
    const std::size_t slot = _memory.slotOf(field);
    const auto bits = std::bit_cast<std::int64_t>(number);
    if (_memory.shows(slot, field, bits, true))
        return;
    _memory.keep(slot, field, _record, bits, true);
    noteWriter(slot, nullptr);
    store(dictionary, slot, field.key, field.shown.textOfNumber(number));
}

void ShownFields::showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value)
{
    const std::size_t slot = _memory.slotOf(key);
    _memory.keepNone(slot);
    noteWriter(slot, nullptr);
    store(dictionary, slot, key, std::move(value));
}

std::optional<ValueOrigin> ShownFields::originOf(std::string_view key) const
{
    return _memory.originOf(key);
}

ShownFields::Table& ShownFields::tableOf(std::span<const Field> fields)
{
    for (Table& table : _tables)
        if (table.bytes.areOf(fields))
            return table;
    Table& table = _tables.emplace_back(Table{fields, FieldBytes(fields)});
    for (const Field& field : fields) {
        const std::size_t slot = _memory.slotOf(field.key);
        table.hasKeyTwice |= std::ranges::find(table.slots, slot) != table.slots.end();
        table.slots.push_back(slot);
    }
    return table;
}

void ShownFields::noteWriter(std::size_t slot, const Table* table)
{
    if (std::exchange(spotOf(slot).table, table) != table)
        ++_handovers;
}

ShownFields::Spot& ShownFields::spotOf(std::size_t slot)
{
    if (slot >= _spots.size())
        _spots.resize(slot + 1);
    return _spots[slot];
}

void ShownFields::store(PlistDictionary& dictionary, std::size_t slot, std::string_view key,
                        PlistValue value)
{
    std::size_t& place = spotOf(slot).place;
    PlistDictionary::Entry* entry = dictionary.entryAt(place);
    if (entry && entry->key == key) {
        entry->value = std::move(value);
        return;
    }
    dictionary.set(key, std::move(value));
    place = dictionary.placeOf(key).value_or(0);
}

} // namespace ventrik
