#pragma once

#include "LogGenerator/Orbel/FieldBytes.h"
#include "LogGenerator/Orbel/FieldMemory.h"

#include <bit>
#include <list>
#include <utility>
#include <vector>

namespace ventrik
{

/// Tables of fields that show under the keys of a field memory, and the bytes that each showed
/// last: only the fields whose bytes changed are visited again. A table may show a text in the
/// place of all its numbers as well. Whoever writes a key says so; after another one wrote a key of
/// a table, all of the table is visited.
class FieldTables
{
  public:
    /// What the keys show is not known any more.
    void forgetNumbers() { ++_handovers; }
    /// Nor do the keys keep their slots.
    void forgetAll();

    /// Calls `show` with the slot of each field's key, the field and its raw number, where that may
    /// not show yet. The fields are a constant; `show` remembers what shows.
    template <typename Show>
    void visit(std::span<const Field> fields, const LogPacket& part, FieldMemory& memory,
               const Show& show);

    /// Calls `show` with each field of a table that shows the text, a constant, in the place of its
    /// numbers, where it may not show yet.
    template <typename Show>
    void visit(std::span<const Field> fields, std::string_view text, const Show& show);

    /// The slot's key is written: by the table that is being visited, or else by a single field.
    void noteWriter(std::size_t slot);

  private:
    struct Writer {
        std::size_t handovers = 0; // after its last visit; 0: there was none yet
    };
    struct Table : Writer {
        explicit Table(std::span<const Field> fields) : bytes(fields) {}

        FieldBytes bytes;
        FieldBytes::Words words = {};
        std::vector<std::size_t> slots = {}; // of the fields' keys
        bool hasKeyTwice = false;
    };
    struct TextTable : Writer {
        TextTable(std::span<const Field> shown, std::string_view shownText)
            : fields(shown), text(shownText)
        {
        }

        std::span<const Field> fields;
        std::string_view text;
    };

    Table& tableOf(std::span<const Field> fields, FieldMemory& memory);
    TextTable& tableOf(std::span<const Field> fields, std::string_view text);

    std::list<Table> _tables;
    std::list<TextTable> _textTables;
    std::vector<const Writer*> _writers; // of each slot's key, the last one; null: a single field
    const Writer* _visited = nullptr;
    // How often a key got another writer, or all was forgotten: what a table showed then may be
    // there no longer.
    std::size_t _handovers = 1;
};

inline void FieldTables::noteWriter(std::size_t slot)
{
    if (slot >= _writers.size())
        _writers.resize(slot + 1);
    if (std::exchange(_writers[slot], _visited) != _visited)
        ++_handovers;
}

template <typename Show>
void FieldTables::visit(std::span<const Field> fields, const LogPacket& part, FieldMemory& memory,
                        const Show& show)
{
    for (; fields.size() > FieldBytes::maximumFields;
         fields = fields.subspan(FieldBytes::maximumFields))
        visit(fields.first(FieldBytes::maximumFields), part, memory, show);
    Table& table = tableOf(fields, memory);
    const auto showField = [&](std::size_t i) {
        show(table.slots[i], fields[i], numberOf(part, fields[i]));
    };
    _visited = &table;
    std::uint64_t changed = table.bytes.changesIn(part, table.words);
    for (; table.handovers == _handovers && changed != 0; changed &= changed - 1)
        showField(static_cast<std::size_t>(std::countr_zero(changed)));
    if (table.handovers != _handovers) {
        for (std::size_t i = 0; i < fields.size(); ++i)
            showField(i);
        table.handovers = table.hasKeyTwice ? 0 : _handovers;
    }
    _visited = nullptr;
}

template <typename Show>
void FieldTables::visit(std::span<const Field> fields, std::string_view text, const Show& show)
{
    TextTable& table = tableOf(fields, text);
    if (table.handovers == _handovers)
        return;
    _visited = &table;
    for (const Field& field : fields)
        show(field);
    table.handovers = _handovers;
    _visited = nullptr;
}

} // namespace ventrik
