#pragma once

#include "LogGenerator/Orbel/FieldBytes.h"
#include "LogGenerator/Orbel/FieldMemory.h"
#include "LogGenerator/Orbel/TextMemory.h"
#include "PropertyList/PlistValue.h"

#include <list>
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

    /// Shows the raw number as the field says, or nothing new where that shows nothing.
    void show(PlistDictionary& dictionary, const Field& field, std::int64_t raw);
    /// Shows a table of fields, a constant.
    void show(PlistDictionary& dictionary, std::span<const Field> fields, const LogPacket& packet);
    /// Shows a number that was worked out from the record, in the field's format.
    void showNumber(PlistDictionary& dictionary, const Field& field, double number);
    /// Shows a value that no field describes.
    void showValue(PlistDictionary& dictionary, std::string_view key, PlistValue value);

    /// None for a key that no field shows. The version is for the caller to fill in.
    std::optional<ValueOrigin> originOf(std::string_view key) const;

  private:
    /// A table of fields, and the bytes that it showed last.
    struct Table {
        std::span<const Field> fields;
        FieldBytes bytes;
        FieldBytes::Words words = {};
        std::vector<std::size_t> slots = {}; // of the fields' keys
        bool hasKeyTwice = false;
        std::size_t handovers = 0; // after its last showing; 0: it was not shown yet
    };
    /// Of each slot's key.
    struct Spot {
        std::size_t place = 0;        // in the dictionary, as far as is known
        const Table* table = nullptr; // which wrote it last; null: none did
    };

    Table& tableOf(std::span<const Field> fields);
    void show(PlistDictionary& dictionary, const Table& table, std::size_t index,
              const LogPacket& packet);
    void show(PlistDictionary& dictionary, std::size_t slot, const Field& field, std::int64_t raw,
              const Table* table);
    void store(PlistDictionary& dictionary, std::size_t slot, std::string_view key,
               PlistValue value);
    Spot& spotOf(std::size_t slot);
    void noteWriter(std::size_t slot, const Table* table);

    FieldMemory _memory;
    TextMemory _texts;
    std::vector<Spot> _spots;
    std::list<Table> _tables;
    // How often a key got another writer, or all was forgotten: what a table showed then may be
    // there no longer.
    std::size_t _handovers = 1;
    const Record* _record = nullptr;
    std::size_t _removals = 0; // of the dictionary, as far as is known
};

} // namespace ventrik
