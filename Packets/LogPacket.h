#pragma once

#include "PropertyList/PlistValue.h"
#include "PropertyList/PropertyListReader.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <span>
#include <vector>

namespace ventrik
{

// Log packet, little-endian
//   0 u8 type (1: ordinary, 255: extra code) | 1 u16 record length | 3 u16 log code
//   5 8 bytes timestamp | 13 payload
// In front of it two bytes of transport prefix may stand, the first of them 0x81.
inline constexpr std::uint8_t transportPrefixMark = 0x81;
inline constexpr std::size_t transportPrefixSize = 2;
inline constexpr std::size_t logPacketHeaderSize = 13;
inline constexpr std::uint8_t ordinaryPacketType = 1;
inline constexpr std::uint8_t extraCodePacketType = 255;
inline constexpr std::uint32_t extraCodeBase = 0xFF0000;

/// The property lists that the last packets of a few codes carried. A service repeats much of what
/// it tells, byte for byte.
class PropertyListMemory
{
  public:
    /// The reading of a packet's payload; what it gave the last time when the bytes are the same.
    std::shared_ptr<const PropertyListReading> read(std::uint32_t logCode, ByteView payload);

  private:
    static constexpr std::size_t maximumSize = 65536; ///< of a payload that is kept

    struct Known {
        std::uint32_t logCode;
        Bytes payload;
        std::shared_ptr<const PropertyListReading> reading;
    };
    std::vector<Known> _known;
};

/// A log packet after its transport prefix was removed, with bounded reads: a byte past the end
/// reads as 0. Offsets count from the type byte. It does not own the bytes.
class LogPacket
{
  public:
    explicit LogPacket(ByteView bytes) : _bytes(bytes) {}
    /// With what was read before, which spares reading the same property list again.
    LogPacket(ByteView bytes, PropertyListMemory& memory) : _bytes(bytes), _memory(&memory) {}

    std::size_t size() const { return _bytes.size(); }
    ByteView bytes() const { return _bytes; }
    /// What follows the header; empty when there is none.
    ByteView payload() const;
    /// What follows the header, read as a property list: once, at the first asking, however many
    /// sections want the packet. They must leave its containers as they are.
    const PropertyListReading& propertyList() const;
    /// The packet from an offset on, as the place from which a repeated element counts.
    LogPacket from(std::size_t offset) const
    {
        return LogPacket(_bytes.subspan(std::min(offset, _bytes.size())));
    }

    std::uint8_t u8(std::size_t offset) const
    {
        return offset < _bytes.size() ? _bytes[offset] : std::uint8_t{0};
    }
    std::uint16_t u16(std::size_t offset) const
    {
        return static_cast<std::uint16_t>(u8(offset) | u8(offset + 1) << 8);
    }
    std::uint32_t u32(std::size_t offset) const
    {
        return static_cast<std::uint32_t>(littleEndianWord(offset));
    }
    std::uint16_t u16BigEndian(std::size_t offset) const
    {
        return static_cast<std::uint16_t>(u8(offset) << 8 | u8(offset + 1));
    }
    std::int8_t i8(std::size_t offset) const { return static_cast<std::int8_t>(u8(offset)); }
    std::int16_t i16(std::size_t offset) const { return static_cast<std::int16_t>(u16(offset)); }
    std::int32_t i32(std::size_t offset) const { return static_cast<std::int32_t>(u32(offset)); }

    /// Numbers of 32 bits that stand side by side from an offset on.
    void u32s(std::size_t offset, std::span<std::uint32_t> numbers) const;

    /// The eight bytes from an offset on, for numbers of any width.
    std::uint64_t littleEndianWord(std::size_t offset) const;
    /// So many bytes (up to eight) from an offset on.
    std::uint64_t bigEndianWord(std::size_t offset, std::size_t count) const;

  private:
    ByteView _bytes;
    PropertyListMemory* _memory = nullptr;
    mutable std::shared_ptr<const PropertyListReading> _propertyList;
};

inline std::uint64_t LogPacket::littleEndianWord(std::size_t offset) const
{
    constexpr std::size_t wordSize = sizeof(std::uint64_t);
    const auto wordAt = [&](std::size_t start) {
        std::uint64_t word = 0;
        if constexpr (std::endian::native == std::endian::little)
            std::memcpy(&word, _bytes.data() + start, wordSize);
        else
            for (std::size_t i = 0; i < wordSize; ++i)
                word |= std::uint64_t{_bytes[start + i]} << (8 * i);
        return word;
    };
    if (offset + wordSize <= size())
        return wordAt(offset);
    // The last eight bytes, shifted, end in the zeros that stand for bytes past the end.
    if (offset < size() && size() >= wordSize)
        return wordAt(size() - wordSize) >> (8 * (offset + wordSize - size()));
    std::uint64_t word = 0;
    for (std::size_t i = 0; i < wordSize; ++i)
        word |= std::uint64_t{u8(offset + i)} << (8 * i);
    return word;
}

inline std::uint64_t LogPacket::bigEndianWord(std::size_t offset, std::size_t count) const
{
    std::uint64_t word = 0;
    for (std::size_t i = 0; i < count; ++i)
        word = word << 8 | u8(offset + i);
    return word;
}

/// The elements of a repeated record: `count` of them, one every `stride` bytes from `offset`. An
/// element is complete when its first `needed` bytes lie inside the packet.
struct RecordElements {
    std::size_t offset;
    std::size_t stride;
    std::size_t count;
    std::size_t needed;

    /// How many can be read: the count that the record declares may promise more than it holds.
    std::size_t completeIn(const LogPacket& packet) const;
    /// Throws ArrayOutOfBoundsException for an index that is not below the count.
    LogPacket element(const LogPacket& packet, std::size_t index) const;
};

/// Removes the transport prefix. The data must be empty or hold at least 2 bytes.
ByteView stripPrefix(ByteView data);

/// The effective log code: the 16-bit code, with `extraCodeBase` added for a packet of type 255.
std::uint32_t effectiveLogCode(const LogPacket& packet);

/// Whether a packet, its prefix removed, is long enough to have a code.
constexpr bool hasLogCode(ByteView packet)
{
    constexpr std::size_t endOfCode = 5;
    return packet.size() >= endOfCode;
}

} // namespace ventrik
