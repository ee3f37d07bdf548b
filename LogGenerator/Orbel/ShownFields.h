#pragma once

#include "LogGenerator/Orbel/ValueOrigin.h"
#include "PropertyList/PlistValue.h"

#include <string_view>
#include <vector>

namespace ventrik
{

/// What a dictionary of the display shows of records: for each key the field that wrote it last and
/// the raw number that it shows. A field that comes with the same number again is neither formatted
/// nor stored. When a key goes, whoever removed it, all is forgotten and shown again.
class ShownFields
{
  public:
    /// Nothing is known of what the dictionary shows: every field is written anew.
    void forgetAll() { _slots.clear(); }

    /// The following fields are those of this record, and go into this dictionary.
    void begin(const PlistDictionary& dictionary, const Record* record);

    /// Shows the raw number as the field says, or nothing new where that shows nothing.
    void show(PlistDictionary& dictionary, const Field& field, std::int64_t raw);
    void show(PlistDictionary& dictionary, std::span<const Field> fields, const LogPacket& packet);
    /// Shows a number that was worked out from the record, in the field's format.
    void showNumber(PlistDictionary& dictionary, const Field& field, double number);
    /// Shows a value that no field describes.
    void showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value);

    /// None for a key that no field shows. The version is for the caller to fill in.
    std::optional<ValueOrigin> originOf(std::string_view key) const;

  private:
    struct Slot {
        std::string_view key;
        const Field* field = nullptr; // null: a value that no field describes
        const Record* record = nullptr;
        std::int64_t raw = 0;
        bool isWorkedOut = false; // the raw number is none of the record's
        std::size_t place = 0;    // in the dictionary
    };

    Slot& slotOf(std::string_view key, const Field* field);
    static void store(PlistDictionary& dictionary, Slot& slot, PlistValue value);

    std::vector<Slot> _slots;
    std::size_t _next = 0; // where the next field is most likely to be
    const Record* _record = nullptr;
    std::size_t _removals = 0; // of the dictionary, as far as the slots know
};

} // namespace ventrik
