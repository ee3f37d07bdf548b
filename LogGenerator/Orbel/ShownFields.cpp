#include "LogGenerator/Orbel/ShownFields.h"

#include <bit>
#include <utility>

namespace ventrik
{

void ShownFields::forgetAll()
{
    _memory.forgetNumbers();
    _tables.forgetNumbers();
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
    showIn(dictionary, _memory.slotOf(field), field, raw, start);
}

void ShownFields::show(PlistDictionary& dictionary, std::span<const Field> fields,
                       const LogPacket& packet)
{
    _tables.visit(fields, packet, _memory,
                  [&](std::size_t slot, const Field& field, std::int64_t raw) {
                      showIn(dictionary, slot, field, raw, 0);
                  });
}

void ShownFields::showIn(PlistDictionary& dictionary, std::size_t slot, const Field& field,
                         std::int64_t raw, std::size_t start)
{
    _memory.place(slot, start);
    if (_memory.shows(slot, field, raw, false))
        return _tables.noteWriter(slot);
    if (const auto& text = _texts.textOf(field, raw)) {
        _memory.keep(slot, field, _record, raw, false);
        valueOf(dictionary, slot, field.key).setText(*text);
    }
}

void ShownFields::showNumber(PlistDictionary& dictionary, const Field& field, double number)
{
    const std::size_t slot = _memory.slotOf(field);
    const auto bits = std::bit_cast<std::int64_t>(number);
    if (_memory.shows(slot, field, bits, true))
        return _tables.noteWriter(slot);
    _memory.keep(slot, field, _record, bits, true);
    valueOf(dictionary, slot, field.key) = field.shown.textOfNumber(number);
}

void ShownFields::showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value)
{
    const std::size_t slot = _memory.slotOf(key);
    _memory.keepNone(slot);
    valueOf(dictionary, slot, key) = std::move(value);
}

std::optional<ValueOrigin> ShownFields::originOf(std::string_view key) const
{
    return _memory.originOf(key);
}

// A key's place stays until one is removed, and then all is forgotten.
PlistValue& ShownFields::valueOf(PlistDictionary& dictionary, std::size_t slot,
                                 std::string_view key)
{
    _tables.noteWriter(slot);
    if (slot >= _places.size())
        _places.resize(slot + 1);
    std::optional<std::size_t>& place = _places[slot];
    if (!place) {
        if (!dictionary.contains(key))
            dictionary.set(key, "");
        place = dictionary.placeOf(key);
    }
    return dictionary.entryAt(*place)->value;
}

} // namespace ventrik
