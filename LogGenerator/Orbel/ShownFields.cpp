#include "LogGenerator/Orbel/ShownFields.h"

#include <algorithm>
#include <bit>

namespace ventrik
{

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
    Slot& slot = slotOf(field.key, &field);
    if (slot.field == &field && slot.raw == raw)
        return;
    auto text = field.shown.textOf(raw);
    if (!text)
        return;
    slot.field = &field;
    slot.record = _record;
    slot.raw = raw;
    slot.isWorkedOut = false;
    store(dictionary, slot, std::move(*text));
}

void ShownFields::show(PlistDictionary& dictionary, std::span<const Field> fields,
                       const LogPacket& packet)
{
    for (const Field& field : fields)
        show(dictionary, field, numberOf(packet, field));
}

void ShownFields::showNumber(PlistDictionary& dictionary, const Field& field, double number)
{
    Slot& slot = slotOf(field.key, &field);
    const auto bits = std::bit_cast<std::int64_t>(number);
    if (slot.field == &field && slot.raw == bits)
        return;
    slot.field = &field;
    slot.record = _record;
    slot.raw = bits;
    slot.isWorkedOut = true;
    store(dictionary, slot, field.shown.textOfNumber(number));
}

void ShownFields::showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value)
{
    Slot& slot = slotOf(key, nullptr);
    slot.field = nullptr;
    store(dictionary, slot, std::move(value));
}

std::optional<ValueOrigin> ShownFields::originOf(std::string_view key) const
{
    const auto slot = std::ranges::find(_slots, key, &Slot::key);
    if (slot == _slots.end() || !slot->field || slot->isWorkedOut)
        return std::nullopt;
    return ValueOrigin{slot->record, std::nullopt, slot->field, 0, slot->raw};
}

ShownFields::Slot& ShownFields::slotOf(std::string_view key, const Field* field)
{
    // Fields come in the order of their tables.
    if (_next >= _slots.size() || !field || _slots[_next].field != field) {
        auto slot = field ? std::ranges::find(_slots, field, &Slot::field) : _slots.end();
        if (slot == _slots.end())
            slot = std::ranges::find(_slots, key, &Slot::key);
        if (slot == _slots.end())
            slot = _slots.insert(slot, {.key = key});
        _next = static_cast<std::size_t>(slot - _slots.begin());
    }
    return _slots[_next++];
}

void ShownFields::store(PlistDictionary& dictionary, Slot& slot, PlistValue value)
{
    PlistDictionary::Entry* entry = dictionary.entryAt(slot.place);
    if (entry && entry->key == slot.key) {
        entry->value = std::move(value);
        return;
    }
    dictionary.set(slot.key, std::move(value));
    slot.place = dictionary.placeOf(slot.key).value_or(0);
}

} // namespace ventrik
