#include "Packets/RecordWriter.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

#include <fmt/format.h>

namespace ventrik
{

void writeNumber(PacketBuilder& packet, std::size_t start, const Place& place, std::int64_t raw)
{
    const auto number = static_cast<std::uint64_t>(raw);
    const std::size_t offset = start + place.offset;
    if (place.isBigEndian) {
        for (std::size_t i = 0; i < place.bytes(); ++i)
            packet.u8(offset + i,
                      static_cast<std::uint8_t>(number >> (8 * (place.bytes() - 1 - i))));
        return;
    }
    constexpr unsigned half = 32;
    const unsigned low = std::min<unsigned>(place.width, half);
    packet.bits(offset, place.bit, low, static_cast<std::uint32_t>(number));
    if (place.width > half)
        packet.bits(offset + half / 8, place.bit, place.width - half,
                    static_cast<std::uint32_t>(number >> half));
}

std::int64_t rawNumber(const Field& field, double value)
{
    const double range = std::ldexp(1.0, field.place.width);
    const double lowest = field.place.isSigned ? -range / 2 : 0;
    const double raw = std::round((value - field.shown.offset) / field.shown.factor);
    return std::llround(std::clamp(raw, lowest, lowest + range - 1));
}

const FieldWriter& FieldWriter::set(std::string_view field, std::int64_t raw) const
{
    writeNumber(_packet, _start, find(field).place, raw);
    return *this;
}

const FieldWriter& FieldWriter::level(std::string_view field, double value) const
{
    return set(field, rawNumber(find(field), value));
}

const Field& FieldWriter::find(std::string_view name) const
{
    if (const Field* field = findField(_groups, name))
        return *field;
    throw std::invalid_argument(fmt::format("record 0x{:04X} has no field \"{}\" in the part at {}",
                                            effectiveLogCode(LogPacket(_packet.written())), name,
                                            _start));
}

RecordWriter::RecordWriter(const Record& record) : _record(record), _packet(record.logCode)
{
    _packet.size(std::max(record.minimumSize, logPacketHeaderSize));
}

RecordWriter& RecordWriter::set(std::string_view field, std::int64_t raw)
{
    writeNumber(_packet, 0, find(field).place, raw);
    return *this;
}

RecordWriter& RecordWriter::level(std::string_view field, double value)
{
    return set(field, rawNumber(find(field), value));
}

FieldWriter RecordWriter::add(const List& list)
{
    const std::size_t index = _elements[&list]++;
    const std::size_t start = startOf(list) + list.stride * index;
    fillUpTo(start + list.stride);
    // Another list of the record may have counted as many with the same number.
    const auto count =
        static_cast<std::int64_t>(index + 1) - static_cast<std::int64_t>(list.count.more);
    if (count > numberAt(LogPacket(_packet.written()), list.count.place))
        writeNumber(_packet, 0, list.count.place, count);
    return {_packet, start, list.fields, list.unshown};
}

RecordWriter& RecordWriter::begin(const List& list)
{
    fillUpTo(startOf(list));
    return *this;
}

FieldWriter RecordWriter::at(const RecordElements& elements, std::size_t index,
                             std::span<const Field> fields)
{
    return {_packet, elements.offset + elements.stride * index, fields};
}

FieldWriter RecordWriter::add(const Subpacket& subpacket, std::size_t size)
{
    const std::size_t start = _nextSubpacket;
    _nextSubpacket += size;
    _packet.size(_nextSubpacket);
    writeNumber(_packet, 0, Subpackets::count, ++_subpackets);
    writeNumber(_packet, start, Subpackets::identifier, subpacket.identifier);
    writeNumber(_packet, start, Subpackets::size, static_cast<std::int64_t>(size));
    return {_packet, start, subpacket.fields};
}

RecordWriter& RecordWriter::size(std::size_t size)
{
    _packet.size(size);
    return *this;
}

const Field& RecordWriter::find(std::string_view name) const
{
    if (const Field* field = _record.find(name))
        return *field;
    throw std::invalid_argument(fmt::format("{} has no field \"{}\"", _record.name, name));
}

void RecordWriter::fillUpTo(std::size_t size)
{
    _packet.size(std::max(size, _packet.written().size()));
}

std::size_t RecordWriter::startOf(const List& list) const
{
    return list.elementsOf(LogPacket(_packet.written())).offset;
}

} // namespace ventrik
