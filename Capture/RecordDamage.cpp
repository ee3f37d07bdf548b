#include "Capture/RecordDamage.h"

#include <fmt/format.h>

namespace ventrik
{

void RecordDamage::addBytes(std::uint64_t offset, std::uint64_t count)
{
    if (_places == 0)
        _firstOffset = offset;
    ++_places;
    _bytes += count;
}

void RecordDamage::tell(std::vector<std::string>& notes, std::string_view name) const
{
    _typed.tell(notes, name, "record", "behind a type byte");
    _short.tell(notes, name, "packet", "cut short");
    if (_places > 0)
        notes.push_back(fmt::format(
            "{}: {} byte{} that are no record, in {} place{}, the first at offset {}", name, _bytes,
            _bytes == 1 ? "" : "s", _places, _places == 1 ? "" : "s", _firstOffset));
}

} // namespace ventrik
