#include "Packets/PacketBuilder.h"

#include "Packets/LogPacket.h"
#include "PropertyList/PropertyListWriter.h"

#include <algorithm>

namespace ventrik
{

PacketBuilder::PacketBuilder(std::uint32_t logCode) : _packet(logPacketHeaderSize)
{
    type(logCode >= extraCodeBase ? extraCodePacketType : ordinaryPacketType);
    u16(3, static_cast<std::uint16_t>(logCode));
}

PacketBuilder& PacketBuilder::u8(std::size_t offset, std::uint8_t value)
{
    put(offset, 1, value);
    return *this;
}

PacketBuilder& PacketBuilder::u16(std::size_t offset, std::uint16_t value)
{
    put(offset, 2, value);
    return *this;
}

PacketBuilder& PacketBuilder::u32(std::size_t offset, std::uint32_t value)
{
    put(offset, 4, value);
    return *this;
}

PacketBuilder& PacketBuilder::u16BigEndian(std::size_t offset, std::uint16_t value)
{
    u8(offset, static_cast<std::uint8_t>(value >> 8));
    return u8(offset + 1, static_cast<std::uint8_t>(value));
}

PacketBuilder& PacketBuilder::bits(std::size_t offset, unsigned shift, unsigned width,
                                   std::uint32_t value)
{
    for (unsigned bit = 0; bit < width; ++bit) {
        const std::size_t place = offset + (shift + bit) / 8;
        const auto mask = static_cast<std::uint8_t>(1U << ((shift + bit) % 8));
        if (place >= _packet.size())
            _packet.resize(place + 1);
        if (value >> bit & 1U)
            _packet[place] = static_cast<std::uint8_t>(_packet[place] | mask);
        else
            _packet[place] = static_cast<std::uint8_t>(_packet[place] & ~mask);
    }
    return *this;
}

PacketBuilder& PacketBuilder::bytes(std::size_t offset, ByteView bytes)
{
    _packet.resize(std::max(_packet.size(), offset + bytes.size()));
    std::ranges::copy(bytes, _packet.begin() + static_cast<std::ptrdiff_t>(offset));
    return *this;
}

PacketBuilder& PacketBuilder::timestamp(std::uint64_t value)
{
    put(5, 8, value);
    return *this;
}

PacketBuilder& PacketBuilder::size(std::size_t size)
{
    _packet.resize(size);
    return *this;
}

PacketBuilder& PacketBuilder::withPrefix()
{
    _hasPrefix = true;
    return *this;
}

Bytes PacketBuilder::build() const
{
    Bytes packet = _packet;
    if (packet.size() >= 3) {
        packet[1] = static_cast<std::uint8_t>(packet.size() - 1);
        packet[2] = static_cast<std::uint8_t>((packet.size() - 1) >> 8);
    }
    if (_hasPrefix)
        packet.insert(packet.begin(), {transportPrefixMark, 0});
    return packet;
}

void PacketBuilder::put(std::size_t offset, std::size_t width, std::uint64_t value)
{
    if (_packet.size() < offset + width)
        _packet.resize(offset + width);
    for (std::size_t i = 0; i < width; ++i)
        _packet[offset + i] = static_cast<std::uint8_t>(value >> (8 * i));
}

Bytes propertyListPacket(std::uint32_t logCode, const PlistValue& root)
{
    const Bytes content = propertyListBytes(root).value_or(Bytes());
    return PacketBuilder(logCode).bytes(logPacketHeaderSize, content).build();
}

} // namespace ventrik
