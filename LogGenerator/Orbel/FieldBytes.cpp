#include "LogGenerator/Orbel/FieldBytes.h"

#include <algorithm>
#include <bit>

namespace ventrik
{

namespace
{

constexpr std::size_t wordSize = sizeof(std::uint64_t);

} // namespace

FieldBytes::FieldBytes(std::span<const Field> fields) : _fields(fields)
{
    std::size_t end = 0;
    _first = fields.empty() ? 0 : fields.front().place.offset;
    for (const Field& field : fields) {
        _first = std::min<std::size_t>(_first, field.place.offset);
        end = std::max(end, field.place.offset + field.place.bytes());
    }
    if (fields.empty())
        return;
    _readers.resize((end - _first + wordSize - 1) / wordSize * wordSize);
    for (std::size_t i = 0; i < fields.size(); ++i)
        for (std::size_t byte = 0; byte < fields[i].place.bytes(); ++byte)
            _readers[fields[i].place.offset - _first + byte] |= std::uint64_t{1} << i;
}

std::uint64_t FieldBytes::changesIn(const LogPacket& part, Words& words) const
{
    const std::size_t count = _readers.size() / wordSize;
    words.resize(count);
    std::uint64_t changed = 0;
    for (std::size_t i = 0; i < count; ++i) {
        const std::uint64_t word = part.littleEndianWord(_first + wordSize * i);
        for (std::uint64_t rest = word ^ words[i]; rest != 0;) {
            const auto byte = static_cast<std::size_t>(std::countr_zero(rest)) / 8;
            changed |= _readers[wordSize * i + byte];
            rest &= ~(std::uint64_t{0xFF} << (8 * byte));
        }
        words[i] = word;
    }
    return changed;
}

} // namespace ventrik
