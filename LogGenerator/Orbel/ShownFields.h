#pragma once

#include "LogGenerator/Orbel/FieldMemory.h"
#include "LogGenerator/Orbel/FieldTables.h"
#include "LogGenerator/Orbel/TextMemory.h"
#include "PropertyList/PlistValue.h"

#include <string_view>
#include <vector>

namespace ventrik
{

/// Shows fields of records in a dictionary of the display. A field that comes with the number that
/// its key shows already is neither formatted nor stored; one of a table whose bytes are those of
/// the last time is not even read. When a key goes, whoever removed it, all is forgotten and shown
/// again.
class ShownFields
{
  public:
    /// Nothing is known of what the dictionary shows: every field is written anew.
    void forgetAll();

    /// The following fields are those of this record, and go into this dictionary.
    void begin(const PlistDictionary& dictionary, const Record* record);

    /// Shows the raw number as the field says, or nothing new where that shows nothing. The field's
    /// place counts from the start.
    void show(PlistDictionary& dictionary, const Field& field, std::int64_t raw,
              std::size_t start = 0);
    /// Shows a table of fields, a constant.
    void show(PlistDictionary& dictionary, std::span<const Field> fields, const LogPacket& packet);
    /// Shows a number that was worked out from the record, in the field's format.
    void showNumber(PlistDictionary& dictionary, const Field& field, double number);
    /// Shows a value that no field describes.
    void showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value);

    /// None for a key that no field shows. The version is for the caller to fill in.
    std::optional<ValueOrigin> originOf(std::string_view key) const;
    /// None for a key that no field shows. The slot is where to look first.
    std::optional<ShownCell> cellOf(std::string_view& key, std::size_t& slot) const
    {
        return _memory.cellOf(key, slot);
    }

  private:
    void showIn(PlistDictionary& dictionary, std::size_t slot, const Field& field, std::int64_t raw,
                std::size_t start);
    PlistValue& valueOf(PlistDictionary& dictionary, std::size_t slot, std::string_view key);

    FieldMemory _memory;
    TextMemory _texts;
    FieldTables _tables;
    std::vector<std::optional<std::size_t>> _places; // of each slot's key, as far as is known
    const Record* _record = nullptr;
    std::size_t _removals = 0; // of the dictionary, as far as is known
};

} // namespace ventrik
