#include "LogGenerator/Orbel/FieldTables.h"

#include <algorithm>

namespace ventrik
{

void FieldTables::forgetAll()
{
    _tables.clear();
    _writers.clear();
}

void FieldTables::noteWriter(std::size_t slot)
{
    if (slot >= _writers.size())
        _writers.resize(slot + 1);
    if (std::exchange(_writers[slot], _visited) != _visited)
        ++_handovers;
}

FieldTables::Table& FieldTables::tableOf(std::span<const Field> fields, FieldMemory& memory)
{
    for (Table& table : _tables)
        if (table.bytes.areOf(fields))
            return table;
    Table& table = _tables.emplace_back(Table{FieldBytes(fields)});
    for (const Field& field : fields) {
        const std::size_t slot = memory.slotOf(field.key);
        table.hasKeyTwice |= std::ranges::find(table.slots, slot) != table.slots.end();
        table.slots.push_back(slot);
    }
    return table;
}

} // namespace ventrik
