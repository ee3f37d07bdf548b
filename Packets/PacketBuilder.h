#pragma once

#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <string_view>

namespace ventrik
{

/// Builds a log packet field by field, as a baseband would send it. Offsets count from the type
/// byte; numbers are little-endian where nothing else is said; the packet grows to hold what is
/// written, and bytes never written are 0.
class PacketBuilder
{
  public:
    /// An effective log code from 0xFF0000 upward makes a packet of type 255.
    explicit PacketBuilder(std::uint32_t logCode);

    PacketBuilder& u8(std::size_t offset, std::uint8_t value);
    PacketBuilder& u16(std::size_t offset, std::uint16_t value);
    PacketBuilder& u32(std::size_t offset, std::uint32_t value);
    PacketBuilder& u16BigEndian(std::size_t offset, std::uint16_t value);
    /// A field of `width` bits whose lowest bit is bit `shift` (up to 31) of the byte at `offset`.
    PacketBuilder& bits(std::size_t offset, unsigned shift, unsigned width, std::uint32_t value);
    PacketBuilder& bytes(std::size_t offset, ByteView bytes);

    PacketBuilder& type(std::uint8_t value) { return u8(0, value); }
    PacketBuilder& timestamp(std::uint64_t value);
    /// Cuts the packet, or fills it up with zeros, to that many bytes.
    PacketBuilder& size(std::size_t size);
    /// Puts the two bytes of transport prefix in front.
    PacketBuilder& withPrefix();

    /// What was written so far, without a prefix; the record length is still missing.
    ByteView written() const { return _packet; }
    /// The packet; its record length counts everything behind the type byte.
    Bytes build() const;

  private:
    void put(std::size_t offset, std::size_t width, std::uint64_t value);

    Bytes _packet;
    bool _hasPrefix = false;
};

/// A packet that carries a serialised property list behind its header.
Bytes propertyListPacket(std::uint32_t logCode, const PlistValue& root);

} // namespace ventrik
