#pragma once

#include "Packets/PacketBuilder.h"
#include "Packets/Record.h"
#include "Packets/Subpackets.h"

#include <cstdint>
#include <span>
#include <string_view>
#include <unordered_map>

namespace ventrik
{

/// Writes the fields of an element of a list, or of a subpacket. It refers to the packet. A name
/// that the table does not have is the caller's mistake and throws std::invalid_argument.
class FieldWriter
{
  public:
    FieldWriter(PacketBuilder& packet, std::size_t start, std::span<const Field> fields,
                std::span<const Field> unshown = {})
        : _packet(packet), _start(start), _groups{fields, unshown}
    {
    }

    /// The same part with other fields.
    FieldWriter with(std::span<const Field> fields) const { return {_packet, _start, fields}; }
    /// A part of this one, which begins at the offset in it.
    FieldWriter at(std::size_t offset, std::span<const Field> fields) const
    {
        return {_packet, _start + offset, fields};
    }

    /// Writes the raw number, its low bits where it has too many.
    const FieldWriter& set(std::string_view field, std::int64_t raw) const;
    /// Writes the raw number that shows nearest to the value, cut to what its bits hold.
    const FieldWriter& level(std::string_view field, double value) const;

  private:
    const Field& find(std::string_view name) const;

    PacketBuilder& _packet;
    std::size_t _start;
    std::array<std::span<const Field>, 2> _groups;
};

/// Builds a packet through the table of its record, in the smallest size that the record has. Names
/// of fields as in `FieldWriter`.
class RecordWriter
{
  public:
    explicit RecordWriter(const Record& record);

    RecordWriter& set(std::string_view field, std::int64_t raw);
    RecordWriter& level(std::string_view field, double value);

    /// Appends an element to a list of the record, and counts it: zeros, but where another list
    /// lies in its place. A list that begins behind another one is written after that one.
    FieldWriter add(const List& list);
    /// Fills the packet up to where the list begins.
    RecordWriter& begin(const List& list);
    /// Writes to an element that the packet has room for, whatever counts it.
    FieldWriter at(const RecordElements& elements, std::size_t index,
                   std::span<const Field> fields);
    /// Appends a subpacket of so many bytes, zeros but for its head, and counts it.
    FieldWriter add(const Subpacket& subpacket, std::size_t size);

    /// Cuts the packet, or fills it up with zeros.
    RecordWriter& size(std::size_t size);
    const PacketBuilder& packet() const { return _packet; }

  private:
    const Field& find(std::string_view name) const;
    void fillUpTo(std::size_t size);
    std::size_t startOf(const List& list) const;

    const Record& _record;
    PacketBuilder _packet;
    std::unordered_map<const List*, std::size_t> _elements;
    std::size_t _nextSubpacket = Subpackets::first;
    std::uint8_t _subpackets = 0;
};

/// Writes the low bits of a raw number to a place, counted from an offset of the packet.
void writeNumber(PacketBuilder& packet, std::size_t start, const Place& place, std::int64_t raw);

/// The raw number that shows nearest to the value, cut to what the field's bits hold.
std::int64_t rawNumber(const Field& field, double value);

} // namespace ventrik
