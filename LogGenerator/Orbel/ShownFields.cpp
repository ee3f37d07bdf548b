#include "LogGenerator/Orbel/ShownFields.h"

#include <bit>

namespace ventrik
{

void ShownFields::forgetAll()
{
    _memory.forgetAll();
    _places.clear();
}

void ShownFields::begin(const PlistDictionary& dictionary, const Record* record)
{
    _record = record;
    if (_removals == dictionary.removalCount())
        return;
    _removals = dictionary.removalCount();
    forgetAll();
}

void ShownFields::show(PlistDictionary& dictionary, const Field& field, std::int64_t raw,
                       std::size_t start)
{
    const std::size_t slot = _memory.slotOf(field);
    _memory.place(slot, start);
    if (_memory.shows(slot, field, raw, false))
        return;
    if (const auto& text = _texts.textOf(field, raw)) {
        _memory.keep(slot, field, _record, raw, false);
        store(dictionary, slot, field.key, *text);
    }
}

void ShownFields::show(PlistDictionary& dictionary, std::span<const Field> fields,
                       const LogPacket& packet)
{
    for (const Field& field : fields)
        show(dictionary, field, numberOf(packet, field));
}

void ShownFields::showNumber(PlistDictionary& dictionary, const Field& field, double number)
{
    const std::size_t slot = _memory.slotOf(field);
    const auto bits = std::bit_cast<std::int64_t>(number);
    if (_memory.shows(slot, field, bits, true))
        return;
    _memory.keep(slot, field, _record, bits, true);
    store(dictionary, slot, field.key, field.shown.textOfNumber(number));
}

void ShownFields::showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value)
{
    const std::size_t slot = _memory.slotOf(key);
    _memory.keepNone(slot);
    store(dictionary, slot, key, std::move(value));
}

std::optional<ValueOrigin> ShownFields::originOf(std::string_view key) const
{
    return _memory.originOf(key);
}

void ShownFields::store(PlistDictionary& dictionary, std::size_t slot, std::string_view key,
                        PlistValue value)
{
    if (slot >= _places.size())
        _places.resize(slot + 1);
    std::size_t& place = _places[slot];
    PlistDictionary::Entry* entry = dictionary.entryAt(place);
    if (entry && entry->key == key) {
        entry->value = std::move(value);
        return;
    }
    dictionary.set(key, std::move(value));
    place = dictionary.placeOf(key).value_or(0);
}

} // namespace ventrik
