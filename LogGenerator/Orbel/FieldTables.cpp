#include "LogGenerator/Orbel/FieldTables.h"

#include <algorithm>

namespace ventrik
{

void FieldTables::forgetAll()
{
    _tables.clear();
    _textTables.clear();
    _writers.clear();
}

FieldTables::Table& FieldTables::tableOf(std::span<const Field> fields, FieldMemory& memory)
{
    for (Table& table : _tables)
        if (table.bytes.areOf(fields))
            return table;
    Table& table = _tables.emplace_back(fields);
    for (const Field& field : fields) {
        const std::size_t slot = memory.slotOf(field.key);
        table.hasKeyTwice |= std::ranges::find(table.slots, slot) != table.slots.end();
        table.slots.push_back(slot);
    }
    return table;
}

FieldTables::TextTable& FieldTables::tableOf(std::span<const Field> fields, std::string_view text)
{
    for (TextTable& table : _textTables)
        if (table.fields.data() == fields.data() && table.fields.size() == fields.size() &&
            table.text == text)
            return table;
    return _textTables.emplace_back(fields, text);
}

} // namespace ventrik
