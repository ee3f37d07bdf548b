#pragma once

#include "LogGenerator/Core/ValueOrigin.h"

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What keys of the display show: for each the field that wrote it last and the raw number that it
/// wrote. Keys must be constants.
class FieldMemory
{
  public:
    void forgetAll() { _slots.clear(); }
    /// Keys keep their slots.
    void forgetNumbers();

    /// The slot of a field's key, a new one at the end of the others when it had none.
    std::size_t slotOf(const Field& field);
    std::size_t slotOf(std::string_view key);

    /// Whether the slot's key shows that number of that field. A number that was worked out is none
    /// of the record's.
    bool shows(std::size_t slot, const Field& field, std::int64_t raw, bool isWorkedOut) const;
    void keep(std::size_t slot, const Field& field, const Record* record, std::int64_t raw,
              bool isWorkedOut);
    /// What the place of the field that the slot's key shows counts from.
    void place(std::size_t slot, std::size_t start) { _slots[slot].start = start; }
    /// The key shows what no field describes.
    void keepNone(std::size_t slot) { _slots[slot].field = nullptr; }

    std::optional<ValueOrigin> originOf(std::size_t slot) const;
    /// None for a key that no field shows. The version is for the caller to fill in.
    std::optional<ValueOrigin> originOf(std::string_view key) const;

    /// None for a key that no field shows.
    std::optional<ShownCell> cellOf(std::size_t slot) const;
    /// The slot is where to look first. The key becomes that of the field.
    std::optional<ShownCell> cellOf(std::string_view& key, std::size_t& slot) const
    {
        return isAt(slot, key) || find(key, slot) ? cellOf(slot) : std::nullopt;
    }

  private:
    std::optional<std::size_t> knownSlotOf(std::string_view key) const;
    /// Whether the key is that slot's own text.
    bool isAt(std::size_t slot, std::string_view key) const
    {
        return slot < _slots.size() && _slots[slot].key.data() == key.data() &&
               _slots[slot].key.size() == key.size();
    }
    /// Brings slot and key to where the key shows; false where it does not.
    bool find(std::string_view& key, std::size_t& slot) const;

    struct Slot {
        std::string_view key;
        const Field* asked = nullptr; // the field that the slot was last asked for
        const Field* field = nullptr; // whose number shows
        const Record* record = nullptr;
        std::int64_t raw = 0;
        std::size_t start = 0;
        bool isWorkedOut = false;
    };

    std::vector<Slot> _slots;
    std::array<std::uint16_t, 64> _guesses{}; // the slots of fields, each where its address leads
};

inline std::optional<ShownCell> FieldMemory::cellOf(std::size_t slot) const
{
    const Slot& known = _slots[slot];
    if (!known.field)
        return std::nullopt;
    const auto workedOut =
        known.isWorkedOut ? std::optional(std::bit_cast<double>(known.raw)) : std::nullopt;
    return ShownCell{known.field, known.raw, workedOut};
}

} // namespace ventrik
