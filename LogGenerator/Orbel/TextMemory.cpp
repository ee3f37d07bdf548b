#include "LogGenerator/Orbel/TextMemory.h"

#include <functional>

namespace ventrik
{

const std::optional<std::string>& TextMemory::textOf(const Field& field, std::int64_t raw)
{
    constexpr std::size_t size = 256;
    if (_known.empty())
        _known.resize(size);
    // Neighbouring numbers of a field lie side by side, those of other fields elsewhere.
    const std::size_t start = std::hash<const Field*>{}(&field) / sizeof(Field) * 37;
    Known& known = _known[(start + static_cast<std::size_t>(raw)) % size];
    if (known.field != &field || known.raw != raw)
        known = {&field, raw, field.shown.textOf(raw)};
    return known.text;
}

} // namespace ventrik
