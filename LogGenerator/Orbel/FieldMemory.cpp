#include "LogGenerator/Orbel/FieldMemory.h"

#include <algorithm>
#include <functional>

namespace ventrik
{

void FieldMemory::forgetNumbers()
{
    for (Slot& slot : _slots)
        slot.field = nullptr;
}

std::size_t FieldMemory::slotOf(const Field& field)
{
    // Fields of a table lie side by side.
    const std::size_t number = std::hash<const Field*>{}(&field) / sizeof(Field);
    std::uint16_t& guess = _guesses[number % _guesses.size()];
    if (guess < _slots.size() && _slots[guess].asked == &field)
        return guess;
    const std::size_t slot = slotOf(field.key);
    _slots[slot].asked = &field;
    guess = static_cast<std::uint16_t>(slot);
    return slot;
}

std::size_t FieldMemory::slotOf(std::string_view key)
{
    auto slot = std::ranges::find(_slots, key, &Slot::key);
    if (slot == _slots.end())
        slot = _slots.insert(slot, {.key = key});
    return static_cast<std::size_t>(slot - _slots.begin());
}

bool FieldMemory::shows(std::size_t slot, const Field& field, std::int64_t raw,
                        bool isWorkedOut) const
{
    const Slot& known = _slots[slot];
    return known.field == &field && known.raw == raw && known.isWorkedOut == isWorkedOut;
}

void FieldMemory::keep(std::size_t slot, const Field& field, const Record* record, std::int64_t raw,
                       bool isWorkedOut)
{
    Slot& known = _slots[slot];
    known.field = &field;
    known.record = record;
    known.raw = raw;
    known.isWorkedOut = isWorkedOut;
}

std::optional<ValueOrigin> FieldMemory::originOf(std::size_t slot) const
{
    const Slot& known = _slots[slot];
    if (!known.field || !known.record || known.isWorkedOut)
        return std::nullopt;
    return ValueOrigin{known.record, std::nullopt, known.field, known.start, known.raw};
}

std::optional<ValueOrigin> FieldMemory::originOf(std::string_view key) const
{
    const auto slot = knownSlotOf(key);
    return slot ? originOf(*slot) : std::nullopt;
}

bool FieldMemory::find(std::string_view& key, std::size_t& slot) const
{
    const auto known = knownSlotOf(key);
    if (!known)
        return false;
    slot = *known;
    key = _slots[slot].key;
    return true;
}

std::optional<std::size_t> FieldMemory::knownSlotOf(std::string_view key) const
{
    const auto slot = std::ranges::find(_slots, key, &Slot::key);
    return slot == _slots.end() ? std::nullopt
                                : std::optional(static_cast<std::size_t>(slot - _slots.begin()));
}

} // namespace ventrik
